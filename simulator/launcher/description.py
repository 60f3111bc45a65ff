# Copyright 2026 The BEX Wi-Fi Authors
# SPDX-License-Identifier: Apache-2.0
"""Reads the description of a phone: one statement on each line, blanks between words, # before a comment.

    property NAME VALUE            a line of /vendor/build.prop
    driver NAME                    the driver model, a file of simulator/drivers
    parameter MODULE NAME [VALUE]  /sys/module/MODULE/parameters/NAME and its value at boot
    file PATH TEXT                 a small file that holds TEXT and a newline
    tool NAME...                   scripts of simulator/tools, installed in /vendor/bin
    applet NAME...                 busybox applets in /vendor/bin, for which faults can be staged
    capture SERVICE PROPERTY       init starts and stops SERVICE when PROPERTY becomes start or stop
"""

import os
import re

from launcher.errors import PhoneError

SIMULATOR = os.path.dirname(os.path.dirname(os.path.realpath(__file__)))

NAME = re.compile(r"[A-Za-z0-9_-]+")
PROPERTY = re.compile(r"[A-Za-z0-9_:@-]+(\.[A-Za-z0-9_:@-]+)*")
ALL_PHONES = ["getprop", "logcat", "setprop"]


class Description:
    """The statements of one file, checked."""

    def __init__(self, chip):
        self.path = chip if "/" in chip else os.path.join(SIMULATOR, "phones", chip)
        self.properties = {"log.tag": "D"}
        self.driver = ""
        self.parameters = {}
        self.files = {}
        self.tools = list(ALL_PHONES)
        self.applets = []
        self.captures = {}
        statements = {
            "property": self._property,
            "driver": self._driver,
            "parameter": self._parameter,
            "file": self._file,
            "tool": self._tool,
            "applet": self._applet,
            "capture": self._capture,
        }
        for number, line in enumerate(self._lines(chip), 1):
            words = line.split("#", 1)[0].split(None, 1)
            if not words:
                continue
            try:
                if words[0] not in statements:
                    raise ValueError(f"unknown statement '{words[0]}'")
                statements[words[0]](words[1].strip() if len(words) == 2 else "")
            except ValueError as error:
                raise PhoneError(f"{self.path}:{number}: {error}") from None
        if not self.driver:
            raise PhoneError(f"{self.path}: no driver statement")

    def _lines(self, chip):
        try:
            with open(self.path, encoding="utf-8") as description:
                text = description.read()
        except UnicodeDecodeError:
            text = "\0"
        except OSError as error:
            if "/" in chip:
                raise PhoneError(f"{self.path}: {error.strerror}") from None
            known = ", ".join(sorted(os.listdir(os.path.join(SIMULATOR, "phones"))))
            raise PhoneError(f"no phone '{chip}'; known: {known}") from None
        if "\0" in text:
            raise PhoneError(f"{self.path}: not a text file")
        return text.splitlines()

    def _property(self, text):
        name, value = _split(text, 2)
        _check(PROPERTY, name, "property name")
        _add(self.properties, name, value)

    def _driver(self, text):
        if self.driver:
            raise ValueError("a second driver")
        self.driver = _of_simulator("drivers", text)

    def _parameter(self, text):
        module, rest = _split(text, 2)
        name, *value = rest.split(None, 1)
        for word in (module, name):
            _check(NAME, word, "name")
        _add(self.parameters, f"/sys/module/{module}/parameters/{name}", "".join(value))

    def _file(self, text):
        path, content = _split(text, 2)
        _add(self.files, checked_path(path), content + "\n")

    def _tool(self, text):
        self.tools += [_of_simulator("tools", name) for name in _split(text, 1)[0].split()]

    def _applet(self, text):
        for name in _split(text, 1)[0].split():
            _check(NAME, name, "applet")
            self.applets.append(name)

    def _capture(self, text):
        service, name = _split(text, 2)
        for word in (service, name):
            _check(PROPERTY, word, "name")
        _add(self.captures, service, name)


def checked_path(path):
    """A path inside the phone: absolute, and going nowhere else."""
    if not path.startswith("/") or ".." in path.split("/") or path.endswith("/"):
        raise ValueError(f"'{path}' is not an absolute path of a file in the phone")
    return path


def _split(text, count):
    words = text.split(None, count - 1)
    if len(words) < count:
        raise ValueError("too few words")
    return words


def _check(pattern, word, what):
    if not pattern.fullmatch(word):
        raise ValueError(f"bad {what} '{word}'")


def _add(table, name, value):
    if name in table:
        raise ValueError(f"'{name}' is given twice")
    table[name] = value


def _of_simulator(folder, name):
    _check(NAME, name, "name")
    if not os.path.isfile(os.path.join(SIMULATOR, folder, name)):
        raise ValueError(f"no '{name}' in simulator/{folder}")
    return name
