# Copyright 2026 The BEX Wi-Fi Authors
# SPDX-License-Identifier: Apache-2.0
"""Switching a phone where something is in the way: another command, a program that looks at its
lock, a stale number, no room, closed streams."""

import fcntl
import os
import signal
import subprocess

import pytest

from conftest import SERVICE, Launcher, Phone
from support.processes import open_files
from support.waiting import wait_for


def answers(phone):
    return phone.run("/data/ask", "echo again").stdout == "same again\n"


def finish(call):
    """The exit code and the standard error of a launcher that was started."""
    text = call.communicate(timeout=100)[1].decode()
    return call.returncode, text


def start(phone, command):
    return phone.launcher.start(command, phone.folder, stdout=subprocess.PIPE,
                                stderr=subprocess.PIPE)


def has_open(process, path):
    try:
        return str(path) in open_files(process)
    except OSError:  # of a process that is just starting
        return False


@pytest.fixture(name="off")
def off_fixture(any_phone):
    """A phone that has been up."""
    any_phone.do("up")
    any_phone.do("down")
    return any_phone


@pytest.fixture(name="looked_at")
def looked_at_fixture(off):
    """The same, while a program holds its lock: gives the phone and that program's descriptor."""
    with open(off.folder / "pid", "r+b") as lock:
        fcntl.flock(lock, fcntl.LOCK_EX)
        yield off, lock


def test_up_waits_for_a_program_that_looks_at_the_lock(looked_at):
    phone, lock = looked_at
    call = start(phone, "up")
    wait_for(lambda: has_open(call.pid, phone.folder / "pid"))
    fcntl.flock(lock, fcntl.LOCK_UN)
    assert finish(call) == (0, "")
    assert answers(phone)


def test_down_kills_nobody_by_a_stale_number(looked_at):
    phone, lock = looked_at
    user = phone.root.stat().st_uid
    with subprocess.Popen(["sleep", "1000"], user=user if os.geteuid() == 0 else None) as stranger:
        try:
            lock.write(f"{stranger.pid}\n".encode())
            lock.flush()
            call = start(phone, "down")
            wait_for(lambda: has_open(call.pid, phone.folder / "pid"))
            fcntl.flock(lock, fcntl.LOCK_UN)
            assert finish(call) == (0, f"phone: {phone.folder} is not up\n")
            assert stranger.poll() is None
        finally:
            stranger.kill()


def test_two_ups_at_once(off):
    calls = [start(off, "up") for _ in range(2)]
    assert sorted(finish(call) for call in calls) \
        == [(0, ""), (0, f"phone: {off.folder} is up already\n")]
    assert answers(off)


def test_two_restarts_at_once(off):
    off.do("up")
    for _ in range(2):
        calls = [start(off, "restart-service") for _ in range(2)]
        assert [finish(call) for call in calls] == [(0, "")] * 2
    assert answers(off)
    off.do("down")
    assert off.processes() == []


def start_up_that_waits(launcher, place):
    """A phone, and an `up` that waits for its service to register."""
    service = place / "service"
    service.write_text("#!/system/bin/sh\nread x </phone/endless\n")
    service.chmod(0o755)
    phone = Phone.create(launcher, place / "phone", "--install", f"{service}={SERVICE}")
    phone.output("mkfifo /phone/endless")
    waiting = start(phone, "up")
    wait_for(lambda: (phone.folder / "pid").exists() and (phone.folder / "pid").read_text())
    return phone, waiting


def test_down_ends_an_up_that_waits_for_its_service(any_launcher, place):
    phone, waiting = start_up_that_waits(any_launcher, place)
    phone.do("down")
    code, text = finish(waiting)
    assert code == 1 and "before it registered" in text
    assert phone.processes() == []


@pytest.mark.parametrize("number", [signal.SIGINT, signal.SIGTERM, signal.SIGHUP])
def test_an_up_that_is_ended_takes_the_phone_down(launcher, place, number):
    phone, waiting = start_up_that_waits(launcher, place)
    waiting.send_signal(number)
    assert finish(waiting) == (130, "")
    assert phone.processes() == []


@pytest.mark.parametrize("closed", ["<&-", ">&-", "2>&-", "<&- >&- 2>&-"])
def test_closed_streams(off, closed):
    line = off.launcher.line
    off.launcher.line = [*line[:-1], "sh", "-c", f'exec "$@" {closed}', "sh", line[-1]]
    off.do("up")
    assert off.run("true").returncode == 0
    off.launcher.line = line
    assert answers(off)
    again = off.launcher("up", off.folder)
    assert (again.returncode, again.stderr) == (0, f"phone: {off.folder} is up already\n")
    off.do("down")
    assert off.processes() == []


def test_no_room_for_the_pid_file(off):
    """A limit on the size of files, as this user has no full disk."""
    limited = Launcher("", off.launcher.kind, "self")
    limited.line = ["prlimit", "--fsize=0", *off.launcher.line]
    result = limited("up", off.folder)
    assert (result.returncode, result.stderr) == (1, f"phone: {off.folder}/pid: File too large\n")
    assert off.processes() == []
    off.do("up")
    assert answers(off)


def test_a_boot_that_fails_is_no_boot(off):
    off.output("rm -r /sys; touch /sys")  # as little can be written there as on a full disk
    result = off.launcher("up", off.folder)
    assert result.returncode == 1
    assert "the service ended with 1 before it registered" in result.stderr
    assert off.processes() == []


def test_of_two_creates_one_wins(launcher, place):
    folder = place / "phone"
    calls = [launcher.start("create", "broadcom", folder, stdout=subprocess.PIPE,
                            stderr=subprocess.PIPE) for _ in range(2)]
    (won, nothing), (lost, complaint) = sorted(finish(call) for call in calls)
    assert (won, nothing, lost) == (0, "", 1)
    assert complaint.startswith(f"phone: {folder} ") and complaint.count("\n") == 1
    assert Phone(launcher, folder).output("getprop ro.hardware.wlan.vendor") == "broadcom"
    assert list(place.iterdir()) == [folder]
