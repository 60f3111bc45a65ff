# Copyright 2026 The BEX Wi-Fi Authors
# SPDX-License-Identifier: Apache-2.0
"""Ten thousand calls by 64 clients at once."""

import os
import random
import subprocess

import pytest

import own_answers
from load import MEMORY_KIB, Gauge, Load
from support.phone import make_phone_fixture  # noqa: F401  (pytest finds the fixture here)
from support.waiting import wait_for

CLIENTS = 64
CALLS = 10_000
WARM_UP = 1_600
POOL = 2
STORM_CLIENTS = 16
# So many answers between two restarts of a storm; BEX_STORM is how many restarts. More
# come while a restart ends: on a busy machine up to so many, or the calls would be used up too early.
STORM_ANSWERS = 24
STORM_SPARE = 3 * STORM_ANSWERS
# Under proot, which halts a process at each of its system calls, a call takes fifty times as long.
PART = {"bwrap": 1, "proot": 16}
# A command under way: the shell and the tool, the pipe.
COMMAND_PROCESSES = 2
COMMAND_DESCRIPTORS = 2


@pytest.fixture(name="phone")
def stand_in_phone(make_phone):
    phone = own_answers.make_stand_in_phone(make_phone)
    phone.up()
    return phone


def loaded(phone, calls, gauge):
    """The finished load, and what the service held at some moments of it."""
    own_answers.journal_of(phone).unlink(missing_ok=True)
    load = Load(phone, CLIENTS, calls)
    # Each look takes as long as a call.
    held = [gauge.read() for number, _ in enumerate(load.arrivals()) if number % 20 == 0]
    return load, held


def idle(gauge, descriptors):
    """Waits for the service to close what belonged to clients that have gone."""
    wait_for(lambda: gauge.read().descriptors == descriptors)
    return gauge.read()


def test_load(phone):
    """Each call gets its own answer once and runs its own commands once, no more than two calls at a
    time have a command running, and afterwards the service holds what it held before."""
    part = PART[os.environ.get("BEX_PHONE_SANDBOX") or (phone.folder / "sandbox").read_text().strip()]
    gauge = Gauge(phone)
    descriptors = gauge.read().descriptors
    loaded(phone, own_answers.make_calls(WARM_UP // part, random.Random(1)), gauge)
    before = idle(gauge, descriptors)

    calls = own_answers.make_calls(CALLS // part, random.Random(2))
    load, during = loaded(phone, calls, gauge)
    journal = own_answers.Journal(phone)
    assert own_answers.wrong_answers(calls, load.answers, journal) == {}
    assert load.ended == 0
    assert journal.most_at_once == POOL
    assert journal.commands() == own_answers.expected_commands(phone, calls)

    after = idle(gauge, descriptors)
    print(f"{len(calls)} calls, {sum(journal.commands().values())} runs: {before} -> {after}")
    assert after.memory <= before.memory + MEMORY_KIB
    assert (after.threads, after.processes, after.files) == (POOL, before.processes, before.files)
    assert len(during) > 10
    for held in during:
        assert held.threads == POOL
        assert held.memory <= before.memory + MEMORY_KIB
        assert held.descriptors <= descriptors + CLIENTS + POOL * COMMAND_DESCRIPTORS
        assert held.processes <= before.processes + POOL * COMMAND_PROCESSES


def test_storm(phone):
    """A service that is killed again and again under its clients loses their calls under way, and
    nothing else: no answer comes twice or to another call, and no command runs twice."""
    kills = int(os.environ.get("BEX_STORM", "5"))
    descriptors = Gauge(phone).read().descriptors
    # Each client's call under way, and the next when it finds the service that is just ending.
    most_lost = 2 * STORM_CLIENTS
    for_each_kill = STORM_ANSWERS + STORM_SPARE + most_lost
    calls = own_answers.make_calls(kills * for_each_kill + STORM_ANSWERS, random.Random(3))
    own_answers.journal_of(phone).unlink(missing_ok=True)
    load = Load(phone, STORM_CLIENTS, calls)
    killed = 0
    for _ in load.arrivals():
        answered = sum(answers not in ([], [None]) for answers in load.answers)
        if killed < kills and answered >= (killed + 1) * STORM_ANSWERS:
            phone.phone("restart-service", phone.folder)
            killed += 1
    assert (killed, load.ended) == (kills, 0)

    lost = [number for number, answers in enumerate(load.answers) if answers == [None]]
    assert len(lost) <= kills * most_lost
    journal = own_answers.Journal(phone)
    wrong = own_answers.wrong_answers(calls, load.answers, journal)
    assert set(wrong) <= set(lost), wrong
    assert journal.commands() - own_answers.expected_commands(phone, calls) == {}
    held = idle(Gauge(phone), descriptors)
    print(f"{kills} kills, {len(calls)} calls, {len(lost)} cut off, {held}")
    assert held.threads == POOL


@pytest.mark.parametrize("arguments, calls", [
    ([], ""), (["none"], ""), (["1"], "RunTxStop 6\nRunTxStop\n"), (["1"], "runtxstop 6\n")])
def test_wrong_usage_is_one_line(arguments, calls):
    wrong = subprocess.run([os.environ["BEX_LOAD"], *arguments], input=calls, capture_output=True,
                           text=True, check=False, timeout=60)
    assert (wrong.returncode, wrong.stdout, len(wrong.stderr.splitlines())) == (2, "", 1)
