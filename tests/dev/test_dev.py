# Copyright 2026 The BEX Wi-Fi Authors
# SPDX-License-Identifier: Apache-2.0
"""The entry script, as a developer uses it. Its phones live in a folder of the test's own."""

import os
import pathlib
import re
import signal
import subprocess

import pytest

from support.adb import adb_fixture  # noqa: F401  (pytest finds the fixture here)

ROOT = pathlib.Path(__file__).resolve().parents[2]


@pytest.fixture(name="phones")
def folder_of_phones(tmp_path):
    return tmp_path / "phones"


@pytest.fixture(name="dev")
def dev_command(phones):
    def run(*arguments):
        return subprocess.run(
            [ROOT / "dev", *arguments], capture_output=True, text=True, check=False, timeout=300,
            stdin=subprocess.DEVNULL, env={**os.environ, "BEX_PHONES": str(phones)}, cwd="/")

    return run


def processes_of(phones):
    """The processes that have the folder in their command line."""
    found = []
    for entry in pathlib.Path("/proc").glob("[0-9]*/cmdline"):
        try:
            if str(phones).encode() in entry.read_bytes():
                found.append(entry)
        except OSError:
            pass  # it has ended
    return found


def test_explain_prints_just_the_lines(dev, phones):
    explained = dev("explain", "broadcom", "RunTxStop", "6")
    assert explained.returncode == 0
    assert explained.stderr == ""
    assert explained.stdout == (
        '"wl pkteng_stop tx "\n'
        '"ifconfig wlan0 down "\n'
        '"echo -n "/etc/firmware/fw_bcmdhd.bin" > /sys/module/bcmdhd/parameters/firmware_path "\n')
    assert list(phones.iterdir()) == []


def test_explain_without_a_method_names_them(dev):
    named = dev("explain", "broadcom")
    assert (named.returncode, named.stderr) == (0, "")
    assert "  RunTxBGStart channel rate power antenna\n" in named.stdout
    assert "  snifferStop\n" in named.stdout


def test_demo(dev, phones):
    """A reception's count is read by the real pipeline, and nothing is left behind."""
    demo = dev("demo", "broadcom")
    assert demo.returncode == 0, demo.stderr
    assert '  "wl 2g_rate -r 54 -b 20 " -> ok\n' in demo.stdout
    stop = demo.stdout[demo.stdout.index("$ bex-wifi-client RunRxStop 6"):]
    count = re.search(r"printed: (\d+)\n", stop)[1]
    assert int(count) > 0
    assert f"  result: {count}\n" in stop
    assert list(phones.iterdir()) == []
    assert processes_of(phones) == []


def test_demo_tells_why_modules_are_refused(dev):
    demo = dev("demo", "wcn685x")
    assert demo.returncode == 0, demo.stderr
    refused = [line for line in demo.stdout.splitlines() if "-> FAILED" in line]
    assert len(refused) == 12
    for line in refused:
        assert re.fullmatch(r'  "(/vendor/bin/)?insmod .*" -> FAILED, as it should: .*', line)
    assert "\n12 lines FAILED as they should: this phone's image has modules for" in demo.stdout


def test_a_demo_until_ctrl_c(phones):
    with subprocess.Popen(
            [ROOT / "dev", "demo", "broadcom"], stdout=subprocess.PIPE, stderr=subprocess.PIPE,
            text=True, env={**os.environ, "BEX_PHONES": str(phones)},
            start_new_session=True) as demo:
        assert demo.stdout.readline().startswith("The simulated broadcom phone is up")
        os.killpg(demo.pid, signal.SIGINT)
        complaints = demo.communicate(timeout=60)[1]
        assert demo.returncode == 130
    assert "Traceback" not in complaints
    assert list(phones.iterdir()) == []
    assert processes_of(phones) == []


