# Copyright 2026 The BEX Wi-Fi Authors
# SPDX-License-Identifier: Apache-2.0
"""Signals: those of the terminal reach what runs inside; none gets out, and the caller's own
processes are left alone."""

import contextlib
import fcntl
import os
import pathlib
import re
import pty
import select
import signal
import subprocess
import termios

import pytest

from conftest import ENDLESS
from support.processes import children
from support.waiting import wait_for

WORDS = "the caller lives"


def script(phone, text, *command):
    """Runs a shell script on this machine, as the phone's user, in a session of its own. Its
    arguments are the command that runs something in the phone."""
    launcher = phone.launcher
    *user, program = launcher.line
    return subprocess.run([*user, "bash", "-c", text, "bash", program, "run", phone.folder, *command],
                          capture_output=True, text=True, check=False, env=launcher.environment,
                          timeout=60, start_new_session=True)


@pytest.mark.parametrize("line", ["kill -9 0", "busybox setsid sh -c 'kill -9 0'; kill -9 0"])
def test_a_signal_to_the_group_stays_inside(any_new_phone, line):
    result = script(any_new_phone, f'"$@"; echo $? {WORDS}', "sh", "-c", line)
    assert (result.returncode, result.stdout) == (0, f"137 {WORDS}\n")


def test_a_service_that_kills_its_group_leaves_the_keeper_to_clean_up(any_phone):
    any_phone.do("up")
    keeper = int((any_phone.folder / "pid").read_text())
    any_phone.run("/data/ask", "kill -9 0")
    wait_for(lambda: not pathlib.Path(f"/proc/{keeper}").exists())
    assert any_phone.processes() == []
    assert not any_phone.borrowed_folder().exists()  # a killed keeper would have left it
    any_phone.do("up")
    assert any_phone.run("/data/ask", "echo again").stdout == "same again\n"


def test_the_children_of_the_caller_are_left_alone(any_new_phone):
    """After exec the launcher has the children of the shell that it was."""
    result = script(any_new_phone, 'sleep 1000 >&- 2>&- & echo $!; exec "$@"', "true")
    child = int(result.stdout)
    try:
        assert "sleep" in pathlib.Path(f"/proc/{child}/cmdline").read_text()
    finally:
        os.kill(child, signal.SIGKILL)


@pytest.mark.parametrize("name", ["CHLD", "INT TERM HUP QUIT PIPE USR1"])
def test_what_the_caller_ignores_is_not_ignored_inside(any_new_phone, name):
    line = "busybox sleep 0; (exit 3); echo $?; exec busybox sh -c 'kill -PIPE $$; echo deaf'"
    result = script(any_new_phone, f"trap '' {name}; exec \"$@\"", "sh", "-c", line)
    assert (result.returncode, result.stdout) == (141, "3\n")


@contextlib.contextmanager
def at_terminal(phone, line):
    """A phone run whose standard streams are a terminal of its own: the launcher, and the other end
    of the terminal."""
    outer, inner = pty.openpty()
    attributes = termios.tcgetattr(inner)
    attributes[3] &= ~termios.ECHO
    termios.tcsetattr(inner, termios.TCSANOW, attributes)

    def take_terminal():
        os.setsid()
        fcntl.ioctl(inner, termios.TIOCSCTTY, 0)

    try:
        yield phone.start(line, stdin=inner, stdout=inner, stderr=inner,
                          preexec_fn=take_terminal), outer
    finally:
        os.close(inner)
        os.close(outer)


def await_word(terminal, word):
    """Reads until the word has come: mksh tells of the signals of its children, too."""
    text = b""
    while word not in text.decode().split():
        assert select.select([terminal], [], [], 60)[0], text
        text += os.read(terminal, 100)


def stat(process):
    """Fields of /proc/PID/stat: state, parent, group, session, terminal."""
    return pathlib.Path(f"/proc/{process}/stat").read_text().rsplit(") ", 1)[1].split()[:5]


