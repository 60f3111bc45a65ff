# Copyright 2026 The BEX Wi-Fi Authors
# SPDX-License-Identifier: Apache-2.0
"""Faults staged while the phone runs."""

import os
import signal
import subprocess

import pytest

from conftest import Launcher
from support.waiting import wait_for
from launcher import faults

TOOLS = ("busybox", "cat", "getprop", "ifconfig", "iw", "setprop", "sleep", "wl")


def test_every_tool_obeys(phone):
    for code, tool in enumerate(TOOLS, 10):
        phone.fault(tool, "exit", code)
    result = phone.shell("".join(f"/vendor/bin/{tool} x; print $?; " for tool in TOOLS))
    assert result.stdout.split() == ["10", "11", "12", "13", "14", "15", "16", "17"]
    assert result.stderr == ""
    for tool in TOOLS:
        phone.fault(tool, "clear")
    assert os.listdir(phone.root / "phone/faults") == []
    assert phone.output("cat /vendor/build.prop; getprop log.tag").endswith("D")


def test_staging_keeps_nothing_open(phone):
    """A program that stages thousands of faults itself has descriptors for them."""
    before = os.listdir("/proc/self/fd")
    for actions in (["wait", "exit", "1"], ["clear"]):
        faults.stage(str(phone.folder), "wl", actions)
    assert len(os.listdir("/proc/self/fd")) == len(before)


def test_a_tool_dies_by_a_signal(phone):
    phone.fault("wl", "signal", signal.SIGKILL)
    assert phone.run("wl", "up").returncode == 137
    assert phone.shell("wl up; echo $?").stdout == "137\n"


def test_the_tool_of_a_dead_command_is_seen_as_killed(phone):
    phone.fault("wl", "signal", 11)
    assert phone.shell("wl up").returncode == 139


def test_a_missing_tool_is_missing_by_every_name(phone):
    phone.fault("ifconfig", "missing")
    for name in ("ifconfig", "/vendor/bin/ifconfig", "/system/bin/ifconfig"):
        assert phone.run(name).returncode == 127
    phone.fault("ifconfig", "exit", 4)  # another fault ends the first
    assert phone.run("ifconfig").returncode == 4
    phone.fault("ifconfig", "missing")
    phone.fault("ifconfig", "missing")
    phone.fault("ifconfig", "clear")
    assert phone.run("ifconfig").returncode == 0


@pytest.mark.parametrize("content", [b"", b"one\ntwo", bytes(range(256)) * 3, b"x" * 5_000_000],
                         ids=["nothing", "lines", "binary", "megabytes"])
def test_prints_something_else(phone, place, content):
    (place / "bytes").write_bytes(content)
    phone.fault("wl", "print", place / "bytes")
    result = phone.run("wl", "counters", text=False)
    assert (result.returncode, result.stderr) == (0, b"")
    assert result.stdout == content
    phone.fault("wl", "print", place / "bytes", "exit", 5)
    result = phone.run("wl", "counters", text=False)
    assert (result.returncode, result.stdout) == (5, content)


def test_only_calls_that_match_fail(phone):
    phone.output("ifconfig wlan0 up")
    phone.fault("wl", "--when", "mpc *", "exit", 7)
    assert phone.run("wl", "mpc", "0").returncode == 7
    assert phone.run("wl", "mpc").returncode == 0
    assert phone.run("wl", "phy_watchdog", "0").returncode == 0


def test_the_first_group_that_matches_counts(phone, place):
    for text in ("one", "two"):
        (place / text).write_text(text)
    phone.fault("wl", "--when", "up", "signal", 9, "--when", "mpc ?", "print", place / "one",
                "--when", "mpc*", "print", place / "two", "exit", 8, "--when", "*", "exit", 0)
    assert phone.run("wl", "up").returncode == 137
    for call, answer in (("mpc 0", (0, "one")), ("mpc", (8, "two")), ("down", (0, ""))):
        result = phone.run("wl", *call.split())
        assert (result.returncode, result.stdout) == answer, call
    phone.fault("wl", "exit", 6, "--when", "*", "exit", 7)  # what stands before a group is for all
    assert phone.run("wl", "up").returncode == 6
    phone.fault("wl", "clear")
    assert os.listdir(phone.root / "phone/faults") == []


def test_a_slow_tool_does_its_work_in_the_end(phone):
    phone.output("ifconfig wlan0 up")
    phone.fault("wl", "sleep", "0.01")
    assert phone.output("wl mpc") == "1"


def test_a_waiting_tool_goes_on_when_released(phone):
    phone.output("ifconfig wlan0 up")
    phone.fault("wl", "wait")
    waiting = phone.root / "phone/faults/wl.waiting"
    call = phone.start("wl mpc", stdout=subprocess.PIPE)
    wait_for(lambda: waiting.exists() and waiting.read_text().count("\n") == 1)
    assert call.poll() is None
    phone.fault("wl", "release")
    assert call.communicate(timeout=60)[0] == b"1\n"


def test_clear_lets_waiting_tools_go_on(phone):
    phone.fault("sleep", "wait", "exit", 6)
    call = phone.start("sleep 1000; exit $?")
    wait_for((phone.root / "phone/faults/sleep.waiting").exists)
    phone.fault("sleep", "clear")
    assert call.wait(60) == 6


@pytest.mark.parametrize("actions", [
    ("explode",), ("exit",), ("exit", "256"), ("exit", "x"), ("exit", "-1"), ("exit", "1" * 5000),
    ("signal", "0"), ("signal", "65"), ("sleep", "-1"), ("sleep", "long"), ("print", "/nonesuch"), ("print", "/tmp"),
    ("clear", "now"), ("missing", "exit", "3")])
def test_a_bad_action_changes_nothing(phone, actions):
    phone.fault("wl", "exit", 3)
    result = phone.launcher("fault", phone.folder, "wl", *actions)
    assert result.returncode == 1
    assert result.stderr.startswith("phone: fault wl: ") and result.stderr.count("\n") == 1
    assert phone.run("wl").returncode == 3


@pytest.mark.parametrize("staged", [("exit", 3), ("missing",), ("--when", "up", "exit", 3)])
def test_a_fault_that_finds_no_room_changes_nothing(phone, place, staged):
    """A limit on the size of files, as this user has no full disk."""
    (place / "bytes").write_bytes(b"x" * 100_000)
    phone.fault("wl", *staged)
    before = sorted(os.listdir(phone.root / "phone/faults")), phone.run("wl", "up").returncode
    limited = Launcher(phone.launcher.line[-1], phone.launcher.kind, phone.launcher.user)
    limited.line = ["prlimit", "--fsize=50000", *limited.line]
    result = limited("fault", phone.folder, "wl", "wait", "print", place / "bytes", "exit", 4)
    assert (result.returncode, result.stderr) \
        == (1, f"phone: {phone.root}/phone/faults/wl: File too large\n")
    assert before == (sorted(os.listdir(phone.root / "phone/faults")),
                      phone.run("wl", "up").returncode)


def test_a_pattern_may_hold_any_bytes(phone):
    phone.fault("wl", "--when", b"\xff*".decode(errors="surrogateescape"), "exit", 5)
    assert phone.shell("wl $'\\xff'; echo $?; wl up; echo $?").stdout == "5\n1\n"


@pytest.mark.parametrize("tool", ["nonesuch", "", "../wl", "ls", "sh"])
def test_what_is_no_tool_is_refused(phone, tool):
    result = phone.launcher("fault", phone.folder, tool, "exit", 1)
    assert result.returncode == 1
    assert result.stderr \
        == f"phone: '{tool}' is no tool of this phone that faults can be staged for\n"
