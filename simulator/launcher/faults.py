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
import os
import re
import shutil
import stat
import time

from launcher.errors import PhoneError
from launcher.inside import Folder

RELEASE_SECONDS = 10
POLL_SECONDS = 0.005
LONGEST_TOOL = 1 << 16
NUMBER = re.compile("[0-9]{1,3}")


def stage(folder, tool, actions):
    """Carries out one `phone fault` line."""
    fault = Fault(f"{folder}/root", tool)
    if actions == ["clear"]:
        fault.clear()
    elif actions == ["release"]:
        fault.release()
    elif actions == ["missing"]:
        fault.hide()
    else:
        fault.write(list(fault.read(actions)))


class Fault:
    """The faults of one tool."""

    def __init__(self, root, tool):
        self.tool = tool
        self.programs = Folder(root, "vendor/bin")
        self.hidden = Folder(root, "phone/missing")
        self.folder = Folder(root, "phone/faults")
        self.printed = []
        if not tool or "/" in tool or not (self._obeys(self.programs) or self._obeys(self.hidden)):
            raise PhoneError(f"'{tool}' is no tool of this phone that faults can be staged for")

    def _obeys(self, folder):
        if folder.kind(self.tool) != stat.S_IFREG:
            return False
        with open(folder.open(self.tool, os.O_RDONLY), "rb") as script:
            return b". /phone/lib/tool\n" in script.read(LONGEST_TOOL)

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
            elif word == "exit" and NUMBER.fullmatch(argument) and int(argument) <= 255:
                yield f"exit {int(argument)}\n"
            elif word == "signal" and NUMBER.fullmatch(argument) and 1 <= int(argument) <= 64:
                yield f"signal {int(argument)}\n"
            elif word == "print" and os.path.exists(argument) and not os.path.isdir(argument):
                self.printed.append(argument)
                yield f"print {len(self.printed)}\n"
            else:
                raise PhoneError(f"fault {self.tool}: cannot '{word} {argument}'")

    def write(self, lines):
        """Replaces what was staged before, or changes nothing."""
        made = []
        try:
            for number, path in enumerate(self.printed, 1):
                with open(path, "rb") as source, self._new(f".bytes{number}", made) as copy:
                    shutil.copyfileobj(source, copy)
            if "wait\n" in lines:
                made.append(".gate")
                self._remove(".new.gate")
                self.folder.make_fifo(f"{self.tool}.new.gate")
            with self._new("", made) as file:
                file.write("".join(lines).encode(errors="surrogateescape"))
            self.clear()
        except BaseException as error:
            if isinstance(error, OSError) and not error.filename:
                error.filename = f"{self.folder.path}/{self.tool}"
            for suffix in made:
                self._remove(f".new{suffix}")
            raise
        for suffix in made:  # the last one makes it count
            self.folder.rename(f"{self.tool}.new{suffix}", self.folder, f"{self.tool}{suffix}")

    def _new(self, suffix, made):
        self._remove(f".new{suffix}")
        file = self.folder.open(f"{self.tool}.new{suffix}", os.O_WRONLY | os.O_CREAT)
        made.append(suffix)
        return open(file, "wb")

    def _remove(self, suffix):
        self.folder.remove(self.tool + suffix)

    def clear(self):
        """Back to normal; tools at the gate go on."""
        self._remove("")
        self._open_gate()
        self._remove(".gate")
        self._remove(".waiting")
        for name in self.folder.names():
            if name.startswith(f"{self.tool}.bytes"):
                self.folder.remove(name)
        if self.hidden.kind(self.tool):
            self.hidden.rename(self.tool, self.programs, self.tool)

    def hide(self):
        """Takes the tool away."""
        self.clear()
        self.programs.rename(self.tool, self.hidden, self.tool)

    def release(self):
        """Lets every tool that is at the gate go on; waits a while for the first to come."""
        deadline = time.monotonic() + RELEASE_SECONDS
        while not self._open_gate():
            if time.monotonic() > deadline:
                raise PhoneError(f"no {self.tool} has come to wait in {RELEASE_SECONDS} s")
            time.sleep(POLL_SECONDS)

    def _open_gate(self):
        if self.folder.kind(f"{self.tool}.gate") != stat.S_IFIFO:
            return False
        try:
            os.close(self.folder.open(f"{self.tool}.gate", os.O_WRONLY))
            return True
        except OSError as error:
            if error.errno in (errno.ENXIO, errno.ENOENT):  # nobody waits; no gate any more
                return False
            raise