def test_a_phone_until_ctrl_c(dev, phones):
    # An interactive shell's job: in a group of its own, and Ctrl-C is not ignored.
    with subprocess.Popen(
            [ROOT / "dev", "phone", "wcn6750"], stdout=subprocess.PIPE, text=True,
            env={**os.environ, "BEX_PHONES": str(phones)}, start_new_session=True) as phone:
        assert phone.stdout.readline().startswith("The wcn6750 phone is up")
        second = dev("phone", "broadcom")
        assert (second.returncode, second.stdout) == (1, "")
        assert second.stderr == "dev: a phone is up already: end that one first\n"
        assert dev("client", "isSnifferMode").stdout == "false\n"
        traced = dev("client", "--trace", "RunTxStop", "6")
        assert (traced.returncode, traced.stdout) == (0, "0\n")
        assert '  "rmmod wlan.ko " -> ok\n' in traced.stderr
        assert dev("client", "--trace", "RunTxStop").returncode == 2
        assert 'cmd: "rmmod wlan.ko " successful execution' in dev("log").stdout
        wrong = dev("client", "RunTxStop")
        assert (wrong.returncode, wrong.stdout) == (2, "")
        os.killpg(phone.pid, signal.SIGINT)
        assert phone.wait(60) == 130
    assert [path.name for path in phones.iterdir()] == ["owner"]
    assert processes_of(phones) == []
    gone = dev("client", "isSnifferMode")
    assert (gone.returncode, gone.stderr) == (
        3, "dev: no phone is up: start one with ./dev phone CHIP\n")


def test_several_phones_on_adb(phones, adb):
    chips = ["broadcom", "wcn6750", "broadcom"]
    with subprocess.Popen(
            [ROOT / "dev", "phone", *chips], stdout=subprocess.PIPE, text=True,
            env={**os.environ, "BEX_PHONES": str(phones)}, start_new_session=True) as run:
        for number, chip in enumerate(chips):
            connect = re.fullmatch(rf"The {chip} phone is up: adb (connect (\S+))\n",
                                   run.stdout.readline())
            folder = phones / f"up{number + 1 if number else ''}"
            assert run.stdout.readline() \
                == f"    serial number {connect[2]}, log {folder}/log\n"
            assert adb(*connect[1].split()).stdout == f"connected to {connect[2]}\n".encode()
            assert adb("-s", connect[2], "shell", "bex-wifi-client isSnifferMode").stdout == b"false\n"
            assert f"{connect[2]} ".encode() in adb("devices", "-l").stdout
        assert "./dev client" in run.stdout.readline()
        os.killpg(run.pid, signal.SIGINT)
        run.wait(60)
    assert list(phones.glob("up*")) == []
    assert processes_of(phones) == []


def test_a_short_soak(dev, phones):
    soak = dev("soak", "0.1", "7")
    assert soak.returncode == 0, soak.stdout + soak.stderr
    lines = soak.stdout.splitlines()
    assert lines[0] == "soak: 0.1 minutes, seed 7"
    heads = re.split(" {2,}", lines[1].strip())
    totals = dict(zip(heads, map(int, lines[-1].split()[1:])))
    assert totals["calls"] == totals["answered"] + totals["cut off"] > 0
    assert totals["wrong"] == totals["lost"] == totals["grown"] == 0
    assert list(phones.iterdir()) == []
    assert processes_of(phones) == []


def test_a_soak_until_ctrl_c(phones):
    with subprocess.Popen(
            [ROOT / "dev", "soak"], stdout=subprocess.PIPE, text=True,
            env={**os.environ, "BEX_PHONES": str(phones)}, start_new_session=True) as soak:
        assert soak.stdout.readline().startswith("soak: 60 minutes, seed ")
        soak.stdout.readline()  # the heads of the columns: the first calls are on their way
        os.killpg(soak.pid, signal.SIGINT)
        rest = soak.stdout.read()
        assert soak.wait(60) == 0
    assert rest.startswith("\nsoak: broken off\n")
    assert rest.splitlines()[-1].split()[0] == "all"
    assert list(phones.iterdir()) == []
    assert processes_of(phones) == []


