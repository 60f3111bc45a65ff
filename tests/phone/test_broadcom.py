# Copyright 2026 The BEX Wi-Fi Authors
# SPDX-License-Identifier: Apache-2.0
"""What the Broadcom phone does behind a call, and what can go wrong on any phone."""

import json
import os
import signal
import subprocess

import pytest

from support.waiting import wait_for

COUNTER = ("wl counters  | busybox grep pktengrxdmcast | busybox awk '{for(i = 1;i <= NF;i++) "
           "{if(\"pktengrxdmcast\" == $i) print $(i + 1)} }' ")


@pytest.fixture(name="phone")
def broadcom_phone(make_phone):
    phone = make_phone("broadcom")
    phone.up()
    return phone


def test_the_count_comes_from_the_chips_counters(phone):
    """The count that the stop returns is what the chip's counter has reached, read by the pipeline."""
    def counter():
        return int(phone.run("/system/bin/sh", "-c", COUNTER).stdout)

    assert phone.client("RunRxBgStart", "6", "54", "1").returncode == 0
    before = counter()
    wait_for(lambda: counter() > before)
    stopped = phone.client("RunRxStop", "6")
    assert stopped.returncode == 0
    assert int(stopped.stdout) > before


def test_a_start_loads_the_manufacturing_firmware_and_a_stop_returns(phone):
    parameter = phone.root / "sys/module/bcmdhd/parameters/firmware_path"
    phone.client("RunTxBGStart", "6", "54", "15", "1")
    assert parameter.read_text() == "/etc/firmware/fw_bcmdhd_mfg.bin"
    phone.client("RunTxStop", "6")
    assert parameter.read_text() == "/etc/firmware/fw_bcmdhd.bin"


def test_a_failing_tool_stops_nothing(phone):
    phone.fault("ifconfig", "exit", "3")
    seen = phone.log.stat().st_size
    client = phone.client("RunTxStop", "6")
    assert client.returncode == 1
    assert client.stdout == b"-1\n"
    assert len(client.stderr.splitlines()) == 1
    assert [line for line, _ in phone.commands(seen)] == phone.explain("RunTxStop", "6")
    phone.fault("ifconfig", "clear")


def test_a_phone_without_its_tool(phone):
    phone.fault("wl", "missing")
    client = phone.client("RunRxBgStart", "6", "54", "1")
    assert client.returncode == 0  # the count text is the result, and nothing counted
    assert client.stdout == b"\n"
    client = phone.client("RunTxBGStart", "6", "54", "15", "1")
    assert (client.returncode, client.stdout) == (1, b"-1\n")
    assert len(client.stderr.splitlines()) == 1
    phone.fault("wl", "clear")
    assert phone.client("RunTxBGStart", "6", "54", "15", "1").returncode == 0


@pytest.mark.parametrize("channel", [
    "6 7", "'6'", '"6', "6; echo hostile", "$(echo 6)", "`echo 6`", "*", "6\n7", b"\xff\xfe6",
    "6" * 100_000,
], ids=range(10))
def test_arguments_reach_the_shell_as_they_stand(phone, channel):
    seen = phone.log.stat().st_size
    client = phone.client("RunTxStStart", channel, "20", "1")
    assert client.returncode in (0, 1)
    text = os.fsdecode(channel)
    # The log holds what fits into one of its entries.
    line = phone.commands(seen)[-1][0] if len(text) < 1000 else None
    assert line in (f"wl fqacurcy {text} ", None)
    assert phone.client("RunTxStStop", "6").returncode == 0


def test_a_client_killed_in_a_call(phone):
    """The commands run to their end, and the next call is served."""
    phone.fault("ifconfig", "wait")
    seen = phone.log.stat().st_size
    call = ["RunTxBGStart", "6", "54", "15", "1"]
    client = subprocess.Popen(phone.command("/vendor/bin/bex-wifi-client", *call))
    wait_for((phone.root / "phone/faults/ifconfig.waiting").exists)
    client.send_signal(signal.SIGKILL)
    client.wait()
    phone.fault("ifconfig", "release")
    phone.fault("ifconfig", "clear")
    expected = phone.explain(*call)
    wait_for(lambda: len(phone.commands(seen)) == len(expected))
    assert [line for line, _ in phone.commands(seen)] == expected
    assert phone.client("RunTxStop", "6").stdout == b"0\n"


def test_a_slow_tool_and_a_deadline(phone):
    """The client gives up in time, and the commands still run to their end."""
    phone.fault("wl", "wait")
    seen = phone.log.stat().st_size
    client = phone.client("--json", "--timeout", "3", "RunTxStop", "6")
    assert client.returncode == 5
    assert len(client.stderr.splitlines()) == 1
    answer = json.loads(client.stdout)
    assert (answer["method"], answer["ok"], answer["value"]) == ("RunTxStop", False, None)
    assert phone.commands(seen) == []
    phone.fault("wl", "release")
    expected = phone.explain("RunTxStop", "6")
    wait_for(lambda: [line for line, _ in phone.commands(seen)] == expected)
    assert phone.client("getWlanMode").stdout == b"0\n"


def test_without_the_service(make_phone):
    phone = make_phone("broadcom")
    client = phone.client("getWlanMode")
    assert (client.returncode, client.stdout) == (3, b"")
    assert len(client.stderr.splitlines()) == 1
    client = phone.client("--timeout", "1", "getWlanMode")
    assert (client.returncode, client.stdout) == (5, b"")


def test_a_client_that_waits_for_the_service(make_phone):
    phone = make_phone("broadcom")
    with subprocess.Popen(phone.command("/vendor/bin/bex-wifi-client", "--timeout", "50",
                                        "isMimoSupport"), stdout=subprocess.PIPE) as client:
        phone.up()
        assert client.stdout.read() == b"true\n"
    assert client.returncode == 0


def test_a_socket_left_over_by_a_killed_service(phone):
    phone.down()
    assert list((phone.root / "dev/socket/hidl").iterdir())
    assert phone.client("getWlanMode").returncode == 3
    phone.up()
    assert phone.client("getWlanMode").stdout == b"0\n"


def test_an_unknown_vendor_ends_the_service_at_the_first_call(make_phone):
    phone = make_phone("broadcom")
    properties = phone.root / "vendor/build.prop"
    properties.write_text(properties.read_text().replace("broadcom", "acme"))
    # Meant so: the service calls the object that it does not have.
    phone.expected_report = r"null pointer of type '.*SnifferTool'|SEGV on unknown address"
    phone.up()
    assert phone.client("isMimoSupport").stdout == b"true\n"
    client = phone.client("getWlanMode")
    assert client.returncode == 4
    assert len(client.stderr.splitlines()) == 1
    assert "snifferTool is nullptr!" in phone.log.read_text()
