# Copyright 2026 The BEX Wi-Fi Authors
# SPDX-License-Identifier: Apache-2.0
"""What client/README.md says about calls over adb, tried with the real adb."""

import contextlib
import json
import re
import shlex
import subprocess

import pytest

from support.adb import TIMEOUT, Running, held, processes_of
from support.phone import ROOT
from support.waiting import wait_for

CLIENT = "bex-wifi-client"
README = (ROOT / "client/README.md").read_text(encoding="utf-8")


def block_with(text):
    """The README's shell lines that hold the text."""
    blocks = re.findall(r"^ *```sh\n(.*?)^ *```$", README, re.MULTILINE | re.DOTALL)
    return next(block for block in blocks if text in block)


def run_block(phone, block, folder):
    return Running(["bash", "-c", block], cwd=folder, stdout=subprocess.PIPE,
                   stderr=subprocess.PIPE,
                   env={**phone.adb.environment, "SERIAL": phone.serial})


def finish(process):
    with process:
        out, err = process.communicate(timeout=TIMEOUT)
    return process.returncode, out, err


@pytest.fixture(name="hold")
def hold_fixture(phone):
    """Holds a tool of the phone until the test lets it go, or ends."""
    with contextlib.ExitStack() as ends:
        yield lambda tool: ends.enter_context(held(phone, tool))


@pytest.mark.parametrize("name", ["my lab", "it's \"5 GHz\"", "$HOME `id` \\ *", ""])
def test_arguments_quoted_twice_arrive_as_they_are(phone, name):
    _, out, _ = phone.shell(CLIENT, "--json", "RunRxApJoinHoc", "--", shlex.quote(name), "10.0.0.2")
    assert list(json.loads(out)["arguments"].values()) == [name, "10.0.0.2"]


def test_arguments_quoted_once_fall_apart(phone):
    code, out, err = phone.shell(CLIENT, "RunRxApJoinHoc", "my lab", "10.0.0.2")
    assert (code, out) == (2, b"")
    assert len(err.splitlines()) == 1


def test_the_line_with_two_quotes(phone, tmp_path):
    line = block_with("my lab").replace(CLIENT, f"{CLIENT} --json")
    _, out, _ = finish(run_block(phone, line, tmp_path))
    assert list(json.loads(out)["arguments"].values()) == ["my lab", "10.0.0.2"]


def test_a_loop_reads_all_its_lines(phone, tmp_path):
    (tmp_path / "channels").write_text("1\n6\n11\n")
    loop = block_with("while read").replace(CLIENT, f"{CLIENT} --json")
    _, out, _ = finish(run_block(phone, loop, tmp_path))
    answers = [json.loads(line) for line in out.splitlines()]
    assert [answer["arguments"]["channel"] for answer in answers] == ["1", "6", "11"]


@pytest.mark.parametrize("call, code, out", [
    ("isSnifferMode", 0, b"false\n"), ("RunTxStop", 2, b""), ("nonesuch", 2, b"")])
def test_exit_codes_and_streams_arrive(phone, call, code, out):
    done = phone.shell(CLIENT, call)
    assert done[:2] == (code, out)
    assert len(done[2].splitlines()) == (0 if code == 0 else 1)


def test_the_exit_code_of_a_failed_command(phone):
    phone.fault("wl", "exit", "1")
    try:
        code, out, err = phone.shell(CLIENT, "RunTxStop", "6")
    finally:
        phone.fault("wl", "clear")
    assert (code, out) == (1, b"-1\n")
    assert len(err.splitlines()) == 1


def test_the_exit_code_of_a_deadline(phone, hold):
    _, release = hold("cat")
    code, out, err = phone.shell(CLIENT, "--timeout", "0.5", "isSnifferMode")
    assert (code, out) == (5, b"")
    assert len(err.splitlines()) == 1
    release()
    assert phone.shell(CLIENT, "--timeout", str(TIMEOUT), "isSnifferMode") == (0, b"false\n", b"")


def test_only_a_terminal_shows_how_long_a_call_takes(phone, hold):
    wait_until_waiting, release = hold("cat")
    line = ("-s", phone.serial, "shell")
    with phone.adb.start(*line, CLIENT, "isSnifferMode", stdin=subprocess.DEVNULL,
                         stdout=subprocess.PIPE, stderr=subprocess.PIPE) as piped:
        wait_until_waiting()
        with phone.adb.start(*line, "-tt", CLIENT, "isSnifferMode", stdin=subprocess.DEVNULL,
                             stdout=subprocess.PIPE) as shown:
            progress = b"\risSnifferMode: "  # comes when it has taken longer than a second
            assert shown.stdout.read(len(progress)) == progress
            release()
            assert shown.communicate(timeout=TIMEOUT)[0].endswith(b"false\r\n")
        assert finish(piped) == (0, b"false\n", b"")


def test_the_lock_keeps_calls_apart_and_passes_the_exit_code_on(phone, hold, tmp_path):
    lock = block_with("flock").replace("/tmp/", f"{shlex.quote(str(tmp_path))}/")
    wait_until_waiting, release = hold("wl")
    since = phone.log.stat().st_size
    with run_block(phone, lock, tmp_path) as one, run_block(phone, lock, tmp_path) as other:
        wait_until_waiting()
        busy = subprocess.run(["flock", "-n", next(tmp_path.glob("*.lock")), "true"], check=False,
                              timeout=TIMEOUT)
        assert busy.returncode == 1
        release()
        assert [finish(call)[:2] for call in (one, other)] == [(1, b"-1\n")] * 2  # nothing transmits
    lines = phone.explain("RunTxStop", "6")
    assert len(lines) > 1
    assert [line for line, _ in phone.commands(since)] == lines * 2


@pytest.mark.parametrize("end", ["kill", "disconnect"])
def test_a_call_goes_on_when_adb_ends(phone, hold, end):
    wait_until_waiting, release = hold("wl")
    since = phone.log.stat().st_size
    with phone.adb.start("-s", phone.serial, "shell", CLIENT, "RunTxStop", "6",
                         stdin=subprocess.DEVNULL, stdout=subprocess.PIPE) as adb:
        wait_until_waiting()
        if end == "kill":
            adb.kill()
        else:
            phone.forget()
        assert adb.stdout.read() == b""
        wait_for(lambda: processes_of(phone) == [])
        assert adb.wait(TIMEOUT) == (-9 if end == "kill" else 0)
    if end == "disconnect":
        wait_for(phone.connects)
    release()
    lines = phone.explain("RunTxStop", "6")
    wait_for(lambda: [line for line, _ in phone.commands(since)] == lines)
