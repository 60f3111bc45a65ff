# Copyright 2026 The BEX Wi-Fi Authors
# SPDX-License-Identifier: Apache-2.0
"""The example plan, interrupted at moments that are spread over it, and with a connection or a service that is
lost in the middle: it is told, the radios are off, and the phones go on.

BEX_STATION_SIGNALS says how many moments of the whole plan, BEX_STATION_CHIPS which phones run it at once.
Without them it is a part of the plan, since every test of the project runs it.
"""

import contextlib
import fcntl
import os
import pathlib
import signal
import subprocess
import sys
import xml.etree.ElementTree as ET

import pytest

from support.adb import processes_of
from support.phone import ROOT
from support.radio import radio_use
from support.waiting import wait_during, wait_for

PART = [] if "BEX_STATION_SIGNALS" in os.environ else ["-k", "802.11b or 802.11n or monitor"]
SIGNALS = int(os.environ.get("BEX_STATION_SIGNALS", "3"))
CHIPS = os.environ.get("BEX_STATION_CHIPS", "broadcom qca639x").split()
PLAN = ROOT / "station/example/plan.py"
TIMEOUT = 600
INTERRUPTED = 2  # pytest's exit code


@contextlib.contextmanager
def plan(phones, folder, *arguments):
    """Runs the plan on phones, as an interactive shell does: in a process group of its own."""
    with open(folder / "out", "wb") as out:
        run = subprocess.Popen(
            [sys.executable, "-B", "-u", "-m", "pytest", "-p", "bexwifi_pytest", "-p", "no:cacheprovider", PLAN,
             f"--wifi-report={folder}", *(f"--wifi-phone={phone.serial}" for phone in phones), *arguments],
            env={**os.environ, "PYTHONPATH": str(ROOT / "station"), "PYTEST_ADDOPTS": ""},
            stdin=subprocess.DEVNULL, stdout=out, stderr=out, start_new_session=True,
            # Whoever started this test in the background had it ignore SIGINT.
            preexec_fn=lambda: signal.signal(signal.SIGINT, signal.SIG_DFL))
    try:
        yield run
    finally:
        if run.poll() is None:
            os.killpg(run.pid, signal.SIGKILL)
        run.wait()


def processes_with(words):
    """The command lines of the processes that have the words."""
    found = []
    for entry in pathlib.Path("/proc").glob("[0-9]*/cmdline"):
        with contextlib.suppress(OSError):
            line = os.fsdecode(entry.read_bytes()).replace("\0", " ")
            if words in line:
                found.append(line)
    return found


def group_exists(run):
    try:
        os.killpg(run.pid, 0)
    except ProcessLookupError:
        return False
    return True


def leaves_nothing(run, phones):
    """Asserts that the run has switched everything off, and that nothing of it is left."""
    assert [radio_use(phone) for phone in phones] == ["idle"] * len(phones)
    wait_for(lambda: not group_exists(run))
    for phone in phones:
        wait_for(lambda phone=phone: processes_of(phone) == [])
        wait_for(lambda phone=phone: processes_with(f"-s {phone.serial} ") == [])
        with open(f"/tmp/bex-{phone.serial}.lock", "a+", encoding="utf-8") as lock:
            fcntl.flock(lock, fcntl.LOCK_EX | fcntl.LOCK_NB)
            lock.seek(0)
            # At most one of the plan's calls that start nothing, whose end nobody has waited for.
            assert lock.read() in ("", "isMimoSupport", "getWlanMode", "isSnifferMode")


def command_lines(phone):
    return phone.log.read_bytes().count(b"cmd: ")


def output(folder):
    return (folder / "out").read_text(encoding="utf-8", errors="replace")


@pytest.fixture(name="whole_run", scope="module")
def whole_run_fixture(phone_of, tmp_path_factory):
    """How many command lines the plan runs on each phone."""
    folder = tmp_path_factory.mktemp("whole")
    phones = [phone_of(chip) for chip in CHIPS]
    before = [command_lines(phone) for phone in phones]
    with plan(phones, folder, f"-n{len(phones)}", *PART) as run:
        assert run.wait(TIMEOUT) == 0, output(folder)
    leaves_nothing(run, phones)
    return {phone: command_lines(phone) - lines for phone, lines in zip(phones, before)}


@pytest.mark.parametrize("moment", range(SIGNALS))
def test_an_interrupt_at_any_moment_leaves_every_radio_off(moment, whole_run, tmp_path):
    phones = list(whole_run)
    watched = phones[moment % len(phones)]
    before = command_lines(watched)
    lines = before + whole_run[watched] * moment // SIGNALS
    with plan(phones, tmp_path, f"-n{len(phones)}", *PART) as run:
        wait_during(run, lambda: command_lines(watched) >= lines and "session starts" in output(tmp_path))
        # As Ctrl-C at a terminal does; or as somebody else's kill.
        with contextlib.suppress(ProcessLookupError):
            (os.killpg if moment % 2 else os.kill)(run.pid, signal.SIGINT)
        code = run.wait(TIMEOUT)
    # On a busy machine the plan may be over before this test sees that a later moment has come.
    over = moment > 0 and command_lines(watched) - before == whole_run[watched]
    assert code == INTERRUPTED or (code == 0 and over), output(tmp_path)
    assert "MAY BE ON" not in output(tmp_path)
    assert "Traceback" not in output(tmp_path)
    leaves_nothing(run, phones)


@pytest.mark.parametrize("how, told", [
    ("adb's server is killed", "no answer"), ("the connection is cut", "no answer"),
    ("the service is killed", "RunTxBGStart failed in the transport")])
def test_a_loss_in_the_middle_is_told_and_the_next_test_works(how, told, adb, phone_of, tmp_path):
    phone, other = phone_of("broadcom"), phone_of("qca639x")
    losses = {"adb's server is killed": lambda: adb("kill-server"),
              "the connection is cut": phone.forget,
              "the service is killed": lambda: phone.phone("restart-service", phone.folder)}
    # One way is enough to see that other phones do not notice.
    phones = [phone, other] if how == "the service is killed" else [phone]
    waiting = phone.root / "phone/faults/wl.waiting"
    phone.fault("wl", "--when", "pkteng_start*", "wait")
    with plan(phones, tmp_path, f"-n{len(phones)}", "-k", "11b or monitor") as run:
        wait_during(run, waiting.exists)
        losses[how]()
        phone.fault("wl", "clear")
        code = run.wait(TIMEOUT)
    assert code == 1, output(tmp_path)
    failed = {}
    for case in ET.parse(tmp_path / "junit.xml").iter("testcase"):
        failure = case.find("failure")
        failed[case.get("name")] = failure is not None and failure.get("message")
    assert f"phone {phone.serial}: {told}" in failed.pop(f"test_transmission[{phone.serial}-802.11b]")
    assert failed == {
        f"test_monitor_mode[{phone.serial}]": False,
        **({f"test_transmission[{other.serial}-802.11b]": False, f"test_monitor_mode[{other.serial}]": False}
           if other in phones else {})}
    leaves_nothing(run, phones)
