# Copyright 2026 The BEX Wi-Fi Authors
# SPDX-License-Identifier: Apache-2.0
"""The client as a process: its standard streams, exit codes and the way to a service and back.

BEX_WIFI_CLIENT names the program, SERVED_FAKE a service for it. Each test has an empty phone of its
own, in which the service is declared.
"""

import contextlib
import json
import os
import pathlib
import pty
import re
import resource
import signal
import subprocess
import tempfile
import termios

import pytest

from support import output

CLIENT = os.environ["BEX_WIFI_CLIENT"]
SERVED_FAKE = os.environ["SERVED_FAKE"]
# The channels on which it does so.
DIE, HANG = "13", "14"

MANIFEST = """<manifest version="1.0" type="device">
    <hal format="hidl">
        <name>vendor.korvan.bex.wifi</name>
        <transport>hwbinder</transport>
        <version>1.0</version>
        <interface><name>IWifiService</name><instance>default</instance></interface>
    </hal>
</manifest>
"""


@pytest.fixture(autouse=True)
def phone(monkeypatch):
    # pytest's own folders have names too long for a socket's path.
    with tempfile.TemporaryDirectory() as folder:
        root = pathlib.Path(folder)
        (root / "dev/socket").mkdir(parents=True)
        (root / "vendor/etc/vintf").mkdir(parents=True)
        (root / "vendor/etc/vintf/manifest.xml").write_text(MANIFEST)
        # The most that the platform can log.
        (root / "vendor/build.prop").write_text("log.tag=V\n")
        monkeypatch.setenv("HIDL_HOST_ROOT", folder)
        yield root


@pytest.fixture
def service(phone):
    with subprocess.Popen([SERVED_FAKE], stdout=subprocess.PIPE) as process:
        assert process.stdout.readline() == b"ready\n"
        yield process
        process.kill()
        assert process.wait() in (0, -9)


def run(*arguments, **options):
    options = {"stdout": subprocess.PIPE, "stderr": subprocess.PIPE, "timeout": 60, **options}
    done = subprocess.run([CLIENT, *arguments], stdin=subprocess.DEVNULL, check=False, **options)
    output.validate(arguments, done.stdout)
    return done


def only_line(done):
    """The one line on stderr, without the program's name."""
    prefix = "bex-wifi-client: "
    lines = done.stderr.decode().splitlines()
    assert len(lines) == 1 and lines[0].startswith(prefix)
    return lines[0][len(prefix):]


def test_the_json_list_is_json():
    done = run("list", "--json")
    assert (done.returncode, done.stderr) == (0, b"")
    methods = json.loads(done.stdout)["methods"]
    assert len(methods) == 16
    assert [argument["name"] for argument in methods[5]["arguments"]] == [
        "channel", "rate", "power", "antenna"
    ]


@pytest.mark.usefixtures("service")
@pytest.mark.parametrize("options", [[], ["--timeout", "20"]])
def test_a_call_goes_there_and_back(options):
    done = run("RunTxStop", "6", *options)
    assert (done.returncode, done.stdout, done.stderr) == (0, b"0\n", b"")


@pytest.mark.usefixtures("service")
def test_the_json_of_a_call_is_json_whatever_the_arguments():
    done = run("--json", "RunTxStop", b"\xff\x01\"\\" + bytes(range(1, 256)) * 400)
    assert (done.returncode, done.stderr, done.stdout.count(b"\n")) == (0, b"", 1)
    assert json.loads(done.stdout)["value"] == 0


def test_without_a_service_it_ends_at_once():
    done = run("RunTxStop", "6")
    assert (done.returncode, done.stdout) == (3, b"")
    assert "is not registered" in only_line(done)


def test_an_undeclared_service_is_not_waited_for(phone):
    (phone / "vendor/etc/vintf/manifest.xml").unlink()
    done = run("RunTxStop", "6", "--timeout", "1000")
    assert (done.returncode, done.stdout) == (3, b"")
    assert "is not registered" in only_line(done)


def test_a_declared_service_is_waited_for_until_the_deadline():
    done = run("RunTxStop", "6", "--timeout", "1.5")
    assert (done.returncode, done.stdout) == (5, b"")
    assert "has not answered in time: it may be busy" in only_line(done)


