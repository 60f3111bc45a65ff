# Copyright 2026 The BEX Wi-Fi Authors
# SPDX-License-Identifier: Apache-2.0
"""`bex-wifi-client stop`: whatever the radio does, it is idle afterwards, and the client says so only
then."""

import json
import signal

import pytest

from faults import stage
from support.phone import CHIPS
from support.radio import radio_use
from support.waiting import wait_for

# One of those with a proof of its own, and two whose tools differ.
KINDS = ["broadcom", "wcn", "qca639x"]
TRANSMIT = ["RunTxNStart", "6", "20", "7", "15", "false", "1"]
# Each with the test that the chip then runs.
STARTS = [
    (TRANSMIT, "tx"),
    (["RunTxStStart", "11", "20", "1"], "tone"),
    (["RunRxNStart", "36", "40", "7", "false", "2"], "rx"),
    (["snifferStart", "36", "40"], "monitor"),
]
OFF = "the radio is off\n"
HINT = b"; the transmission may be on, what ends it is: bex-wifi-client stop 6\n"


@pytest.fixture(name="phone", params=CHIPS)
def phone_fixture(request, make_phone):
    phone = make_phone(request.param)
    # The pauses that a real driver needs.
    stage(phone, "sleep", "exit", "0")
    phone.up()
    return phone


def stop(phone, *options):
    code, out, err = phone.call("stop", *options)
    return code, out.decode(), err.decode()


def test_ends_whatever_runs(phone):
    for call, test in [([], "idle"), *STARTS]:
        if call:
            phone.call(*call)
        assert radio_use(phone) == test
        code, out, err = stop(phone, "11")
        assert (code, err) == (0, ""), (call, out)
        assert out.endswith(OFF)
        assert [line.split(":")[0] for line in out.splitlines()[:-1]] == [
            "RunTxStop", "RunTxStStop", "RunRxStop", "snifferStop"]
        assert radio_use(phone) == "idle", call
        assert phone.call("getWlanMode")[1] == b"0\n"


def test_after_a_start_that_is_still_running(phone):
    """What a stop ends while the start is at its first command, that start begins afterwards."""
    tool = phone.explain(*TRANSMIT)[0].split()[0].rpartition("/")[2]
    stage(phone, tool, "wait")
    code, out, err = phone.call("--timeout", "5", *TRANSMIT)
    assert (code, out) == (5, b"")
    assert err.endswith(HINT)
    wait_for((phone.root / f"phone/faults/{tool}.waiting").exists)
    (phone.root / f"phone/faults/{tool}").unlink()  # the next one does not wait

    seen = phone.log.stat().st_size
    last = phone.explain("snifferStop")[-1]
    with phone.start("stop", "--json") as stopping:
        wait_for(lambda: (last, True) in phone.commands(seen))
        assert stopping.poll() is None
        stage(phone, tool, "release")
        out, err = stopping.communicate(timeout=60)
    assert (stopping.returncode, err) == (0, b"")
    assert json.loads(out)["ok"]
    assert radio_use(phone) == "idle"
    assert phone.explain(*TRANSMIT)[-1] in [line for line, _ in phone.commands(seen)]


def test_gives_up_on_a_service_that_hangs(make_phone):
    phone = make_phone("wcn")
    stage(phone, "iwpriv", "wait")
    phone.up()
    code, out, err = stop(phone, "--timeout", "5", "6")
    assert (code, out) == (5, "the radio may be on\n")
    assert err == ("bex-wifi-client: the deadline passed while waiting for another call to end; the "
                   "radio may be on, try again: bex-wifi-client stop 6\n")
    stage(phone, "iwpriv", "clear")


@pytest.mark.parametrize("number", [signal.SIGINT, signal.SIGTERM])
def test_after_a_signal(make_phone, number):
    phone = make_phone("wcn6750")
    stage(phone, "sleep", "wait")
    phone.up()
    with phone.start(*TRANSMIT) as client:
        wait_for((phone.root / "phone/faults/sleep.waiting").exists)
        client.send_signal(number)
        out, err = client.communicate(timeout=60)
    assert (client.returncode, out) == (128 + number, b"")
    assert err.startswith(b"bex-wifi-client: RunTxNStart was interrupted by ")
    assert err.endswith(HINT)
    stage(phone, "sleep", "release")
    stage(phone, "sleep", "clear")
    assert stop(phone)[0] == 0
    assert radio_use(phone) == "idle"


@pytest.mark.parametrize("phone", KINDS, indirect=True)
def test_after_the_service_died(phone):
    """The radio goes on without it."""
    assert phone.call(*TRANSMIT)[0] == 0
    phone.phone("restart-service", phone.folder)
    assert radio_use(phone) == "tx"
    assert stop(phone)[0] == 0
    assert radio_use(phone) == "idle"


@pytest.mark.parametrize("phone", KINDS, indirect=True)
def test_after_a_start_that_failed(phone):
    """Its first command fails, and all others run."""
    tool = phone.explain(*TRANSMIT)[0].split()[0].rpartition("/")[2]
    arguments = " ".join(phone.explain(*TRANSMIT)[0].split()[1:])
    stage(phone, tool, "--when", arguments, "exit", "1")
    code, out, err = phone.call(*TRANSMIT)
    assert (code, out) == (1, b"-1\n")
    assert err.endswith(HINT)
    stage(phone, tool, "clear")
    assert stop(phone, "6")[0] == 0
    assert radio_use(phone) == "idle"


@pytest.mark.parametrize("phone", KINDS, indirect=True)
def test_what_does_not_stop_is_told(phone):
    """What proves that the radio is off fails."""
    assert phone.call(*TRANSMIT)[0] == 0
    tool, = {"ifconfig", "rmmod"} & {
        line.split()[0].rpartition("/")[2] for line in phone.explain("RunTxStStop", "6")}
    stage(phone, tool, "exit", "1")
    code, out, err = stop(phone, "6")
    assert (code, out.splitlines()[-1]) == (1, "the radio may be on")
    assert err.endswith("; the radio may be on, try again: bex-wifi-client stop 6\n")
    stage(phone, tool, "clear")
    assert stop(phone, "6")[0] == 0
    assert radio_use(phone) == "idle"
