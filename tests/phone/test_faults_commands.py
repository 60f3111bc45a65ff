# Copyright 2026 The BEX Wi-Fi Authors
# SPDX-License-Identifier: Apache-2.0
"""Every command of every line of every operation of every phone misbehaves, one at a time.

The lines are those that explain prints. While one command misbehaves all others succeed and print
nothing, so that what the caller gets comes of that one alone. After each fault the log holds every
line with its outcome, the caller has the answer that one rule gives (`answer`), the next call works,
and nothing is left behind.

BEX_FAULTS=all stages every fault for every command; without it those that cost more are staged for
the first and the last line of each operation, whose output is what an operation may read.
"""

import contextlib
import os
import re

import pytest

from catalogue import CALLS
from support.families import FAMILIES
from support.phone import CHIPS
from support.waiting import wait_for
from faults import Line, assert_holds, idle_census, stage


ALL_FAULTS = os.environ.get("BEX_FAULTS") == "all"

# What a command prints; the first is more than one transaction may carry, as a field of statistics, too.
PRINTED = {
    "megabytes": b"goodPackets" + 2 * (b" " + b"7" * 2_000_000),
    "binary": b"12\0lost\n\xff\0\n\0lost\ngoodPackets\x01 \xfe\x80 3\n" + bytes(range(1, 256)) * 3,
}
LARGEST_ANSWER = 1_000_000
FAILING = {"exit": ["exit", "1"], "signal": ["signal", "9"], "missing": ["missing"]}
DEAR = ["missing", "wait", *PRINTED]
OF_WRITTEN_FILES = ["read-only", "full", "gone"]
OF_READ_FILES = ["unreadable", "gone", "empty", "rubbish"]


def collected(printed):
    """A command's output as the service has it: in pieces that end behind a newline or 255 bytes, and
    for the service at their first NUL."""
    pieces = re.findall(rb"[^\n]{0,254}\n|[^\n]{1,255}", printed)
    return b"".join(piece.split(b"\0")[0] for piece in pieces)


def mode_answer(method, text):
    number = re.match(rb"\s*[+-]?\d+", text)
    mode = int(number[0]) if number else 0
    if method == "isSnifferMode":
        return b"true" if text == b"" or mode == 4 else b"false"
    return b"%d" % mode if text and mode in (0, 4, 5) else b"-1"


def count_answer(chip, text):
    family = FAMILIES[chip]
    if family.label:
        return text.replace(b"\n", b"").replace(family.label, b"")
    found = text.replace(b"\n", b" ").rpartition(b"goodPackets")
    statistics = (found[1] + found[2]).split(b" ") if found[1] else [b""]
    return b"Rx: " + (statistics[family.field] if family.field < len(statistics)
                      else b" ".join(statistics))


def answer(chip, method, lines, failed, outputs):
    """What the caller gets when the `failed` of a method's lines fail and the others print `outputs`."""
    family = FAMILIES[chip]
    counts = [line for line in failed
              if not family.several_modules or line.split()[0] != "insmod"]
    if method in ("isSnifferMode", "getWlanMode"):
        return mode_answer(method, outputs.get(lines[0], b""))
    if method == "RunRxStop":
        return count_answer(chip, outputs.get(lines[0], b""))
    if method in ("RunRxBgStart", "RunRxNStart") and family.label:
        return count_answer(chip, outputs.get(lines[-1], b""))
    if method == "RunRxAxStart" and family.ax_started:
        return family.ax_started
    if method in ("RunRxBgStart", "RunRxNStart", "RunRxAxStart"):
        return b"failure" if counts else b"ok"
    return b"-1" if counts else b"0"


