# Copyright 2026 The BEX Wi-Fi Authors
# SPDX-License-Identifier: Apache-2.0
"""The pytest plugin, with phones that are no more than a log."""

import csv
import os
import queue
import signal
import xml.etree.ElementTree as ET
from unittest import mock

import lxml.html
import pytest

import servicelog
from bexwifi_pytest.interrupts import Workers
from bexwifi_pytest.servicelog import RUNNERS
from support.adb import Running
from support.phone import ROOT

pytest_plugins = ["pytester"]
# For a whole run of pytest, in seconds.
TIMEOUT = 300

# Has a log for each phone: "logs/R1".
ADB = """#!/bin/sh
case $4 in logcat*) exec cat "$LOGS/$2" ;; esac
echo "error: device '$2' not found" >&2
exit 1
"""
LINE = "11-22 01:40:03.{:03}  7  8 D wifi@1.0-VendorTestSuit: cmd: \"{}\" successful execution\n"


@pytest.fixture(name="station")
def station_fixture(pytester, monkeypatch):
    """Runs pytest with the plugin on a plan, in a process of its own."""
    for folder in "bin", "logs":
        pytester.mkdir(folder)
    adb = pytester.path / "bin/adb"
    adb.write_text(ADB)
    adb.chmod(0o755)
    monkeypatch.setenv("PATH", f"{adb.parent}:{os.environ['PATH']}")
    monkeypatch.setenv("LOGS", str(pytester.path / "logs"))
    monkeypatch.setenv("PYTHONPATH", str(ROOT / "station"))

    def run(plan, *arguments, phones=("R1", "R2"), before="", report="report"):
        pytester.makepyfile(plan=f"import os, pytest, signal, threading, time\n{plan}")
        for each in phones:
            with open(pytester.path / "logs" / each.replace("/", "_"), "a", encoding="ascii") as log:
                log.writelines(LINE.format(number, "before") for number in range(4))
        return pytester.run(
            "bash", "-c", f'{before} exec "$@"', "bash",
            "/usr/bin/python3", "-B", "-m", "pytest", "-p", "bexwifi_pytest", "-p", "no:cacheprovider",
            "plan.py", f"--wifi-report={report}", *(f"--wifi-phone={each}" for each in phones),
            *arguments, timeout=TIMEOUT)

    run.report = pytester.path / "report"
    return run


def rows(station, *columns):
    """The measurements, as in the order of the table: those of parallel phones come in any order."""
    with open(station.report / "measurements.csv", encoding="utf-8", newline="") as file:
        return sorted(tuple(row[column] for column in columns) for row in csv.DictReader(file))


def outcomes(station):
    """(phone, test, outcome, reason) of each test, from the page."""
    page = lxml.html.parse(str(station.report / "report.html")).getroot()
    return sorted(
        (section.findtext("h2/bdi") or "", *(row[column].text_content().strip() for column in (0, 1, 3)))
        for section in page.iter("section")
        for row in section.xpath(".//table[@class='tests']/tbody/tr"))


def text_of(station, name):
    return (station.report / name).read_text(encoding="utf-8")


SWEEP = """
@pytest.mark.parametrize("channel", [6, 11])
def test_sweep(phone, measure, channel):
    for rate in 6, 54:
        measure("loss", 0.5 * rate, "%", high=20, at={"channel": channel, "rate": rate})
    measure("worker", os.environ.get("PYTEST_XDIST_WORKER", "none"))
    assert threading.current_thread() is threading.main_thread()

def test_serial(phone, measure):
    assert measure("length", len(phone.serial), low=2, high=2)
    measure("worker", os.environ.get("PYTEST_XDIST_WORKER", "none"))
"""


