# Copyright 2026 The BEX Wi-Fi Authors
# SPDX-License-Identifier: Apache-2.0
"""Stages faults: writes what simulator/inside/tool, which every tool runs first, reads.

/phone/faults/TOOL          the actions, one a line, in the order in which they happen
/phone/faults/TOOL.bytesN   what the line `print N` prints
/phone/faults/TOOL.gate     the fifo at which `wait` waits
/phone/faults/TOOL.waiting  one line for each tool that has come to the gate
/phone/missing/TOOL         where a missing tool is kept
"""

import errno
import glob
import os
import re
import shutil
import time

from launcher.errors import PhoneError

RELEASE_SECONDS = 10
POLL_SECONDS = 0.005


def stage(folder, tool, actions):
    """Carries out one `phone fault` line."""
    fault = Fault(f"{folder}/root", tool)
    if actions == ["clear"]:
        fault.clear()
    elif actions == ["release"]:
        fault.release()
    elif actions == ["missing"]:
        fault.clear()
        os.rename(fault.program, fault.hidden)
    else:
        lines = list(fault.read(actions))
        fault.clear()
        fault.write(lines)


class Fault:
    """The faults of one tool."""

    def __init__(self, root, tool):
        self.tool = tool
        self.program = f"{root}/vendor/bin/{tool}"
        self.hidden = f"{root}/phone/missing/{tool}"
        self.path = f"{root}/phone/faults/{tool}"
        self.printed = []
        if not tool or "/" in tool or not (self._obeys(self.program) or self._obeys(self.hidden)):
            raise PhoneError(f"'{tool}' is no tool of this phone that faults can be staged for")

    @staticmethod
    def _obeys(path):
        try:
            with open(path, encoding="utf-8", errors="replace") as script:
                return ". /phone/lib/tool\n" in script
        except OSError:
            return False

    def read(self, actions):
        """The lines for a list of actions, each with its argument."""
        words = iter(actions)
        for word in words:
            if word == "wait":
                yield "wait\n"
                continue
            argument = next(words, None)
            if argument is None:
                raise PhoneError(f"fault {self.tool}: '{word}' is no action, or lacks its argument")
            if word == "--when" and "\n" not in argument:
                yield f"when {argument}\n"
            elif word == "sleep" and re.fullmatch(r"[0-9]{1,4}(\.[0-9]+)?", argument):
                yield f"sleep {argument}\n"
            elif word == "exit" and argument.isdecimal() and int(argument) <= 255:
                yield f"exit {int(argument)}\n"
            elif word == "signal" and argument.isdecimal() and 1 <= int(argument) <= 64:
                yield f"signal {int(argument)}\n"
            elif word == "print" and os.path.exists(argument) and not os.path.isdir(argument):
                self.printed.append(argument)
                yield f"print {len(self.printed)}\n"
            else:
                raise PhoneError(f"fault {self.tool}: cannot '{word} {argument}'")

    def write(self, lines):
        for number, path in enumerate(self.printed, 1):
            with open(path, "rb") as source, open(f"{self.path}.bytes{number}", "wb") as copy:
                shutil.copyfileobj(source, copy)
        if "wait\n" in lines:
            os.mkfifo(f"{self.path}.gate")
        with open(f"{self.path}.new", "w", encoding="utf-8") as file:
            file.writelines(lines)
        os.rename(f"{self.path}.new", self.path)

    def clear(self):
        """Back to normal; tools at the gate go on."""
        _remove(self.path)
        self._open_gate()
        for path in [f"{self.path}.gate", f"{self.path}.waiting",
                     *glob.glob(glob.escape(self.path) + ".bytes*")]:
            _remove(path)
        if os.path.exists(self.hidden):
            os.rename(self.hidden, self.program)

    def release(self):
        """Lets every tool that is at the gate go on; waits a while for the first to come."""
        deadline = time.monotonic() + RELEASE_SECONDS
        while not self._open_gate():
            if time.monotonic() > deadline:
                raise PhoneError(f"no {self.tool} has come to wait in {RELEASE_SECONDS} s")
            time.sleep(POLL_SECONDS)

    def _open_gate(self):
        try:
            os.close(os.open(f"{self.path}.gate", os.O_WRONLY | os.O_NONBLOCK))
            return True
        except OSError as error:
            if error.errno in (errno.ENXIO, errno.ENOENT):  # nobody waits; no gate
                return False
            raise


def _remove(path):
    try:
        os.remove(path)
    except FileNotFoundError:
        pass
