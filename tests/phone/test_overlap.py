# Copyright 2026 The BEX Wi-Fi Authors
# SPDX-License-Identifier: Apache-2.0
"""Calls that overlap: their command lines interleave, their answers do not; and how to prevent it."""

import pathlib
import re
import shlex

import pytest

from support.phone import ROOT
from support.processes import open_files
from support.waiting import wait_for
from faults import nothing_lost, stage

TRANSMIT = ["RunTxBGStart", "6", "54", "15", "1"]
COUNT = ["RunRxStop", "6"]
ANSWERS = {"RunTxBGStart": (0, b"0\n"), "RunRxStop": (0, b"4711\n")}


@pytest.fixture(name="phone")
def phone_fixture(make_phone):
    """On it every tool succeeds. One command of each call waits, and the count is 4711."""
    phone = make_phone("broadcom")
    number = phone.folder / "number"
    number.write_bytes(b"4711\n")
    stage(phone, "wl", "--when", "mpc 0", "wait", "exit", "0", "--when", "*", "exit", "0")
    stage(phone, "busybox", "--when", "grep *", "wait", "exit", "0",
          "--when", "awk *", "print", number)
    stage(phone, "ifconfig", "exit", "0")
    phone.up()
    return phone


def meet(phone, tool):
    """Returns when the tool waits."""
    waiting = phone.root / f"phone/faults/{tool}.waiting"
    wait_for(waiting.exists)
    waiting.unlink()


def outcome(client):
    out, err = client.communicate(timeout=60)
    assert err == b""
    return client.returncode, out


def lines(phone):
    return [line for line, _ in phone.commands()]


def test_calls_interleave_and_keep_their_answers(phone):
    transmit, count = phone.explain(*TRANSMIT), phone.explain(*COUNT)
    gate = transmit.index("wl mpc 0 ")
    with nothing_lost(phone):
        first = phone.start(*TRANSMIT)
        meet(phone, "wl")
        second = phone.start(*COUNT)
        meet(phone, "busybox")  # both are in the middle now
        stage(phone, "busybox", "release")
        assert outcome(second) == ANSWERS["RunRxStop"]
        stage(phone, "wl", "release")
        assert outcome(first) == ANSWERS["RunTxBGStart"]
        assert lines(phone) == transmit[:gate] + count + transmit[gate:]


def test_a_third_call_waits_for_a_thread(phone):
    """It is not lost, and its lines run when one of the two has ended."""
    third_call = ["RunTxStStop", "6"]
    transmit, count, third = (phone.explain(*call) for call in (TRANSMIT, COUNT, third_call))
    with nothing_lost(phone):
        calls = [phone.start(*TRANSMIT)]
        meet(phone, "wl")
        calls.append(phone.start(*COUNT))
        meet(phone, "busybox")
        calls.append(phone.start(*third_call))
        wait_for(lambda: has_socket(calls[2]))
        stage(phone, "wl", "release")
        assert outcome(calls[0]) == ANSWERS["RunTxBGStart"]
        assert outcome(calls[2]) == (0, b"0\n")
        stage(phone, "busybox", "release")
        assert outcome(calls[1]) == ANSWERS["RunRxStop"]
        assert lines(phone) == transmit + third + count


def has_socket(client):
    return any(file.startswith("socket:") for file in open_files(client.pid))


def locked_line(phone, folder, call):
    """The example of the client's README with this phone in place of a real one."""
    example = re.search(r"^flock .*$", (ROOT / "client/README.md").read_text(), re.MULTILINE)[0]
    lock, shell = "/tmp/bex-$SERIAL.lock", "adb -s $SERIAL shell"
    assert lock in example and shell in example and example.endswith(" RunTxStop 6")
    inside = " ".join(shlex.quote(str(word)) for word in phone.command())
    return example.replace(lock, shlex.quote(f"{folder}/lock")).replace(shell, inside) \
        .replace("RunTxStop 6", " ".join(call))


def test_a_lock_keeps_calls_apart(phone, tmp_path):
    """The command line of the README."""
    transmit, count = phone.explain(*TRANSMIT), phone.explain(*COUNT)
    lock = tmp_path / "lock"
    with nothing_lost(phone):
        first = phone.outside("sh", "-c", locked_line(phone, tmp_path, TRANSMIT))
        meet(phone, "wl")
        second = phone.outside("sh", "-c", locked_line(phone, tmp_path, COUNT))
        wait_for(lambda: waits_for(lock))
        stage(phone, "wl", "release")
        assert outcome(first) == ANSWERS["RunTxBGStart"]
        meet(phone, "busybox")
        stage(phone, "busybox", "release")
        assert outcome(second) == ANSWERS["RunRxStop"]
        assert lines(phone) == transmit + count


def waits_for(lock):
    """Whether a process waits for the lock on a file."""
    inode = f":{lock.stat().st_ino} "
    return any(" -> " in row and inode in row
               for row in pathlib.Path("/proc/locks").read_text().splitlines())
