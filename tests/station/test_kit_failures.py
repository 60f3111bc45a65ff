# Copyright 2026 The BEX Wi-Fi Authors
# SPDX-License-Identifier: Apache-2.0
"""What the kit tells of wrong input and of phones that cannot be used: one clear line, the right exception."""

import contextlib
import json
import os
import pathlib
import pickle
import socket
import threading

import pytest

import bexwifi
from bexwifi.adb import Adb, Output
from support.adbpeer import message
from support.kit import TRANSMISSION, is_marked, raises
from support.phone import CLIENT
from support.radio import radio_use


@pytest.fixture(name="device")
def device_fixture(adb):
    """Starts a device that greets adb with the given message only; its serial number."""
    with socket.create_server(("127.0.0.1", 0)) as server, contextlib.ExitStack() as ends:

        def start(greeting):
            def serve():
                with contextlib.suppress(OSError):
                    while True:
                        connection = ends.enter_context(server.accept()[0])
                        connection.recv(1 << 16)
                        connection.sendall(greeting)
                        while connection.recv(1 << 16):
                            pass

            ends.callback(server.shutdown, socket.SHUT_RDWR)
            threading.Thread(target=serve, daemon=True).start()
            return f"127.0.0.1:{server.getsockname()[1]}"

        yield start


@pytest.mark.parametrize("serial", ["nonesuch", "127.0.0.1:1", "-s"])
def test_an_unknown_serial_number(serial):
    raises(bexwifi.UnknownPhone, "adb does not know it", bexwifi.Phone(serial).call, "isMimoSupport")
    raises(bexwifi.UnknownPhone, "adb does not know it", bexwifi.Phone(serial).doctor)


def test_an_unauthorised_phone(adb, device):
    # It takes no signature; to the key itself a phone answers when its user does.
    serial = device(2 * message(b"AUTH", 1, 0, bytes(20)))
    adb("connect", serial)
    raises(bexwifi.Unauthorised, "unauthorised: allow", lambda: bexwifi.Phone(serial).methods)


def test_an_offline_phone(adb, device, monkeypatch):
    monkeypatch.setattr(bexwifi.adb, "CONNECTIONS", 0)
    serial = device(b"")
    adb("connect", serial)
    raises(bexwifi.Offline, "offline: adb sees", lambda: bexwifi.Phone(serial).methods)


def test_no_adb(monkeypatch):
    monkeypatch.setenv("PATH", "/nonexistent")
    raises(bexwifi.AdbFailed, "apt-get install adb", lambda: bexwifi.Phone("nonesuch").methods)


@pytest.mark.parametrize("serial", ["", None, 5])
def test_what_is_no_serial_number(serial):
    with pytest.raises(ValueError, match="adb devices"):
        bexwifi.Phone(serial)


@pytest.mark.parametrize("timeout", [0, -1, 1e-9, float("nan"), float("inf"), 1e7, "5", None])
def test_what_is_no_timeout(timeout):
    with pytest.raises(ValueError, match="a timeout is a number of seconds from"):
        bexwifi.Phone("nonesuch", timeout=timeout)
    phone = bexwifi.Phone("nonesuch", timeout=5)
    with pytest.raises(ValueError, match="a timeout is a number of seconds from"):
        phone.timeout = timeout
    assert phone.timeout == 5


def test_a_phone_without_the_client_or_the_service(own):
    client = own.root / CLIENT[1:]
    client.chmod(0)
    raises(bexwifi.NoClient, "bex-wifi-client cannot be run", lambda: bexwifi.Phone(own.serial).methods)
    client.rename(client.with_suffix(".away"))
    raises(bexwifi.NoClient, "bex-wifi-client cannot be run", lambda: bexwifi.Phone(own.serial).methods)
    client.with_suffix(".away").rename(client)
    client.chmod(0o755)
    phone = bexwifi.Phone(own.serial, timeout=1)
    assert "RunTxStop" in phone.methods
    own.kill_service()
    late = raises(bexwifi.DeadlinePassed, "nothing was called", phone.transmit(*TRANSMISSION).__enter__)
    assert (late.answer.exit_code, late.radio_may_be_on) == (5, False)
    next((own.root / "vendor/etc/vintf/manifest").iterdir()).unlink()
    none = raises(bexwifi.NoService, "", phone.transmit(*TRANSMISSION).__enter__)
    assert (none.answer.exit_code, none.radio_may_be_on) == (3, False)
    report = phone.doctor()
    assert not report.ok
    problem = next(check for check in report.checks if check.name == "manifest")
    assert problem.status == "problem" and problem.found and problem.remedy