@pytest.mark.usefixtures("service")
def test_a_service_that_dies_in_the_call_is_a_transport_failure():
    done = run("RunTxStop", DIE)
    assert (done.returncode, done.stdout) == (4, b"")
    assert "RunTxStop failed in the transport" in only_line(done)


@pytest.mark.usefixtures("service")
def test_the_deadline_ends_a_call():
    done = run("RunTxStop", HANG, "--timeout", "2")
    assert (done.returncode, done.stdout) == (5, b"")
    assert "deadline passed in RunTxStop" in only_line(done)


@pytest.mark.parametrize("number", [signal.SIGINT, signal.SIGTERM])
def test_a_signal_ends_a_call(service, number):
    with subprocess.Popen([CLIENT, "RunTxStop", HANG], stdout=subprocess.PIPE,
                          stderr=subprocess.PIPE) as client:
        assert service.stdout.readline() == b"called\n"
        client.send_signal(number)
        out, err = client.communicate(timeout=60)
    assert (client.returncode, out) == (128 + number, b"")
    assert err.startswith(b"bex-wifi-client: RunTxStop was interrupted by ")
    assert err.count(b"\n") == 1


@pytest.mark.usefixtures("service")
@pytest.mark.parametrize("columns, variable", [(10, "40"), (0, "10")], ids=["terminal", "COLUMNS"])
def test_a_narrow_terminal_shows_what_fits(columns, variable):
    """A terminal of no columns is one that does not know its size."""
    screen, terminal = pty.openpty()
    termios.tcsetwinsize(terminal, (24, columns))
    with subprocess.Popen([CLIENT, "RunTxStop", HANG], stdout=subprocess.DEVNULL, stderr=terminal,
                          env={**os.environ, "COLUMNS": variable}) as client:
        os.close(terminal)
        shown = b""
        while b"RunTxStop" not in shown:
            shown += os.read(screen, 100)
        client.send_signal(signal.SIGINT)
        with contextlib.suppress(OSError):  # A terminal's end is an error.
            while more := os.read(screen, 100):
                shown += more
    os.close(screen)
    assert re.fullmatch(rb"(\rRunTxStop)+\r {9}\rbex-wifi-client: .*\r\n", shown)


@pytest.mark.usefixtures("service")
def test_without_a_thread_nothing_is_called():
    # Each thread's stack would be as large as the whole address space; ThreadSanitizer needs a part of
    # that for itself before it begins, so there it is just far larger than any memory.
    size = 1 << (40 if os.environ.get("BEX_SANITIZE") == "thread" else 47)
    limits = (size, resource.getrlimit(resource.RLIMIT_STACK)[1])
    done = run("RunTxStop", "6", "--json",
               preexec_fn=lambda: resource.setrlimit(resource.RLIMIT_STACK, limits))
    assert (done.returncode, json.loads(done.stdout)["exit_code"]) == (4, 4)
    assert only_line(done).startswith("no thread can be started: ")


@pytest.mark.usefixtures("service")
def test_a_full_disk_is_an_error():
    with open("/dev/full", "wb") as full:
        done = run("RunTxStop", "6", stdout=full)
    assert done.returncode == 6
    assert only_line(done) == "cannot write the result to stdout: No space left on device"


def test_a_closed_pipe_is_an_error_and_no_signal():
    reading, writing = os.pipe()
    os.close(reading)
    try:
        done = run("--help", stdout=writing)
    finally:
        os.close(writing)
    assert done.returncode == 6
    assert only_line(done) == "cannot write the result to stdout: Broken pipe"


# Nothing may take the closed stream's place, the connection with the service least of all, which is
# still open after a deadline.
@pytest.mark.usefixtures("service")
def test_a_closed_stdout_is_an_error():
    done = run("RunTxStop", HANG, "--json", "--timeout", "1",
               stdout=None, preexec_fn=lambda: os.close(1))
    assert done.returncode == 6
    assert only_line(done) == "cannot write the result to stdout: Bad file descriptor"


@pytest.mark.usefixtures("service")
def test_closed_streams_do_not_change_the_exit_code():
    done = run("RunTxStop", DIE, stderr=None, preexec_fn=lambda: os.closerange(0, 3))
    assert (done.returncode, done.stdout) == (4, b"")


def test_arguments_that_are_not_utf8_arrive():
    done = run(b"\xff\n")
    assert done.returncode == 2
    assert only_line(done) == 'unknown method "\ufffd\\n"; see bex-wifi-client --help'
