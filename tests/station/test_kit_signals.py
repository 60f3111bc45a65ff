# Copyright 2026 The BEX Wi-Fi Authors
# SPDX-License-Identifier: Apache-2.0
"""What SIGINT, SIGTERM and SIGHUP do to the kit: they keep their effect, and the radio is off.

One part raises SIGINT at every line of the kit, on a phone that is only pretended here. The other sends
signals to programs that use a simulated phone by the real adb.
"""

import fcntl
import io
import json
import os
import pathlib
import shlex
import signal
import subprocess
import sys

import pytest

import bexwifi
from support.adb import TIMEOUT, Running, held
from support.kit import TRANSMISSION
from support.phone import ROOT
from support.radio import radio_use

SIGNALS = (signal.SIGINT, signal.SIGTERM, signal.SIGHUP)
KIT = str(pathlib.Path(bexwifi.__file__).parent)


class PretendedAdb:
    """In place of subprocess.Popen: what adb does with a phone whose radio is on or off. A call has its
    effect even when its adb is killed."""

    on = False

    def __init__(self, words, **_):
        self.returncode = None
        self.stdout, self.stderr = io.BytesIO(), io.BytesIO()
        self.method = next(word for word in shlex.split(words[-1]) if word.startswith(("Run", "stop", "list")))
        if self.method != "list":
            PretendedAdb.on = self.method.endswith("Start")

    def communicate(self, timeout):
        assert timeout > 0
        self.returncode = 0
        members = {
            "schema_version": 1, "method": self.method, "arguments": {}, "value": 0, "calls": [],
            "radio_may_be_on": self.method.endswith("Start"), "stage": "done", "exit_code": 0,
            "started_at": "2026-11-22T09:15:00.250Z", "duration_ms": 1, "client_version": "0.2.0",
            "methods": [{"name": name, "summary": "", "result": {"type": "int32", "meaning": ""},
                         "arguments": [{"name": "channel", "type": "string", "meaning": "", "unit": None,
                                        "accepted": ""}]} for name in ("RunTxBGStart", "RunTxStop")]}
        return json.dumps(members).encode(), b""

    def kill(self):
        self.returncode = -9

    def wait(self):
        return self.returncode


class AtMoments:
    """Raises SIGINT when the kit comes to the given moments: a call, line or return of its own code each."""

    running = None

    def __init__(self, *moments):
        self.left = set(moments)
        self.count = 0

    def __call__(self, frame, event, argument):
        # Python itself drops an exception that a generator raises while it is closed.
        if not frame.f_code.co_filename.startswith(KIT) or frame.f_code.co_name == "<genexpr>":
            return None
        self.count += 1
        if self.count in self.left:
            self.left.remove(self.count)
            signal.raise_signal(signal.SIGINT)
        return self

    def watch(self, function):
        AtMoments.running = self
        before = sys.gettrace()
        sys.settrace(self)
        try:
            function()
        finally:
            sys.settrace(before)


@pytest.fixture(name="handlers")
def handlers_fixture():
    """The usual handlers; what runs the tests may ignore some signals."""
    usual = {signal.SIGINT: signal.default_int_handler, signal.SIGTERM: signal.SIG_DFL,
             signal.SIGHUP: signal.SIG_DFL}
    before = {number: signal.signal(number, handler) for number, handler in usual.items()}
    yield usual
    for number, handler in before.items():
        signal.signal(number, handler)


@pytest.fixture(name="pretended")
def pretended_fixture(monkeypatch, tmp_path, handlers):
    """A phone that is pretended."""
    assert handlers
    monkeypatch.setattr(bexwifi.adb.subprocess, "Popen", PretendedAdb)
    monkeypatch.setattr(bexwifi.lock, "PATH", str(tmp_path / "{}"))
    phone = bexwifi.Phone(f"pretended-{tmp_path}")
    assert phone.methods
    return phone


def is_as_before(phone):
    """Asserts that nothing is left of the use of the radio."""
    assert not PretendedAdb.on
    assert [signal.getsignal(number) for number in SIGNALS] == [
        signal.default_int_handler, signal.SIG_DFL, signal.SIG_DFL]
    with phone.lock:
        assert (phone.lock.user, phone.lock.started) == (None, "")
    with open(phone.lock._path, "rb") as file:  # pylint: disable=protected-access
        fcntl.flock(file, fcntl.LOCK_EX | fcntl.LOCK_NB)


def interrupted_at(phone, function, *moments):
    """Whether all of the moments came; they have interrupted the function then, and left nothing."""
    at = AtMoments(*moments)
    try:
        at.watch(function)
        assert at.left, f"no interrupt came through, of those at {moments}"
    except KeyboardInterrupt:
        pass
    is_as_before(phone)
    return not at.left


def test_an_interrupt_at_any_line_of_the_kit(pretended):
    bodies = []

    def use():
        with pretended.transmit("RunTxBGStart", 6):
            assert PretendedAdb.on
            bodies.append((moment, AtMoments.running.count))

    moment = 1
    while interrupted_at(pretended, use, moment):
        moment += 1
    assert moment > 200
    # A block that is interrupted before it begins does not run, except where that comes in the last lines.
    assert bodies[0][0] > bodies[-1][1] - 10


@pytest.mark.parametrize("distance", [1, 2, 3, 5, 8, 13, 21])
def test_two_interrupts(pretended, distance):
    def use():
        with pretended.transmit("RunTxBGStart", 6):
            assert PretendedAdb.on

    for moment in range(1, 200, 3):
        interrupted_at(pretended, use, moment, moment + distance)


