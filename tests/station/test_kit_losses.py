# Copyright 2026 The BEX Wi-Fi Authors
# SPDX-License-Identifier: Apache-2.0
"""The radio is off after a `with` block, and the next call works, whatever got lost in the middle."""

import concurrent.futures
import contextlib
import re
import socket
import time
import types

import pytest

import bexwifi
from bexwifi import radio
from bexwifi.adb import Adb, Output
from support.adb import TIMEOUT, held
from support.kit import TRANSMISSION, is_marked, raises
from support.radio import radio_use
from support.waiting import wait_for

DEADLINE = 0.2  # seconds; of calls that are not answered before it has passed


@contextlib.contextmanager
def held_call(simulated, tool, function, *arguments):
    """A call in a thread that comes as far as a held tool: its future, and the functions of held()."""
    with held(simulated, tool) as (wait_until_waiting, release), \
            concurrent.futures.ThreadPoolExecutor() as pool:
        try:
            future = pool.submit(function, *arguments)
            wait_until_waiting()
            yield future, wait_until_waiting, release
        finally:
            release()


def works(phone, simulated):
    """Asserts that the phone is as before."""
    assert radio_use(simulated) == "idle"
    with phone.transmit(*TRANSMISSION):
        assert radio_use(simulated) == "tx"
    assert radio_use(simulated) == "idle"
    assert not is_marked(phone)


def ends_and_starts(phone, simulated):
    """Asserts that the next start has a stop before it, and is ended by its own."""
    since = simulated.log.stat().st_size
    phone.call(*TRANSMISSION)
    lines = [line for line, _ in simulated.commands(since)]
    stop = simulated.explain("snifferStop")
    start = simulated.explain(*map(str, TRANSMISSION))
    assert lines[-len(start) - len(stop):] == stop + start
    assert is_marked(phone)
    phone.call("RunTxStop", 6)
    assert not is_marked(phone)
    assert radio_use(simulated) == "idle"


@pytest.fixture(name="at_the_first_pause")
def at_the_first_pause_fixture(monkeypatch):
    """Does something when the kit first waits before it tries again."""
    def at_the_first_pause(action):
        actions = [action]
        monkeypatch.setattr(radio, "time", types.SimpleNamespace(
            monotonic=time.monotonic, sleep=lambda _: actions and actions.pop()()))

    return at_the_first_pause


@pytest.fixture(name="cut")
def cut_fixture(adb, simulated):
    """The ways to lose the connection."""
    return {"the server is killed": lambda: adb("kill-server"), "the connection is cut": simulated.forget}


@pytest.mark.parametrize("how", ["the server is killed", "the connection is cut"])
class TestLostConnection:
    """The connection is lost."""

    def test_in_a_call(self, phone, simulated, cut, how):
        with held_call(simulated, "wl", phone.call, "RunTxStop", 6) as (call, _, _):
            cut[how]()
            raises(bexwifi.NoAnswer, "no answer", call.result)
            assert is_marked(phone)  # the call's commands go on
        works(phone, simulated)

    def test_in_a_start(self, phone, simulated, cut, how):
        start = phone.transmit(*TRANSMISSION).__enter__
        with held_call(simulated, "wl", start) as (started, wait_until_waiting, release):
            cut[how]()
            wait_until_waiting(2)  # the call of `stop` beside that of the start
            release()
            raises(bexwifi.NoAnswer, "no answer", started.result)
        works(phone, simulated)

    def test_in_a_block(self, phone, simulated, cut, how):
        with phone.transmit(*TRANSMISSION):
            cut[how]()
            assert radio_use(simulated) == "tx"
        works(phone, simulated)


def test_a_deadline_in_a_start(simulated):
    phone = bexwifi.Phone(simulated.serial, timeout=DEADLINE)

    def start():
        while True:
            try:
                phone.transmit(*TRANSMISSION).__enter__()
            except bexwifi.DeadlinePassed as late:
                if late.radio_may_be_on:  # else the machine was too busy to call anything
                    raise

    with held_call(simulated, "wl", start) as (started, wait_until_waiting, release):
        wait_until_waiting(2)
        release()
        late = raises(bexwifi.DeadlinePassed, "the deadline passed in RunTxBGStart", started.result)
    assert late.may_go_on
    works(bexwifi.Phone(simulated.serial), simulated)