@pytest.fixture(name="prints")
def prints_fixture(monkeypatch):
    """A phone whose commands print a text on stdout, another on stderr, and end with a code."""
    def prints(out, err="", code=0):
        monkeypatch.setattr(Adb, "run", lambda *_, **__: Output(code, out, err))
        return bexwifi.Phone("printing")

    return prints


@pytest.mark.parametrize("printed, words", [
    ("""{"schema_version":2,"methods":[]}""", "schema version 2"),
    ("""{"schema_version":1}""", "methods"),
    ("""{"schema_version":1,"methods":[{"name":"RunTxStop"}]}""", "summary"),
    ("[]", "another version"), ("7", "another version"), ('{"schema_version":"2\\n3"}', "version 2 3")])
def test_a_client_of_another_version(prints, printed, words):
    raises(bexwifi.WrongClient, words, prints(printed).transmit, *TRANSMISSION)


@pytest.mark.parametrize("end", [None, "RunTxStop"])
def test_a_start_whose_end_is_not_known_is_not_called(prints, end):
    methods = [{"name": name, "summary": "", "result": {"type": "int32", "meaning": ""}, "arguments": [
        {"name": each, "type": "string", "meaning": "", "unit": None, "accepted": ""} for each in arguments]}
        for name, arguments in {"RunTxBGStart": ["channel"], end: ["chain"]}.items()]
    printing = prints(json.dumps({"schema_version": 1, "methods": methods}))
    raises(bexwifi.WrongClient, "RunTxBGStart cannot be ended by RunTxStop", printing.transmit, "RunTxBGStart", 6)


def test_a_client_that_is_too_old(prints):
    phone = prints("", "bex-wifi-client: unknown method \"stop\"; see bex-wifi-client --help\n", 2)
    for function in phone.stop, phone.doctor, lambda: phone.methods:
        raises(bexwifi.WrongClient, "another version than this kit: unknown method", function)


OBJECT = {"schema_version": 1, "method": "RunTxStop", "arguments": {"channel": "6"}, "value": None,
          "radio_may_be_on": None, "stage": "call", "started_at": "2026-11-22T09:15:00.250Z",
          "duration_ms": 12.5, "client_version": "0.2.0", "error": "what went wrong"}


@pytest.mark.parametrize("code, kind", [
    (1, "CommandFailed"), (2, "WrongUsage"), (3, "NoService"), (4, "TransportFailed"),
    (5, "DeadlinePassed"), (6, "NotWritten"), (7, "NoCount"), (130, "Interrupted"), (143, "Interrupted"),
    (99, "BexWifiError")])
def test_each_exit_code_has_an_exception(prints, code, kind):
    phone = prints(json.dumps({**OBJECT, "exit_code": code}), "bex-wifi-client: what went wrong\n", code)
    failed = raises(getattr(bexwifi, kind), "what went wrong", phone.client.call, "RunTxStop", {"channel": "6"})
    assert (failed.words, failed.answer.exit_code) == ("what went wrong", code)
    assert (failed.answer.duration, failed.may_go_on) == (0.0125, True)
    copy = pickle.loads(pickle.dumps(failed))  # as between the processes of a station
    assert (str(copy), copy.answer) == (str(failed), failed.answer)


@pytest.mark.parametrize("odd", [
    {"exit_code": []}, {"exit_code": True}, {"exit_code": "0"}, {"exit_code": None}, {"count": "5"},
    {"duration_ms": 10 ** 400}, {"started_at": 0}, {"stage": ...}, {"arguments": ...}])
def test_an_answer_of_other_types(prints, odd):
    members = {name: value for name, value in {**OBJECT, "exit_code": 0, **odd}.items() if value is not ...}
    phone = prints(json.dumps(members))
    raises(bexwifi.WrongClient, "another version", phone.client.call, "RunTxStop", {"channel": "6"})


