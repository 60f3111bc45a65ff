# Copyright 2026 The BEX Wi-Fi Authors
# SPDX-License-Identifier: Apache-2.0
"""Clients and the service die at any moment of any call."""

import os
import signal
import socket
import subprocess

import pytest

from catalogue import CALLS
from support.phone import ROOT, SERVICE
from support.waiting import wait_for
from faults import Line, nothing_lost, service_process, stage


SOCKET = f"dev/socket/hidl/{SERVICE.removesuffix('-service')}::IWifiService~default"
ONE_CALL_OF_EACH = list({call[0]: call for call in CALLS if call[0] != "isMimoSupport"}.values())


@pytest.fixture(name="phone", params=["bwrap-broadcom", "bwrap-qca639x", "proot-wcn"])
def phone_fixture(request, monkeypatch, make_phone):
    """A phone that is up, and on which every tool succeeds and prints nothing, but cat."""
    sandbox, chip = request.param.split("-")
    monkeypatch.setenv("BEX_PHONE_SANDBOX", sandbox)
    phone = make_phone(chip)
    for tool in tools(phone):
        stage(phone, tool, "exit", "0")
    phone.up()
    return phone


def tools(phone):
    used = {command.tool for call in ONE_CALL_OF_EACH for text in phone.explain(*call)
            for command in Line(text).commands}
    return used - {"cat"}


def first_gate(phone, call):
    """Has the call's first command wait; returns its tool, and the file that tells that it has come."""
    first = next(command for text in phone.explain(*call) for command in Line(text).commands)
    then = ["exit", "0", "--when", "*", "exit", "0"] if first.tool != "cat" else []
    stage(phone, first.tool, "--when", first.pattern, "wait", *then)
    return first.tool, phone.root / f"phone/faults/{first.tool}.waiting"


def open_gate(phone, tool):
    stage(phone, tool, *(["exit", "0"] if tool != "cat" else ["clear"]))


def test_a_client_killed_before_during_and_after_each_call(phone):
    assert phone.call(*ONE_CALL_OF_EACH[0])[0] == 0
    with nothing_lost(phone):
        for call in ONE_CALL_OF_EACH:
            expected = phone.explain(*call)
            # Before: it has connected, and sent nothing.
            with socket.socket(socket.AF_UNIX, socket.SOCK_SEQPACKET) as client:
                client.connect(str(phone.root / SOCKET))

            # During: the first tool is at its work.
            os.truncate(phone.log, 0)
            tool, waiting = first_gate(phone, call)
            with phone.start(*call) as client:
                wait_for(waiting.exists)
                client.send_signal(signal.SIGKILL)
            stage(phone, tool, "release")
            wait_for(lambda: len(phone.commands()) == len(expected))
            assert [text for text, _ in phone.commands()] == expected, call
            open_gate(phone, tool)

            # After: it has its answer, and nobody takes it.
            os.truncate(phone.log, 0)
            stdin, stdout = os.pipe()
            os.set_blocking(stdout, False)
            with pytest.raises(BlockingIOError):
                while True:
                    os.write(stdout, b"x" * 4096)
            os.set_blocking(stdout, True)
            with phone.start(*call, stdout=stdout) as client:
                wait_for(lambda: len(phone.commands()) == len(expected))
                client.send_signal(signal.SIGKILL)
            os.close(stdin)
            os.close(stdout)

            assert phone.call("getWlanMode")[0] in (0, 1), call


def test_a_service_killed_in_each_call(phone):
    """Its caller learns of it, its tools end with it, and the next service is whole."""
    assert phone.call(*ONE_CALL_OF_EACH[0])[0] == 0
    kept = None
    for call in ONE_CALL_OF_EACH:
        tool, waiting = first_gate(phone, call)
        with phone.start(*call) as client:
            wait_for(waiting.exists)
            phone.phone("restart-service", phone.folder)
            out, err = client.communicate(timeout=60)
        assert (call, client.returncode, out, len(err.splitlines())) == (call, 4, b"", 1)
        open_gate(phone, tool)
        files = sorted(str(path) for path in phone.root.rglob("*"))
        kept = kept or files
        assert files == kept
        with nothing_lost(phone):
            assert phone.call("getWlanMode")[0] in (0, 1)


def test_a_service_that_dies_by_itself(phone):
    os.kill(service_process(phone), signal.SIGKILL)
    wait_for(lambda: not phone.is_up())
    assert phone.call("getWlanMode")[0] == 3
    phone.up()
    assert phone.call("getWlanMode") == (0, b"0\n", b"")


def test_a_client_that_outlives_the_service(phone):
    """Its proxy is dead, it is told so, and the service that it finds then works."""
    with phone.outside(os.environ["BEX_STATION"], stdin=subprocess.PIPE, text=True) as station:
        def ask(word):
            station.stdin.write(word + "\n")
            station.stdin.flush()
            return station.stdout.readline().strip()

        for _ in range(5):
            assert ask("get") == "found"
            assert ask("call") == "answered"
            phone.phone("restart-service", phone.folder)
            assert station.stdout.readline() == "died\n"
            assert ask("call") == "dead object"
        assert ask("get") == "found"
        station.stdin.close()