def test_a_service_that_dies_in_a_start(own):
    phone = bexwifi.Phone(own.serial)
    with held_call(own, "iwpriv", phone.transmit(*TRANSMISSION).__enter__) as (started, _, release):
        own.kill_service()
        release()
        own.phone("up", own.folder)  # what init does on a phone
        raises(bexwifi.TransportFailed, "RunTxBGStart", started.result)
    works(phone, own)


def test_a_service_that_died_in_a_block_is_told(own, at_the_first_pause):
    stop_timeout = pytest.MonkeyPatch()
    phone = bexwifi.Phone(own.serial)
    block = phone.transmit(*TRANSMISSION).__enter__()
    own.kill_service()
    phone.timeout = DEADLINE

    def revive():
        own.phone("up", own.folder)
        stop_timeout.undo()

    at_the_first_pause(revive)
    stop_timeout.setattr(bexwifi.client, "STOP_TIMEOUT", DEADLINE)
    raises(bexwifi.DeadlinePassed, "nothing was called", block.__exit__, None, None, None)
    works(bexwifi.Phone(own.serial), own)


@pytest.fixture(name="unplugged")
def unplugged_fixture(own):
    """Unplugs a phone that transmits; its `with` block, and a function that plugs the phone in again."""
    with socket.socket() as port:  # nobody else is given it meanwhile
        port.setsockopt(socket.SOL_SOCKET, socket.SO_REUSEADDR, 1)
        port.bind(("127.0.0.1", 0))
        own.down()
        own.up(str(port.getsockname()[1]))
        block = bexwifi.Phone(own.serial).transmit(*TRANSMISSION).__enter__()
        own.phone("down", own.folder)
        yield block, lambda: own.up(str(port.getsockname()[1]))


@pytest.mark.parametrize("body", [None, AssertionError("the body's own")])
def test_a_phone_that_comes_back(own, unplugged, at_the_first_pause, body):
    block, plug = unplugged
    at_the_first_pause(plug)
    if body:
        with pytest.warns(bexwifi.EndedByStop, match=f"phone {own.serial}: .*the radio is off"):
            assert not block.__exit__(type(body), body, None)
    else:
        with pytest.raises((bexwifi.AdbFailed, bexwifi.NoAnswer)):  # whether adb has noticed it or not
            block.__exit__(None, None, None)
    works(bexwifi.Phone(own.serial), own)


def test_a_phone_that_does_not_come_back_is_told_loudly(own, unplugged, monkeypatch, capfd):
    block, plug = unplugged
    phone = bexwifi.Phone(own.serial)
    block._phone.timeout = DEADLINE  # pylint: disable=protected-access
    raises(bexwifi.RadioMayBeOn, "THE RADIO MAY BE ON", block.__exit__, None, None, None)
    line, = [line for line in capfd.readouterr().err.splitlines() if "MAY BE ON" in line]
    assert re.match(rf"bexwifi: phone {own.serial}: THE RADIO MAY BE ON: .*adb does not know it", line)
    assert is_marked(phone)
    plug()
    with phone.transmit(*TRANSMISSION):
        assert radio_use(own) == "tx"
    works(phone, own)


def test_a_radio_that_cannot_be_ended_is_told_and_ended_before_the_next_start(
        phone, simulated, monkeypatch, capfd):
    monkeypatch.setattr(radio, "PAUSE", 0)
    with pytest.raises(bexwifi.RadioMayBeOn) as raised:
        with phone.transmit(*TRANSMISSION):
            simulated.fault("ifconfig", "exit", "1")
    assert (raised.value.serial, raised.value.answer.radio_may_be_on) == (simulated.serial, True)
    assert f"bexwifi: phone {simulated.serial}: THE RADIO MAY BE ON" in capfd.readouterr().err
    assert is_marked(phone)
    raises(bexwifi.RadioMayBeOn, "THE RADIO MAY BE ON", phone.transmit(*TRANSMISSION).__enter__)
    simulated.fault("ifconfig", "clear")
    ends_and_starts(phone, simulated)


