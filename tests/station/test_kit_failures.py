# Copyright 2026 The BEX Wi-Fi Authors
# SPDX-License-Identifier: Apache-2.0
"""What the kit tells of wrong input and of phones that cannot be used: one clear line, the right exception."""

import contextlib
import socket
import threading

import pytest

import bexwifi
from support.adbpeer import message
from support.kit import TRANSMISSION, raises
from support.phone import CLIENT


@pytest.fixture(name="device")
def device_fixture(adb):
    """Starts a device that greets adb with the given message only; its serial number."""
    with socket.create_server(("127.0.0.1", 0)) as server, contextlib.ExitStack() as ends:

        def start(greeting):
            def serve():
                with contextlib.suppress(OSError):
                    while True:
                        connection = ends.enter_context(server.accept()[0])
                        while connection.recv(1 << 16):
                            connection.sendall(greeting)

            ends.callback(server.shutdown, socket.SHUT_RDWR)
            threading.Thread(target=serve, daemon=True).start()
            return f"127.0.0.1:{server.getsockname()[1]}"

        yield start


@pytest.mark.parametrize("serial", ["nonesuch", "127.0.0.1:1", "-s"])
def test_an_unknown_serial_number(serial):
    raises(bexwifi.UnknownPhone, "adb does not know it", bexwifi.Phone(serial).call, "isMimoSupport")
    raises(bexwifi.UnknownPhone, "adb does not know it", bexwifi.Phone(serial).doctor)


def test_an_unauthorised_phone(adb, device):
    serial = device(message(b"AUTH", 1, 0, bytes(20)))
    adb("connect", serial)
    raises(bexwifi.Unauthorised, "unauthorised: allow", lambda: bexwifi.Phone(serial).methods)
    adb("disconnect", serial)


def test_an_offline_phone(adb, device, monkeypatch):
    monkeypatch.setattr(bexwifi.adb, "CONNECTIONS", 0)
    serial = device(b"")
    adb("connect", serial)
    raises(bexwifi.Offline, "offline: adb sees", lambda: bexwifi.Phone(serial).methods)
    adb("disconnect", serial)


def test_no_adb(monkeypatch):
    monkeypatch.setenv("PATH", "/nonexistent")
    raises(bexwifi.AdbFailed, "apt-get install adb", lambda: bexwifi.Phone("nonesuch").methods)


@pytest.mark.parametrize("serial", ["", None, 5])
def test_what_is_no_serial_number(serial):
    with pytest.raises(ValueError, match="adb devices"):
        bexwifi.Phone(serial)


@pytest.mark.parametrize("timeout", [0, -1, float("nan")])
def test_what_is_no_timeout(timeout):
    with pytest.raises(ValueError, match="seconds above 0"):
        bexwifi.Phone("nonesuch", timeout=timeout)


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


@pytest.mark.parametrize("printed, words", [
    ("""{"schema_version":2,"methods":[]}""", "schema version 2"),
    ("""{"schema_version":1}""", "methods"),
    ("""{"schema_version":1,"methods":[{"name":"RunTxStop"}]}""", "summary"),
    ("[]", "another version"), ("7", "another version")])
def test_a_client_of_another_version(own, printed, words):
    (own.root / CLIENT[1:]).unlink()
    (own.root / CLIENT[1:]).write_text(f"#!/system/bin/sh\necho '{printed}'\n")
    (own.root / CLIENT[1:]).chmod(0o755)
    raises(bexwifi.WrongClient, words, bexwifi.Phone(own.serial).transmit, *TRANSMISSION)


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