def test_what_runs_inside_has_no_terminal_to_type_into(any_new_phone):
    with at_terminal(any_new_phone, f"exec sleep {ENDLESS}") as (launcher, _):
        wait_for(any_new_phone.sleepers)
        for process in any_new_phone.sleepers():
            _, _, group, session, terminal = stat(process)
            assert terminal == "0"
            assert str(launcher.pid) not in (group, session)


@pytest.mark.parametrize("end", ["exit 0", "kill -9 0", "read word"])
def test_the_terminal_is_left_as_it_was(any_new_phone, end):
    with at_terminal(any_new_phone, f"busybox stty raw; echo ready; {end}") as (launcher, terminal):
        await_word(terminal, "ready")
        if end.startswith("read"):
            launcher.terminate()
        launcher.wait(60)
        assert termios.tcgetattr(terminal)[3] & termios.ICANON


@pytest.mark.parametrize("name, key", [("INT", b"\x03"), ("QUIT", b"\x1c")])
def test_a_key_reaches_the_command(any_new_phone, name, key):
    if name == "QUIT" and any_new_phone.launcher.kind == "proot":
        return  # proot ends on it
    line = f"trap 'echo caught; exit 7' {name}; echo ready; busybox sleep {ENDLESS}"
    with at_terminal(any_new_phone, line) as (launcher, terminal):
        await_word(terminal, "ready")
        wait_for(any_new_phone.sleepers)
        os.write(terminal, key)
        await_word(terminal, "caught")
        assert launcher.wait(60) == 7


def test_a_command_that_ignores_the_key_goes_on(any_new_phone):
    with at_terminal(any_new_phone, "trap '' INT; echo ready; read word; echo $word; exit 4") \
            as (launcher, terminal):
        await_word(terminal, "ready")
        os.write(terminal, b"\x03")
        os.write(terminal, b"alive\n")
        await_word(terminal, "alive")
        assert launcher.wait(60) == 4


def pending(pid, number):
    """Whether a signal waits for a process."""
    status = pathlib.Path(f"/proc/{pid}/status").read_text()
    return int(re.search(r"^ShdPnd:\s*(\w+)", status, re.M)[1], 16) >> number - 1 & 1


def test_a_key_after_the_command_has_ended_changes_nothing(any_new_phone):
    with at_terminal(any_new_phone, "echo ready; read word; exit 4") as (launcher, terminal):
        await_word(terminal, "ready")
        holder, = children(launcher.pid)
        sandbox, = children(holder)
        os.kill(holder, signal.SIGSTOP)
        wait_for(lambda: stat(holder)[0] == "T")  # a signal that comes earlier is not left pending
        os.write(terminal, b"over\n")
        wait_for(lambda: stat(sandbox)[0] == "Z")
        os.write(terminal, b"\x03")
        wait_for(lambda: pending(holder, signal.SIGINT))
        os.kill(holder, signal.SIGCONT)
        assert launcher.wait(60) == 4


def test_a_command_stops_and_goes_on_with_its_launcher(any_new_phone):
    with at_terminal(any_new_phone, f"sleep {ENDLESS}; echo over") as (launcher, terminal):
        wait_for(any_new_phone.sleepers)
        sleeper = any_new_phone.sleepers()[0]
        os.write(terminal, b"\x1a")
        wait_for(lambda: stat(launcher.pid)[0] == "T" and stat(sleeper)[0] in "Tt")
        os.kill(launcher.pid, signal.SIGCONT)
        wait_for(lambda: stat(launcher.pid)[0] == "S" and stat(sleeper)[0] == "S")
        os.kill(sleeper, signal.SIGKILL)
        await_word(terminal, "over")
        assert launcher.wait(60) == 0


@pytest.mark.parametrize("number", [signal.SIGHUP, signal.SIGTERM])
def test_ending_the_launcher_ends_what_will_not_end(any_new_phone, number):
    call = any_new_phone.start(f"trap '' TERM HUP INT; sleep {ENDLESS}; exec sleep {ENDLESS}")
    wait_for(any_new_phone.sleepers)
    call.send_signal(number)
    assert call.wait(60) == 128 + number
    assert any_new_phone.processes() == []