def test_an_interrupt_is_not_replaced_by_the_radio_s_state(phone, simulated, monkeypatch, capfd):
    monkeypatch.setattr(radio, "PAUSE", 0)
    with pytest.raises(KeyboardInterrupt):
        with phone.transmit(*TRANSMISSION):
            simulated.fault("ifconfig", "exit", "1")
            raise KeyboardInterrupt
    assert "THE RADIO MAY BE ON" in capfd.readouterr().err
    simulated.fault("ifconfig", "clear")
    phone.stop()
    works(phone, simulated)


def test_a_start_that_failed_half_way_is_ended(phone, simulated):
    simulated.fault("wl", "--when", "phy_watchdog *", "exit", "1")
    for start in (phone.transmit(*TRANSMISSION).__enter__, lambda: phone.call(*TRANSMISSION)):
        since = simulated.log.stat().st_size
        raises(bexwifi.CommandFailed, "RunTxBGStart", start)
        assert any(line.startswith("wl pkteng_start") and succeeded
                   for line, succeeded in simulated.commands(since))
        assert not is_marked(phone)
        assert radio_use(simulated) == "idle"


def test_a_block_s_stop_that_failed_is_told_and_made_up_for(phone, simulated):
    with pytest.warns(bexwifi.EndedByStop, match=f"phone {simulated.serial}: RunTxStop .*the radio is off"):
        with phone.transmit(*TRANSMISSION) as transmission:
            simulated.fault("wl", "--when", "pkteng_stop*", "exit", "1")
    assert transmission.ended is None
    simulated.fault("wl", "clear")
    works(phone, simulated)


def test_an_exception_passes_a_block(phone, simulated):
    with pytest.raises(ZeroDivisionError):
        with phone.transmit(*TRANSMISSION):
            assert radio_use(simulated) == "tx"
            1 / 0  # pylint: disable=pointless-statement
    works(phone, simulated)


def test_nothing_is_started_twice(phone, simulated):
    phone.call(*TRANSMISSION)
    ends_and_starts(phone, simulated)


def test_a_call_that_may_go_on_is_waited_for_at_the_end_of_its_block(phone, simulated, monkeypatch):
    with phone.transmit(*TRANSMISSION):
        with monkeypatch.context() as cut:
            cut.setattr(Adb, "run", lambda *_, **__: Output(0, "", ""))
            raises(bexwifi.NoAnswer, "no answer", phone.call, "RunTxStop", 6)
        since = simulated.log.stat().st_size
    stop = simulated.explain("snifferStop")
    assert [line for line, _ in simulated.commands(since)][-len(stop):] == stop
    works(phone, simulated)


def test_one_radio_has_one_use(phone, simulated):
    with phone.transmit(*TRANSMISSION):
        raises(bexwifi.WrongUsage, "inside the `with` block of RunTxBGStart",
               phone.receive("RunRxBgStart", 6, 11, 1).__enter__)
        raises(bexwifi.WrongUsage, "inside the `with` block of RunTxBGStart", phone.call, *TRANSMISSION)
        assert radio_use(simulated) == "tx"
    works(phone, simulated)


def test_a_block_may_stop_everything_itself(phone, simulated):
    with phone.transmit(*TRANSMISSION) as transmission:
        answer = phone.stop()
        assert radio_use(simulated) == "idle"
    assert [call.method for call in answer.calls] == ["RunTxStop", "RunTxStStop", "RunRxStop", "snifferStop"]
    assert (answer.radio_may_be_on, answer.calls[-1].value) == (False, 0)
    assert transmission.ended is None
    works(phone, simulated)
