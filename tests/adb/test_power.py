# Copyright 2026 The BEX Wi-Fi Authors
# SPDX-License-Identifier: Apache-2.0
"""When a phone is on adb, and for whom."""

import os
import pathlib
import re
import signal
import socket
import subprocess

import pytest

from support.adb import TIMEOUT, made_phone, processes_of
from support.phone import PHONE
from support.waiting import wait_for


def launcher(*arguments):
    return subprocess.run([PHONE, *arguments], capture_output=True, text=True, check=False,
                          timeout=TIMEOUT)


@pytest.fixture(scope="module", name="shared")
def shared_fixture(adb):
    with made_phone(adb, "wcn6750") as phone:
        yield phone


@pytest.fixture(name="phone")
def off_phone_fixture(shared):
    yield shared
    launcher("down", shared.folder)
    shared.forget()


def port_of(serial):
    return int(serial.rpartition(":")[2])


def listeners(port):
    """The addresses at which something of this machine listens on the port, as the kernel has them."""
    rows = [line.split() for table in pathlib.Path("/proc/net").glob("tcp*")  # no tcp6 without IPv6
            for line in table.read_text().splitlines()[1:]]
    return [row[1] for row in rows if row[1].endswith(f":{port:04X}") and row[3] == "0A"]


def test_adb_is_off_unless_asked_for(phone):
    assert launcher("up", phone.folder).stdout == ""
    assert not (phone.folder / "adb").exists()
    on = launcher("up", phone.folder, "--adb")
    assert re.fullmatch(r"127\.0\.0\.1:\d+\n", on.stdout)
    assert on.stderr == f"phone: {phone.folder} is up already\n"


def test_only_this_machine_reaches_it_and_until_the_phone_is_off(phone):
    phone.up()
    port = port_of(phone.serial)
    assert listeners(port) == [f"0100007F:{port:04X}"]
    launcher("down", phone.folder)
    assert listeners(port) == []


def test_a_phone_on_adb_stays_there(phone):
    phone.up()
    again = launcher("up", phone.folder, "--adb")
    assert (again.returncode, again.stdout) == (0, phone.serial + "\n")
    assert f"phone: {phone.folder} is on adb already\n" in again.stderr


def test_adb_outlives_the_service(phone):
    phone.up()
    assert launcher("restart-service", phone.folder).returncode == 0
    assert phone.shell("bex-wifi-client isSnifferMode") == (0, b"false\n", b"")
    phone.kill_service()
    assert phone.shell("bex-wifi-client isSnifferMode")[0] == 3
    assert launcher("up", phone.folder).returncode == 0
    assert phone.shell("bex-wifi-client isSnifferMode") == (0, b"false\n", b"")


def test_a_reboot_is_a_power_cycle(phone):
    phone.up()
    phone.shell("setprop vendor.test 1")
    assert phone.shell("getprop vendor.test") == (0, b"1\n", b"")
    with phone.adb.start("-s", phone.serial, "shell", "echo started; sleep 1000",
                         stdout=subprocess.PIPE) as client:
        assert client.stdout.readline() == b"started\n"
        assert phone.do("reboot").returncode == 0
        client.wait(TIMEOUT)
    wait_for(phone.connects)
    assert phone.shell("getprop vendor.test") == (0, b"\n", b"")
    assert phone.shell("bex-wifi-client isSnifferMode") == (0, b"false\n", b"")
    assert (phone.folder / "adb.log").read_text() == ""


def test_it_is_root_already(phone):
    phone.up()
    assert phone.do("root").stdout == b"adbd is already running as root\n"


def test_there_is_nothing_else_to_boot_into(phone):
    phone.up()
    assert phone.do("reboot", "bootloader").returncode != 0
    assert phone.shell("echo here") == (0, b"here\n", b"")


def test_down_ends_what_adb_s_clients_run(phone):
    phone.up()
    with phone.adb.start("-s", phone.serial, "shell", "echo started; sleep 1000",
                         stdout=subprocess.PIPE) as client:
        assert client.stdout.readline() == b"started\n"
        launcher("down", phone.folder)
        assert processes_of(phone) == []
        client.wait(TIMEOUT)


def test_killing_the_process_behind_adb_ends_what_adb_s_clients_run(phone):
    phone.up()
    with phone.adb.start("-s", phone.serial, "shell", "echo started; trap '' HUP; sleep 1000",
                         stdout=subprocess.PIPE) as client:
        assert client.stdout.readline() == b"started\n"
        running = processes_of(phone)
        parents = {int(pathlib.Path(f"/proc/{number}/stat").read_text().split()[3])
                   for number in running}
        os.kill((parents - set(running)).pop(), signal.SIGKILL)
        wait_for(lambda: processes_of(phone) == [])
        client.wait(TIMEOUT)
    again = launcher("up", phone.folder, "--adb")
    assert again.returncode == 0
    assert "on adb already" not in again.stderr


def bound(port):
    """A socket that has the port, beside others that are bound to it but do not listen."""
    taker = socket.socket()
    taker.setsockopt(socket.SOL_SOCKET, socket.SO_REUSEADDR, 1)
    taker.bind(("127.0.0.1", port))
    return taker


def test_a_port_of_one_s_own(phone):
    with bound(0) as reserved:  # nobody else is given it meanwhile
        port = str(reserved.getsockname()[1])
        with bound(int(port)) as taken:
            taken.listen()
            refused = launcher("up", phone.folder, "--adb", port)
            assert (refused.returncode, refused.stdout) == (1, "")
            assert refused.stderr == f"phone: adb cannot have port {port}: Address already in use\n"
            assert not phone.is_up()
        asked = launcher("up", phone.folder, "--adb", port)
        assert (asked.stdout, asked.stderr) == (f"127.0.0.1:{port}\n", "")


@pytest.mark.parametrize("port", ["65536", "-1", "adb", "٣"])
def test_what_is_no_port(phone, port):
    wrong = launcher("up", phone.folder, "--adb", port)
    assert (wrong.returncode, wrong.stdout) == (1, "")
    assert wrong.stderr == f"phone: '{port}' is no port: a number below 65536\n"
    assert not phone.is_up()


def test_a_phone_that_does_not_come_up_is_not_on_adb(phone):
    service = next((phone.root / "vendor/bin/hw").iterdir())
    os.rename(service, f"{service}.away")
    try:
        failed = launcher("up", phone.folder, "--adb")
    finally:
        os.rename(f"{service}.away", service)
    assert (failed.returncode, failed.stdout) == (1, "")
    assert len(failed.stderr.splitlines()) == 1
    assert launcher("up", phone.folder).stdout == ""
    assert "on adb" not in launcher("up", phone.folder, "--adb").stderr