@pytest.mark.parametrize("arguments, message", [
    (["phone"], "dev: which chip? One of: broadcom"),
    (["phone", "broadcom", "acme"], "dev: no phone for the chip 'acme': there is broadcom"),
    (["demo", "acme"], "dev: no phone for the chip 'acme': there is broadcom"),
    (["explain", "broadcom", "RunTxStop"], "explain: RunTxStop takes 1 argument"),
    (["explain", "broadcom", "runtxstop", "6"], "explain: unknown method"),
    (["test", "--arch"], "dev: which architecture? There is --arch arm64"),
    (["test", "--arch", "mips"], "dev: which architecture? There is --arch arm64"),
    (["soak", "soon"], "dev: MINUTES is a number like 60 or 0.5, not 'soon'"),
    (["soak", "1", "x"], "dev: SEED is a number, not 'x'"),
    (["demo", "broadcom", "extra"], "dev: too many arguments: 'extra'"),
    (["check", "--fast"], "dev: too many arguments: '--fast'"),
    (["test", "--sanitize=memory"], "dev: --sanitize takes address or thread"),
    (["test", "--arch="], "dev: which architecture? There is --arch arm64"),
    (["test", "--frob"], "dev: test takes no '--frob'"),
    (["test", "load"], "dev: test takes no 'load'"),
    (["test", "-R"], "dev: -R takes a value"),
    (["help", "start"], "dev: there is no command 'start'"),
    (["soak", "1", "2", "3"], "dev: soak takes MINUTES and SEED at most"),
    (["fuzz", "acme"], "dev: no fuzz target 'acme': there is framing"),
    (["fuzz", "../corpus/tools"], "dev: no fuzz target '../corpus/tools'"),
    (["fuzz", "framing operations"], "dev: no fuzz target 'framing operations'"),
    (["fuzz", ""], "dev: no fuzz target ''"),
    (["fuzz", "tools", "soon"], "dev: 'soon' is no number of seconds"),
    (["fuzz", "tools", "0"], "dev: '0' is no number of seconds"),
    (["fuzz", "tools", "1", "2"], "dev: fuzz takes a target and"),
    (["test", "--sanitize", "memory"], "dev: --sanitize takes address or thread"),
    (["test", "--sanitize"], "dev: --sanitize takes address or thread"),
    (["start"], "dev: there is no command 'start': see ./dev help"),
])
def test_wrong_usage_is_one_line(dev, arguments, message):
    wrong = dev(*arguments)
    assert wrong.returncode == 2
    assert wrong.stdout == ""
    assert wrong.stderr.startswith(message)
    assert len(wrong.stderr.splitlines()) == 1


@pytest.mark.parametrize("arguments", [["check", "--help"], ["help", "check"], ["check", "-h"]])
def test_help_of_one_command_is_all_that_happens(dev, arguments):
    told = dev(*arguments)
    assert (told.returncode, told.stderr) == (0, "")
    assert told.stdout.startswith("./dev check ")
    assert "./dev demo" not in told.stdout


def test_the_clients_help_needs_no_phone(dev):
    told = dev("client", "--help")
    assert told.returncode == 0
    assert "RunTxBGStart" in told.stdout


def test_what_a_killed_run_left_goes_with_the_next(dev, phones):
    # No process has so high a number.
    for name in ("demo-99999999", ".demo-99999999.x1y2"):
        (phones / name).mkdir(parents=True)
    assert dev("explain", "broadcom", "RunTxStop", "6").returncode == 0
    assert list(phones.iterdir()) == []


def test_help_names_the_chips(dev):
    usage = dev("help")
    assert usage.returncode == 0
    for chip in (ROOT / "simulator/phones").iterdir():
        assert chip.name in usage.stdout.splitlines()[-1]
