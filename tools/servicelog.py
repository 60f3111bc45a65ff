# Copyright 2026 The BEX Wi-Fi Authors
# SPDX-License-Identifier: Apache-2.0
"""The service's log on a host: its messages, and the command lines among them."""

import dataclasses
import re

# How liblog prints on a host: tag, priority, date, time, process, thread. A text of several lines goes
# on without that head.
HEAD = re.compile(r"^(\S+) [A-Z] \d\d-\d\d \d\d:\d\d:\d\d +\d+ +\d+ ", re.MULTILINE)
# What follows such a line without a head is what the next command says on stderr.
COMMAND = re.compile(r'cmd: "(.*?)" (successful|unsuccessful) execution(?:\n(.*))?', re.DOTALL)
# The tags of the two that run commands.
RUNNERS = {"wifi@1.0-VendorTestSuit", "wifi@1.0-SnifferTool"}


@dataclasses.dataclass
class Command:
    """A command line that ran."""
    line: str
    succeeded: bool
    # The lines between it and its outcome in the log: what its tools printed, also on stderr.
    printed: str


def messages(log):
    """The (tag, text) pairs of a piece of log."""
    # The split gives each head's tag before its text.
    parts = HEAD.split(log)[1:]
    return list(zip(parts[::2], parts[1::2]))


def commands(log):
    """The commands of a piece of log."""
    printed = []  # joined once: there may be megabytes
    for tag, text in messages(log):
        if tag not in RUNNERS:
            continue
        text = text.rstrip("\n")
        command = COMMAND.fullmatch(text)
        if command is None:
            printed.append(text + "\n")
            continue
        yield Command(command[1], command[2] == "successful", "".join(printed))
        printed = [command[3] or ""]