@pytest.mark.parametrize("arguments, workers", [([], 1), (["-n2", "-v", "--dist=load"], 2)])
def test_every_phone_runs_every_test_in_one_worker(station, arguments, workers):
    done = station(SWEEP, *arguments)
    assert done.ret == 1
    done.stdout.fnmatch_lines(["loss at channel=6, rate=54: 27 % is above 20"])
    done.stdout.no_fnmatch_line("* cwd: *")  # xdist has asked, and may leave the main thread
    assert outcomes(station) == [
        (phone, *rest) for phone in ("R1", "R2") for rest in (
            ("plan.py::test_serial", "passed", ""),
            ("plan.py::test_sweep[11]", "failed", "loss at channel=11, rate=54: 27 % is above 20"),
            ("plan.py::test_sweep[6]", "failed", "loss at channel=6, rate=54: 27 % is above 20"))]
    assert [row for row in rows(station, "phone", "at", "value", "verdict") if row[1]] == [
        (phone, *rest) for phone in ("R1", "R2") for rest in (
            ("channel=11, rate=54", "27", "fail"), ("channel=11, rate=6", "3", "pass"),
            ("channel=6, rate=54", "27", "fail"), ("channel=6, rate=6", "3", "pass"))]
    used = {row[:2] for row in rows(station, "phone", "value", "name") if row[2] == "worker"}
    assert len(used) == 2
    assert len({worker for _, worker in used}) == workers


def test_junit_has_the_measurements_as_properties(station):
    station(SWEEP + "    measure('mode', 'b\\0g')", "-n1", phones=["R1"])
    suite = ET.fromstring(text_of(station, "junit.xml")).find("testsuite")
    assert (suite.get("tests"), suite.get("failures"), suite.get("errors")) == ("3", "2", "0")
    cases = {case.get("name"): case for case in suite.iter("testcase")}
    assert set(cases) == {"test_sweep[R1-6]", "test_sweep[R1-11]", "test_serial[R1]"}
    assert [(each.get("name"), each.get("value")) for each in cases["test_serial[R1]"].iter("property")] == [
        ("phone", "R1"), ("length", "2"), ("length.low", "2"), ("length.high", "2"),
        ("length.verdict", "pass"), ("worker", "gw0"), ("mode", "b\\x00g")]
    assert "loss[channel=6, rate=54].unit" in {
        each.get("name") for each in cases["test_sweep[R1-6]"].iter("property")}


def test_a_failure_has_the_command_lines_of_its_test(station):
    done = station("""
def log(phone, line):
    with open(f"{os.environ['LOGS']}/{phone.serial}", "r+") as log:
        lost, *lines = log.readlines()  # the log is full
        log.seek(0)
        log.truncate()
        log.write("".join(lines))
        log.write('11-22 01:40:03.000  7  8 D wifi@1.0-VendorTestSuit: cmd: "' + line + '" ')
        log.write("unsuccessful execution\\n")

def test_other(phone):
    log(phone, "wl of another test")

def test_limit(phone, measure):
    log(phone, "wl up")
    measure("packets", 5, low=6)
    measure("loss", 5, high=1)
    log(phone, "wl <down>")

def test_both(phone, measure):
    measure("packets", 7, high=6)
    pytest.fail("given up")
""", phones=["R1"])
    section = "*The service's command lines*"
    done.stdout.fnmatch_lines([
        section, '11-22 01:40:03.000 cmd: "wl up" unsuccessful execution',
        '11-22 01:40:03.000 cmd: "wl <down>" unsuccessful execution', "*Limits that were missed*",
        "packets: 7 is above 6"])
    for other in "another test", "before":
        done.stdout.no_fnmatch_line(f"*cmd: *{other}*")
    assert [row[1:] for row in outcomes(station)] == [
        ("plan.py::test_both", "failed", "Failed: given up"),
        ("plan.py::test_limit", "failed", "packets: 5 is below 6"), ("plan.py::test_other", "passed", "")]
    page = text_of(station, "report.html")
    assert "loss: 5 is above 1" in page
    assert "wl &lt;down&gt;" in page
    assert "another test" not in page


def test_limits_the_wrong_way_round_fail_their_test_alone(station):
    done = station("""
def test_wrong(phone, measure):
    measure("packets", 5, low=2, high=1)

def test_right(phone, measure):
    measure("packets", 5)
""", phones=["R1"])
    message = "measure: packets: the limits are the wrong way round: low=2 is above high=1"
    assert [line for line in done.outlines if "wrong way" in line] == [message]
    done.stdout.no_fnmatch_line("*Error*")
    assert outcomes(station) == [("R1", "plan.py::test_right", "passed", ""),
                                 ("R1", "plan.py::test_wrong", "failed", message)]


