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
    held = [gauge.read() for _ in load.arrivals()]
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
    assert after.memory <= before.memory + MEMORY_KIB
    assert (after.threads, after.processes, after.files) == (POOL, before.processes, before.files)
    for held in during:
        assert held.threads == POOL
        assert held.memory <= before.memory + MEMORY_KIB
        assert held.descriptors <= descriptors + CLIENTS + POOL * COMMAND_DESCRIPTORS
        assert held.processes <= before.processes + POOL * COMMAND_PROCESSES


@pytest.mark.parametrize("arguments, calls", [
    ([], ""), (["none"], ""), (["1"], "RunTxStop 6\nRunTxStop\n"), (["1"], "runtxstop 6\n")])
def test_wrong_usage_is_one_line(arguments, calls):
    wrong = subprocess.run([os.environ["BEX_LOAD"], *arguments], input=calls, capture_output=True,
                           text=True, check=False, timeout=60)
    assert (wrong.returncode, wrong.stdout, len(wrong.stderr.splitlines())) == (2, "", 1)
