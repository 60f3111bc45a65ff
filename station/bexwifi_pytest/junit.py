# Copyright 2026 The BEX Wi-Fi Authors
# SPDX-License-Identifier: Apache-2.0
"""junit.xml: pytest's own, written as a whole or not at all."""

import pathlib

from _pytest.junitxml import LogXML  # pytest has no other way to say where and when it writes

from . import files


class Junit(LogXML):
    """A plugin of a session that has begun. `problem` is why the file could not be written; empty when
    it was."""

    def __init__(self, path, config):
        super().__init__(str(path), None, "bexwifi", family=config.getini("junit_family"))
        self.path = pathlib.Path(path)
        self.problem = ""
        self.pytest_sessionstart()

    def pytest_sessionfinish(self):
        try:
            with files.whole(self.path) as new:
                self.logfile = str(new)
                super().pytest_sessionfinish()
        except OSError as error:
            self.problem = f"cannot write {self.path}: {error.strerror}"

    def pytest_terminal_summary(self):
        """The plugin names the files, all together."""