@pytest.mark.parametrize("printed", [
    "[" * 100_000, json.dumps({**OBJECT, "exit_code": []})], ids=["deep", "other types"])
def test_the_radio_is_off_whatever_its_end_answers(phone, simulated, monkeypatch, printed):
    run = Adb.run

    def replaced(adb, *arguments, **options):
        if "RunTxStop" in arguments[1]:
            return Output(0, printed, "")  # and nothing was called
        return run(adb, *arguments, **options)

    monkeypatch.setattr(Adb, "run", replaced)
    with pytest.raises((bexwifi.NoAnswer, bexwifi.WrongClient)), phone.transmit(*TRANSMISSION):
        pass
    assert not is_marked(phone)
    assert radio_use(simulated) == "idle"


@pytest.mark.parametrize("code, err, words", [
    (0, "", "adb ended with 0 and printed nothing"), (137, "", "adb ended with 137"),
    (1, "error: closed\n", "error: closed"), (1, "sh: \x1b[2J\x9b\n", "sh:  [2J"),
    (0, "bex-wifi-client: warning: channel 999\n", "channel 999")])
def test_no_answer_is_not_success(prints, code, err, words):
    failed = raises(bexwifi.NoAnswer, words, prints("", err, code).client.call, "RunTxStop", {})
    assert failed.may_go_on
    assert str(failed).isprintable()


def test_an_adb_that_hangs_is_ended(tmp_path, monkeypatch):
    (tmp_path / "adb").write_text(f"#!/bin/sh\necho $$ >{tmp_path}/pid\nexec sleep 1000\n")
    (tmp_path / "adb").chmod(0o755)
    monkeypatch.setenv("PATH", f"{tmp_path}:{os.environ['PATH']}")
    monkeypatch.setattr(bexwifi.adb, "ADB_TIMEOUT", 0)
    raises(bexwifi.NoAnswer, "adb did not end within 1 seconds", bexwifi.Phone("hangs", timeout=1).doctor)
    started = tmp_path / "pid"  # on a busy machine it may not have come to writing it
    assert not (started.exists() and pathlib.Path("/proc", started.read_text().strip() or "none").exists())


@pytest.mark.parametrize("arguments", [
    ("nonesuch",), ("RunTxStop",), ("RunTxStop", 6, 7), ("RunTxStop", "\0"), ("RunRxApJoinHoc", "\ud800", ""),
    ("RunRxApJoinHoc", "x" * 200_000, "10.0.0.2")])
def test_wrong_arguments_call_nothing(phone, simulated, arguments):
    since = simulated.log.stat().st_size
    with pytest.raises((bexwifi.WrongUsage, bexwifi.AdbFailed)) as raised:
        phone.call(*arguments)
    assert not raised.value.radio_may_be_on
    assert len(str(raised.value).splitlines()) == 1
    assert simulated.commands(since) == []


def test_wrong_names(phone):
    raises(bexwifi.WrongUsage, "(channel)", lambda: phone.call("RunTxStop", canal=6))
    raises(bexwifi.WrongUsage, "(channel)", lambda: phone.call("RunTxStop", 6, channel=6))
    raises(bexwifi.WrongUsage, "RunTxNStart", phone.transmit, "RunRxBgStart", 6, 11, 1)
    raises(bexwifi.WrongUsage, "RunRxNStart", phone.receive, *TRANSMISSION)
    raises(bexwifi.WrongUsage, "RunTxNStart", phone.transmit, "RunTxStStart", 6, 20, 1)


def test_a_failed_command(phone, simulated):
    simulated.fault("wl", "exit", "1")
    failed = raises(bexwifi.CommandFailed, "RunTxStop", phone.call, "RunTxStop", 6)
    assert (failed.answer.value, failed.answer.exit_code) == (-1, 1)
    assert failed.words == failed.answer.error


def test_a_failed_start_is_switched_off(phone, simulated):
    simulated.fault("wl", "--when", "*pkteng_start*", "exit", "1")
    failed = raises(bexwifi.CommandFailed, "; it was switched off", phone.call, *TRANSMISSION)
    assert failed.words == f"{failed.answer.error}; it was switched off"
    assert radio_use(simulated) == "idle"