def test_a_program_s_own_handler_is_called_and_may_go_on(pretended):
    seen = []
    signal.signal(signal.SIGTERM, lambda *arguments: seen.append(arguments))
    with pretended.transmit("RunTxBGStart", 6):
        signal.raise_signal(signal.SIGTERM)
        assert (len(seen), PretendedAdb.on) == (1, True)
    is_idle_after = not PretendedAdb.on
    signal.signal(signal.SIGTERM, signal.SIG_DFL)
    assert is_idle_after and len(seen) == 1


def test_a_signal_that_is_ignored_stays_ignored(pretended):
    signal.signal(signal.SIGHUP, signal.SIG_IGN)
    with pretended.transmit("RunTxBGStart", 6):
        signal.raise_signal(signal.SIGHUP)
        assert PretendedAdb.on
    assert signal.getsignal(signal.SIGHUP) == signal.SIG_IGN


PROGRAM = """
import signal, sys
signal.signal(signal.SIGINT, signal.default_int_handler)
signal.signal(signal.SIGTERM, signal.SIG_DFL)
signal.signal(signal.SIGHUP, signal.SIG_DFL)
from bexwifi import Phone
phone = Phone(sys.argv[1])
with phone.transmit("RunTxBGStart", 6, 11, 20, 1):
    print("on", flush=True)
    sys.stdin.readline()
print("done", flush=True)
"""


@pytest.fixture(name="program")
def program_fixture(simulated):
    """A program that transmits until it reads a line, as the leader of a process group."""
    with Running([sys.executable, "-c", PROGRAM, simulated.serial], stdin=subprocess.PIPE,
                 stdout=subprocess.PIPE, stderr=subprocess.PIPE, text=True,
                 env={**os.environ, "PYTHONPATH": str(ROOT / "station")}) as process:
        yield process
        process.kill()


def ends_by(number, program, simulated):
    """Asserts that the program ends by the signal, after which nothing is left. Its stderr."""
    out, err = program.communicate(timeout=TIMEOUT)
    assert (program.returncode, "done" in out) == (-number, False), err
    assert radio_use(simulated) == "idle"
    with bexwifi.Phone(simulated.serial).lock as lock:
        assert lock.started == ""
    return err


@pytest.mark.parametrize("number", SIGNALS)
def test_a_signal_in_a_block(program, simulated, number):
    assert program.stdout.readline() == "on\n"
    program.send_signal(number)
    err = ends_by(number, program, simulated)
    assert ("KeyboardInterrupt" in err) == (number == signal.SIGINT)


@pytest.mark.parametrize("number", [signal.SIGINT, signal.SIGTERM])
def test_a_signal_in_a_start(simulated, request, number):
    with held(simulated, "wl") as (wait_until_waiting, release):
        program = request.getfixturevalue("program")
        wait_until_waiting()
        program.send_signal(number)
        wait_until_waiting(2)  # `stop` has begun
        release()
        ends_by(number, program, simulated)


def test_signals_while_the_radio_is_switched_off(program, simulated):
    assert program.stdout.readline() == "on\n"
    since = simulated.log.stat().st_size
    with held(simulated, "wl") as (wait_until_waiting, release):
        program.stdin.write("\n")
        program.stdin.flush()
        wait_until_waiting()
        for number in (signal.SIGTERM, signal.SIGTERM, signal.SIGHUP):
            os.killpg(program.pid, number)  # as a terminal does
        said = {program.stderr.readline(), program.stderr.readline()}
        assert said == {f"bexwifi: {name} waits until the radio is off\n" for name in ("SIGTERM", "SIGHUP")}
        release()
        program.wait(TIMEOUT)
    assert program.returncode in (-signal.SIGTERM, -signal.SIGHUP)
    ends_by(-program.returncode, program, simulated)
    assert [line for line, _ in simulated.commands(since)] == simulated.explain("RunTxStop", "6")


def test_a_signal_while_another_program_uses_the_phone(simulated, request):
    since = simulated.log.stat().st_size
    with bexwifi.Phone(simulated.serial).lock:
        program = request.getfixturevalue("program")
        assert program.stderr.readline() == (
            f"phone {simulated.serial}: another program uses it; waiting\n")
        program.send_signal(signal.SIGTERM)
        program.wait(TIMEOUT)
    ends_by(signal.SIGTERM, program, simulated)
    assert simulated.commands(since) == []


def test_a_signal_just_before_the_wait_for_another_program(simulated):
    program = """
import logging, os, signal, sys
import bexwifi
class Kill(logging.Handler):
    def emit(self, _):
        os.kill(os.getpid(), signal.SIGTERM)
logging.getLogger("bexwifi").addHandler(Kill())
bexwifi.Phone(sys.argv[1]).call("RunTxStop", 6)
"""
    with bexwifi.Phone(simulated.serial).lock:
        done = subprocess.run([sys.executable, "-c", program, simulated.serial], check=False, timeout=TIMEOUT,
                              env={**os.environ, "PYTHONPATH": str(ROOT / "station")})
    assert done.returncode == -signal.SIGTERM


def test_what_a_killed_program_left_on_is_ended_before_the_next_start(program, simulated):
    assert program.stdout.readline() == "on\n"
    program.kill()
    program.wait(TIMEOUT)
    assert radio_use(simulated) == "tx"
    phone = bexwifi.Phone(simulated.serial)
    since = simulated.log.stat().st_size
    with phone.transmit(*TRANSMISSION):
        lines = [line for line, _ in simulated.commands(since)]
    start = simulated.explain(*map(str, TRANSMISSION))
    stop = simulated.explain("snifferStop")
    assert lines[-len(start) - len(stop):] == stop + start
    assert radio_use(simulated) == "idle"
