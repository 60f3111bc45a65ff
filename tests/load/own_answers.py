# Copyright 2026 The BEX Wi-Fi Authors
# SPDX-License-Identifier: Apache-2.0
"""Calls that each have an answer of their own, on a phone whose tools are the stand-in.

Each call carries a number. Odd ones fail (see StandIn.cpp), so that of two answers that change places
every other exchange shows; the count of a RunRxStop is given out once, so that each of those does.
"""

import collections
import os
import pathlib
import re

from load import HERE, load_install

TOOLS = ["cat", "ifconfig", "iwconfig", "iwlist", "iwpriv", "myftm", "ping", "rmmod", "setprop", "sleep"]

# Debian's mksh without shared libraries: it is started tens of thousands of times, too.
SHELL = "/usr/lib/klibc/bin/mksh"

# Method: arguments. NUMBER is the call's own; CHANNEL, for methods that hand nothing else to a tool,
# is one of the 2.4 GHz band for an odd number, else one of the 5 GHz band.
ARGUMENTS = {
    "snifferStart": "NUMBER 40",
    "snifferStop": "",
    "isSnifferMode": "",
    "getWlanMode": "",
    "isMimoSupport": "",
    "RunTxBGStart": "6 54 15 NUMBER",
    "RunTxNStart": "36 40 7 15 true NUMBER",
    "RunTxAxStart": "36 80 9 12 0 NUMBER",
    "RunTxStop": "CHANNEL",
    "RunTxStStart": "11 20 NUMBER",
    "RunTxStStop": "CHANNEL",
    "RunRxApJoinHoc": "NUMBER 192.168.1.7",
    "RunRxBgStart": "6 54 NUMBER",
    "RunRxNStart": "36 40 7 false NUMBER",
    "RunRxAxStart": "36 80 9 NUMBER",
    "RunRxStop": "CHANNEL",
}
# Far from the numbers that mean something themselves, such as chain 3.
FIRST_NUMBER = 1_000
# Even and odd; a count stands for the bytes of the journal up to its run.
STATUS = ("0", "-1")
ANSWERS = collections.defaultdict(lambda: STATUS, {
    "snifferStop": ("0", "0"),
    "isSnifferMode": ("false", "false"),
    "getWlanMode": ("5", "5"),
    "isMimoSupport": ("true", "true"),
    "RunRxBgStart": ("ok", "failure"),
    "RunRxNStart": ("ok", "failure"),
    "RunRxAxStart": ("ok", "failure"),
    "RunRxStop": (r"Rx: (\d+)", "Rx: "),
})


def make_stand_in_phone(make):
    """`make` makes a phone of a description and of files to install."""
    tool = os.environ["BEX_STAND_IN"]
    return make(HERE / "phone", load_install(), f"{SHELL}=/system/bin/sh",
                *(f"{tool}=/vendor/bin/{name}" for name in TOOLS))


def make_calls(count, random):
    """As many calls of each method, in an order of chance."""
    methods = [list(ARGUMENTS)[n % len(ARGUMENTS)] for n in range(count)]
    random.shuffle(methods)
    return [call(method, number) for number, method in enumerate(methods)]


def call(method, number):
    text = ARGUMENTS[method].replace("NUMBER", str(FIRST_NUMBER + number))
    return [method, *text.replace("CHANNEL", "6" if number % 2 else "36").split()]


def journal_of(phone):
    return phone.root / "data/local/tmp/journal"


class Journal:
    """What the tools of the phone ran."""

    def __init__(self, phone):
        path = journal_of(phone)
        text = path.read_text() if path.exists() else ""
        self.lines = {}
        position = 0
        self.most_at_once = 0
        for line in text.splitlines(keepends=True):
            position += len(line)
            slot, command = line.rstrip("\n").split(" ", 1)
            self.lines[position] = command
            self.most_at_once = max(self.most_at_once, int(slot))

    def commands(self):
        return collections.Counter(self.lines.values())


def wrong_answers(calls, answers, journal):
    """The calls that got no answer, several, or another one's: by number, with what they got."""
    wrong = {}
    counts = set()
    for number, (words, got) in enumerate(zip(calls, answers)):
        expected = ANSWERS[words[0]][number % 2]
        match = re.fullmatch(expected, got[0]) if len(got) == 1 and got[0] is not None else None
        right = match is not None
        if right and match.groups():
            count = int(match[1])
            right = journal.lines.get(count) == "myftm -J -I 0 -t 0" and count not in counts
            counts.add(count)
        if not right:
            wrong[number] = (words, got)
    return wrong


def expected_commands(phone, calls):
    """How often the calls together run each command line of a tool: what explain says of one call of
    each kind, times their number."""
    patterns = {}
    expected = collections.Counter()
    for number, words in enumerate(calls):
        kind = (words[0], number % 2)
        if kind not in patterns:
            # No other word looks like this number, which is as even or odd.
            sample = 70_000_000 + number % 2
            patterns[kind] = [line.replace(str(FIRST_NUMBER + sample), "NUMBER")
                              for line in map(as_tool, phone.explain(*call(words[0], sample)))
                              if not line.startswith("echo ")]
        expected.update(line.replace("NUMBER", str(FIRST_NUMBER + number)) for line in patterns[kind])
    return expected


def as_tool(line):
    """A command line as the tool notes it."""
    tool, *arguments = line.split()
    return " ".join([pathlib.PurePath(tool).name, *arguments])
