# Copyright 2026 The BEX Wi-Fi Authors
# SPDX-License-Identifier: Apache-2.0
"""adb's own view of a phone, and `adb shell` in all its forms."""

import contextlib
import fcntl
import itertools
import os
import pty
import struct
import subprocess
import termios
import time

import pytest

from support.adb import TIMEOUT, processes_of
from support.waiting import wait_for


class Terminal:
    """A program at a terminal of 33 rows and 77 columns."""

    def __init__(self, phone, *arguments):
        self.master, slave = pty.openpty()
        self.resize(33, 77)
        self.process = phone.adb.start("-s", phone.serial, *arguments, stdin=slave, stdout=slave,
                                       stderr=slave,
                                       preexec_fn=lambda: fcntl.ioctl(0, termios.TIOCSCTTY, 0))
        os.close(slave)
        os.set_blocking(self.master, False)
        self.shown = b""

    def resize(self, rows, columns):
        fcntl.ioctl(self.master, termios.TIOCSWINSZ, struct.pack("4H", rows, columns, 0, 0))

    def type(self, text):
        os.write(self.master, text)

    def wait_for(self, text, meanwhile=lambda: None):
        """Returns when the text is on the screen, and clears the screen."""
        deadline = time.monotonic() + TIMEOUT
        while text not in self.shown:
            assert time.monotonic() < deadline, self.shown
            with contextlib.suppress(BlockingIOError, OSError):
                self.shown += os.read(self.master, 4096)
            meanwhile()
            time.sleep(0.02)
        self.shown = b""

    def end(self):
        self.process.kill()
        self.process.wait()
        os.close(self.master)


@pytest.fixture(name="at_terminal")
def at_terminal_fixture(phone):
    with contextlib.ExitStack() as ends:

        def start(*arguments):
            terminal = Terminal(phone, *arguments)
            ends.callback(terminal.end)
            return terminal

        yield start


def test_adb_knows_the_phone(phone):
    assert phone.do("get-state").stdout == b"device\n"
    lines = phone.do("devices", "-l").stdout.decode().splitlines()
    assert ["device", "product:simulated", "model:broadcom", "device:broadcom"] in [
        line.split()[1:5] for line in lines if line.startswith(f"{phone.serial} ")]


@pytest.mark.parametrize("line, code", [
    ("exit 0", 0), ("exit 255", 255), ("false", 1), ("nonesuch", 127), ("/vendor/build.prop", 126),
    ("kill -9 $$", 137)])
def test_the_exit_code_arrives(phone, line, code):
    assert phone.shell(line)[0] == code


def test_stdout_and_stderr_arrive_apart(phone):
    assert phone.shell("echo out; echo err >&2") == (0, b"out\n", b"err\n")


def test_without_the_second_protocol_there_is_one_stream_and_no_exit_code(phone):
    assert phone.shell("-x", "echo out; echo err >&2; exit 3") == (0, b"out\nerr\n", b"")


def test_the_phone_s_shell_reads_the_arguments_again(phone):
    code, out, _ = phone.shell("echo", "$HOME", "'a  b'", "c  d", ";", "echo", "again")
    assert (code, out) == (0, b"/ a  b c d\nagain\n")


def test_a_command_runs_in_the_phone(phone):
    assert phone.shell("getprop ro.hardware.wlan.vendor")[1] == b"broadcom\n"
    assert phone.shell(f"ls {phone.folder}")[0] != 0


def test_bytes_pass_unchanged_in_both_directions(phone):
    data = os.urandom(3_000_000)
    assert phone.shell("-T", "cat", input=data) == (0, data, b"")
    assert phone.do("exec-out", "head -c 2000000 /dev/zero").stdout == bytes(2_000_000)


def test_a_command_may_leave_its_input_unread(phone):
    assert phone.shell("true", input=bytes(3_000_000))[0] == 0


def test_a_shell_without_a_command_reads_its_input(phone):
    assert phone.shell(input=b"echo one\nread word\ntwo\necho $word >&2; exit 5\n") \
        == (5, b"one\n", b"two\n")


def test_a_closed_input_ends_and_no_input_is_at_its_end(phone):
    assert phone.shell("cat", input=b"text without a newline") == (0, b"text without a newline", b"")
    assert phone.shell("-n", "cat", input=b"unread") == (0, b"", b"")


@pytest.mark.parametrize("options, answer", [((), b"no\n"), (("-T",), b"no\n"), (("-tt",), b"yes\r\n")])
def test_there_is_a_terminal_only_when_asked_for(phone, options, answer):
    line = "if [ -t 1 ]; then echo yes; else echo no; fi"
    assert phone.shell(*options, line) == (0, answer, b"")


def test_a_shell_at_a_terminal(at_terminal):
    """Its size, also when it changes; jobs; Ctrl-C ends the command but not the shell."""
    terminal = at_terminal("shell")
    terminal.wait_for(b"# ")
    terminal.type(b"busybox stty size; echo $TERM\n")
    terminal.wait_for(b"33 77\r\nxterm\r\n")
    terminal.type(b"echo waiting; while [[ $(busybox stty size) = '33 77' ]]; "
                  b"do busybox sleep 0.05; done; echo resized\n")
    terminal.wait_for(b"\nwaiting\r\n")
    # adb misses a change while it is not reading from its terminal.
    sizes = itertools.cycle([34, 35])
    terminal.wait_for(b"resized\r\n", lambda: terminal.resize(next(sizes), 78))
    # Said by the command: only then is Ctrl-C meant for it, and no longer for the shell.
    terminal.type(b"sh -c 'echo before; exec sleep 1000' && echo slept\n")
    terminal.wait_for(b"\nbefore\r\n")
    terminal.type(b"\x03")
    terminal.wait_for(b"# ")
    terminal.type(b"echo still here\n")
    terminal.wait_for(b"\nstill here\r\n")
    terminal.type(b"exit 9\n")
    assert terminal.process.wait(TIMEOUT) == 9


def test_a_command_at_a_terminal(at_terminal):
    terminal = at_terminal("shell", "-t", "[ -t 0 ] && echo ready; read -r word; exit $word")
    terminal.wait_for(b"ready\r\n")
    terminal.type(b"17\n")
    assert terminal.process.wait(TIMEOUT) == 17


@pytest.mark.parametrize("options", [("-T",), ("-tt",), ("-x",)])
def test_a_client_that_is_killed_takes_its_command_along(phone, options):
    line = "trap '' HUP; sleep 1000 & echo started; sleep 1000"
    with phone.adb.start("-s", phone.serial, "shell", *options, line, stdin=subprocess.PIPE,
                         stdout=subprocess.PIPE) as client:
        assert client.stdout.readline().rstrip() == b"started"
        assert len(processes_of(phone)) > 0
        client.kill()
        wait_for(lambda: processes_of(phone) == [])


def test_commands_run_beside_each_other(phone):
    with phone.adb.start("-s", phone.serial, "shell", "read word; echo $word",
                         stdin=subprocess.PIPE, stdout=subprocess.PIPE) as first:
        assert phone.shell("echo second") == (0, b"second\n", b"")
        assert first.communicate(b"first\n", timeout=TIMEOUT)[0] == b"first\n"


def test_a_line_too_long_is_refused(phone):
    code, _, err = phone.shell(input=b"sh -c 'echo " + b"x" * 200_000 + b"'\n")
    assert code != 0
    assert b"too long" in err