class Bench:
    """A phone on which every tool succeeds and prints nothing, but cat."""

    def __init__(self, phone, chip):
        self.phone = phone
        self.chip = chip
        self.mode = phone.root / "sys/module/wlan/parameters/con_mode"
        self.staged = 0
        self.calls = {}
        for call in CALLS:
            if call[0] != "isMimoSupport":  # it runs no command
                self.calls[tuple(call)] = [Line(text) for text in phone.explain(*call)]
        for lines in self.calls.values():
            for command in (command for line in lines for command in line.commands):
                self.clear(command.tool)
        self.before = idle_census(phone)

    def clear(self, tool):
        stage(self.phone, tool, *(["clear"] if tool == "cat" else ["exit", "0"]))

    def check(self, call, where, failed=(), outputs=None, through=None):
        """Makes a call, and the next one; `where` names the fault when something is amiss."""
        texts = [line.text for line in self.calls[call]]
        outputs = {**{line.text: self.read(line) for line in self.calls[call]
                      if line.reads and line.text not in failed}, **(outputs or {})}
        expected = answer(self.chip, call[0], texts, failed, outputs)
        os.truncate(self.phone.log, 0)
        with self.phone.start(*call) as client:
            if through:
                through(client)
            out, err = client.communicate(timeout=60)
        assert (where, self.phone.commands()) == (where, [(text, text not in failed) for text in texts])
        if len(expected) > LARGEST_ANSWER:
            assert (where, client.returncode, out) == (where, 4, b"")
        else:
            failure = expected in (b"-1", b"failure")
            assert (where, client.returncode, out) == (where, int(failure), expected + b"\n")
        assert (where, len(err.splitlines())) == (where, int(client.returncode != 0))

    def read(self, line):
        path = self.phone.root / line.reads.lstrip("/")
        return collected(path.read_bytes())

    def afterwards(self, where):
        """The next call works, and nothing is left of the one before."""
        mode = int(self.mode.read_bytes())
        assert (where, self.phone.call("getWlanMode")) == (where, (0, b"%d\n" % mode, b""))
        assert_holds(self.phone, self.before)
        self.staged += 1

    def misbehave(self, call, command, kind):
        """One fault of one command, and the call in which it comes to light."""

        def hit(other):
            return other.tool == command.tool and (
                kind == "missing" or other.arguments == command.arguments)

        lines = self.calls[call]
        last = [line.text for line in lines if line.commands and hit(line.commands[-1])]
        failed, outputs, through = [], {}, None
        if kind in FAILING:
            failed = last
            actions = FAILING[kind]
        elif kind in PRINTED:
            outputs = {text: collected(PRINTED[kind]) for text in last}
            actions = ["print", self.phone.folder / kind]
        else:
            touched = [any(hit(other) for other in line.commands) for line in lines]
            actions = ["wait"] if command.tool == "cat" else ["wait", "exit", "0"]

            def through(client):
                self.meet_at_gate(client, command.tool, [line.text for line in lines], touched)

        if kind != "missing":
            actions = ["--when", command.pattern, *actions]
            actions += [] if command.tool == "cat" else ["--when", "*", "exit", "0"]
        stage(self.phone, command.tool, *actions)
        where = (call, command.tool, command.arguments, kind)
        self.check(call, where, failed, outputs, through)
        self.clear(command.tool)
        self.afterwards(where)

    def meet_at_gate(self, client, tool, texts, touched):
        """While a command takes its time nothing runs ahead, and other clients are served."""
        wait_for((self.phone.root / f"phone/faults/{tool}.waiting").exists)
        before = texts[:touched.index(True)]
        assert [text for text, _ in self.phone.commands()] == before
        assert self.phone.call("isMimoSupport")[0] == 0
        assert client.poll() is None
        for _ in filter(None, touched):
            stage(self.phone, tool, "release")

    def spoil(self, call, line, kind):
        """One fault of the file of one line, and the call in which it comes to light."""
        path = self.phone.root / (line.writes or line.reads).lstrip("/")
        same = [other.text for other in self.calls[call]
                if (other.writes or other.reads) == (line.writes or line.reads)]
        where = (call, line.text, kind)
        with spoiled(path, kind):
            if kind in ("empty", "rubbish"):
                self.check(call, where)
            else:
                self.check(call, where, same)
        self.afterwards(where)


@contextlib.contextmanager
def spoiled(path, kind):
    """A file of the phone in a bad state."""
    kept = path.with_name(path.name + ".kept")
    if kind == "gone":
        path, kept = path.parent, path.parent.with_name("gone")
    path.rename(kept)
    if kind == "full":
        path.symlink_to("/dev/full")
    elif kind != "gone":
        path.write_bytes(b"\0\xff 4\n" if kind == "rubbish" else b"")
        path.chmod({"read-only": 0o444, "unreadable": 0}.get(kind, 0o644))
    yield
    kept.replace(path)


@pytest.fixture(name="bench", params=CHIPS)
def bench_fixture(make_phone, request):
    phone = make_phone(request.param)
    for name, printed in PRINTED.items():
        (phone.folder / name).write_bytes(printed)
    phone.up()
    return Bench(phone, request.param)


def test_commands_that_misbehave(bench):
    for call, lines in bench.calls.items():
        bench.check(call, (call, "they print nothing"))
        bench.afterwards(call)
        for line in lines:
            dear = DEAR if ALL_FAULTS or line in (lines[0], lines[-1]) else []
            for command in line.commands:
                for kind in ["exit", "signal", *dear]:
                    bench.misbehave(call, command, kind)
    print(f"{bench.chip}: {bench.staged} faults of commands")


def test_files_that_cannot_be_used(bench):
    for call, lines in bench.calls.items():
        for line in lines:
            for kind in OF_WRITTEN_FILES if line.writes else OF_READ_FILES if line.reads else []:
                bench.spoil(call, line, kind)
    print(f"{bench.chip}: {bench.staged} faults of files")