def test_an_exception_of_the_kit_shows_the_plan_s_line_and_its_own(station):
    done = station("def test_a(phone):\n    phone.doctor()", phones=["R/1"])
    message = "bexwifi.errors.UnknownPhone: phone R/1: adb does not know it: see adb devices -l"
    assert [line for line in done.outlines if line[:1] in ("E", ">")] == [
        ">       phone.doctor()", f"E       {message}"]
    done.stdout.fnmatch_lines(["the log cannot be read: cat: *R/1*"])
    assert outcomes(station) == [("R/1", "plan.py::test_a", "failed", message)]


def test_each_outcome(station):
    station("""
@pytest.fixture
def breaks():
    yield
    raise RuntimeError("clean-up")

def test_skipped(phone):
    pytest.skip("no signal generator")

@pytest.mark.xfail(reason="known")
def test_known(phone, measure):
    measure("packets", 5, high=2)

def test_broken(phone, breaks):
    assert phone.serial == "R2", "first"

def test_alone():
    pass
""", phones=["R1"])
    assert outcomes(station) == [
        ("", "plan.py::test_alone", "passed", ""),
        ("R1", "plan.py::test_broken", "failed", "AssertionError: firstRuntimeError: clean-up"),
        ("R1", "plan.py::test_known", "skipped", "known"),
        ("R1", "plan.py::test_skipped", "skipped", "no signal generator")]


def test_serial_numbers_are_any_text(station):
    phones = ["127.0.0.1:5555", "a", "a-b", "x y[@]::é</td>\u202e"]
    assert station("def test_a(phone, measure):\n    measure('serial', phone.serial)", "-n2",
                   phones=phones).ret == 0
    shown = [*phones[:3], phones[3].replace("\u202e", "\\u202e")]
    assert rows(station, "phone", "test", "value") == [(each, "plan.py::test_a", each) for each in shown]
    assert [row[0] for row in outcomes(station)] == shown


@pytest.mark.parametrize("arguments, phones, message", [
    ([], [], "no phone: give its serial number with --wifi-phone SERIAL, once for each phone;"
             " `adb devices` lists them"),
    (["-n1"], ["R1", "R2", "R1"], "--wifi-phone R1 is there more than once"),
    (["--wifi-phone="], ["R1"], "--wifi-phone: the serial number is empty"),
    (["--wifi-report=plan.py"], ["R1"], "--wifi-report plan.py: File exists")])
def test_wrong_usage_is_one_line(station, arguments, phones, message):
    done = station("def test_a(phone):\n    pass", *arguments, phones=phones)
    assert (done.ret, [line for line in done.errlines if line]) == (4, [f"ERROR: {message}"])


def test_a_report_that_cannot_be_written_is_told_before_the_first_test(station):
    done = station("def test_a(phone):\n    open('ran', 'w').close()", report="/proc")
    told, = [line for line in done.errlines if line]
    assert (done.ret, told.startswith("ERROR: --wifi-report /proc: ")) == (4, True)
    assert not (station.report.parent / "ran").exists()


def test_a_full_disk_leaves_what_was_there(station):
    station.report.mkdir()
    for name in "report.html", "junit.xml":
        (station.report / name).write_text("old")
    done = station(SWEEP + "    measure('n' * 9000, 5, low=1, high=9)", before="ulimit -f 24;")
    assert done.ret == 3
    told = [line for line in done.outlines if line.startswith("wifi report: ")]
    assert told == [f"wifi report: cannot write {station.report / name}: File too large"
                    for name in ("junit.xml", "report.html")]
    assert (text_of(station, "junit.xml"), text_of(station, "report.html")) == ("old", "old")
    assert {row[0] for row in rows(station, "phone")} == {"R1", "R2"}
    assert len(list(station.report.iterdir())) == 3


@pytest.mark.parametrize("arguments, pids", [
    ([], "[os.getpid()]"), (["-n2"], "[os.getppid()]"), (["-n2"], "[os.getppid(), os.getpid()]")])
