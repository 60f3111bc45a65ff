# Copyright 2026 The BEX Wi-Fi Authors
# SPDX-License-Identifier: Apache-2.0
"""The command lines that the service has run on a phone, from its log."""

import re

import bexwifi
from bexwifi.adb import Adb

# The tags of the two that run commands.
RUNNERS = ("wifi@1.0-VendorTestSuit", "wifi@1.0-SnifferTool")
# Seconds for reading the log.
TIMEOUT = 30
# Of a line in the form threadtime: date, time, (process, thread, priority, tag,) message.
LINE = re.compile(r"(\d\d-\d\d \d\d:\d\d:\d\d\.\d+) +\d+ +\d+ [A-Z] \S+ *: (.*)")


class ServiceLog:
    """What the service logs from now on. The log may lose its oldest lines meanwhile."""

    def __init__(self, serial):
        self.adb = Adb(serial)
        self.before, self.problem = self._read()

    def lines(self):
        """Time and message of each line, or why there are none."""
        if not self.problem:
            now, self.problem = self._read()
        if self.problem:
            return [f"the log cannot be read: {self.problem}"]
        return [LINE.sub(r"\1 \2", line) for line in now[self._known(now):]]

    def _known(self, now):
        """How many lines of the log were there before: its beginning up to the last one."""
        for count in range(len(now) if self.before else 0, 0, -1):
            if now[count - 1] == self.before[-1] and now[:count] == self.before[-count:]:
                return count
        return 0

    def _read(self):
        """The log's lines and None, or none and the reason."""
        try:
            output = self.adb.shell("logcat", "-d", "-v", "threadtime", "-s", *RUNNERS, timeout=TIMEOUT)
        except bexwifi.BexWifiError as error:
            return [], error
        if output.code != 0:
            return [], output.stderr.strip() or f"logcat ended with {output.code}"
        return [line for line in output.stdout.splitlines() if not line.startswith("--------- ")], None