def test_an_interrupted_run_reports_what_has_run(station, arguments, pids):
    done = station(f"""
def test_first(phone, measure):
    measure("packets", 5)

def test_interrupted(phone, measure):
    measure("packets", 6, at={{"channel": 6}})
    open(phone.serial + ".waits", "w").close()
    try:
        if phone.serial == "R2":
            while not os.path.exists("R1.waits"):
                time.sleep(0.01)
            for pid in {pids}:
                os.kill(pid, signal.SIGINT)
        if phone.serial == "R2" or {bool(arguments)}:
            time.sleep({TIMEOUT})
    finally:
        if phone.serial == "R2":
            os.kill(os.getpid(), signal.SIGTERM)  # a further signal does not disturb what ends the test
        open(phone.serial + ".off", "w").close()

def test_last(phone):
    pass
""", *arguments)
    assert done.ret == pytest.ExitCode.INTERRUPTED
    done.stdout.fnmatch_lines(["* interrupted in *"])
    assert (station.report.parent / "R2.off").exists()
    found = outcomes(station)
    one = "interrupted" if arguments else "passed"
    assert [row[:3] for row in found] == [
        ("R1", "plan.py::test_first", "passed"), ("R1", "plan.py::test_interrupted", one),
        ("R1", "plan.py::test_last", "not run" if arguments else "passed"),
        ("R2", "plan.py::test_first", "passed"), ("R2", "plan.py::test_interrupted", "interrupted"),
        ("R2", "plan.py::test_last", "not run")]
    assert rows(station, "phone", "value") == [("R1", "5"), ("R1", "6"), ("R2", "5"), ("R2", "6")]
    assert "The run was interrupted" in text_of(station, "report.html")
    assert 'name="test_last[R2]"' not in text_of(station, "junit.xml")


def test_an_interrupt_while_the_workers_start(station, pytester, monkeypatch):
    """Ctrl-C reaches them, too, before Python has come to the plugin."""
    pytester.makepyfile(sitecustomize="""
import os, signal, sys
if "-c" in sys.orig_argv:
    os.kill(os.getppid(), signal.SIGINT)
    os.kill(os.getpid(), signal.SIGINT)
""")
    monkeypatch.setenv("PYTHONPATH", f"{pytester.path}:{os.environ['PYTHONPATH']}")
    done = station("def test_a(phone):\n    pass", "-n2")
    assert done.ret == pytest.ExitCode.INTERRUPTED
    assert "Traceback" not in "\n".join(done.outlines + done.errlines)
    assert "The run was interrupted" in text_of(station, "report.html")


def test_a_signal_does_not_disturb_the_report(station, pytester):
    pytester.makeconftest("""
import os, signal
def pytest_sessionfinish():
    os.kill(os.getpid(), signal.SIGINT)
""")
    assert station("def test_a(phone):\n    pass", phones=["R1"]).ret == 0
    assert outcomes(station) == [("R1", "plan.py::test_a", "passed", "")]


def test_the_run_ends_when_a_worker_s_last_word_was_lost():
    with Running(["sleep", str(TIMEOUT)]) as process:
        worker = mock.Mock()
        worker.gateway._io.popen = process
        worker.channel.isclosed = lambda: process.poll() is not None
        workers = Workers(mock.Mock(queue=queue.Queue()))
        workers.pytest_testnodeready(worker)
        workers.pytest_sessionfinish()
    assert process.returncode == -signal.SIGINT
    assert workers.running == set()


def test_a_worker_that_dies_takes_no_results_with_it(station):
    done = station("""
def test_first(phone, measure):
    measure("packets", 5)

def test_dies(phone):
    if phone.serial == "R2":
        os._exit(9)
""", "-n2")
    assert done.ret == 1
    assert [row[:3] for row in outcomes(station)] == [
        ("R1", "plan.py::test_dies", "passed"), ("R1", "plan.py::test_first", "passed"),
        ("R2", "plan.py::test_dies", "failed"), ("R2", "plan.py::test_first", "passed")]
    assert rows(station, "phone", "value") == [("R1", "5"), ("R2", "5")]


def test_both_readers_of_the_log_know_the_service_s_runners():
    assert set(RUNNERS) == servicelog.RUNNERS


def test_a_plan_that_cannot_be_read_is_no_pass(station):
    assert station("import nonesuch", "-n1", phones=["R1"]).ret != 0
    assert ("", "plan.py", "failed") in [row[:3] for row in outcomes(station)]
    assert "<title>fail" in text_of(station, "report.html")
