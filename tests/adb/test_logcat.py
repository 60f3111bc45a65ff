# Copyright 2026 The BEX Wi-Fi Authors
# SPDX-License-Identifier: Apache-2.0
"""adb logcat shows the phone's log as a phone's own does."""

import re
import subprocess

import pytest

from support.adb import TIMEOUT

LOG = """\
alpha D 11-22 01:40:03     7     8 first
beta-long-name W 11-22 01:40:04     7     9 second: of two lines
  the other
alpha E 11-22 01:40:05 12345 12346 third
"""
BEGIN = "--------- beginning of main\n"


@pytest.fixture(name="phone")
def phone_with_log(phone):
    """A phone with these messages alone in its log."""
    assert phone.do("logcat", "-c").returncode == 0
    write(phone, LOG)
    return phone


def write(phone, text):
    with open(phone.log, "a", encoding="ascii") as log:
        log.write(text)


def logcat(phone, *arguments):
    done = phone.do("logcat", "-d", *arguments)
    assert (done.returncode, done.stderr) == (0, b""), done
    return done.stdout.decode()


def test_the_default_is_threadtime(phone):
    assert logcat(phone) == logcat(phone, "-v", "threadtime") == BEGIN + """\
11-22 01:40:03.000     7     8 D alpha   : first
11-22 01:40:04.000     7     9 W beta-long-name: second: of two lines
11-22 01:40:04.000     7     9 W beta-long-name:   the other
11-22 01:40:05.000 12345 12346 E alpha   : third
"""


@pytest.mark.parametrize("form, line", [
    ("time", "11-22 01:40:05.000 E/alpha   (12345): third\n"),
    ("brief", "E/alpha   (12345): third\n"),
    ("tag", "E/alpha   : third\n"),
    ("raw", "third\n")])
def test_other_formats(phone, form, line):
    assert logcat(phone, "-v", form, "*:E") == BEGIN + line


@pytest.mark.parametrize("filters, shown", [
    (["-s", "alpha"], ["first", "third"]),
    (["-s", "alpha:W", "gamma"], ["third"]),
    (["-s", "beta-long-name"], ["second: of two lines", "  the other"]),
    (["*:W", "alpha:S"], ["second: of two lines", "  the other"]),
    (["-s", "gamma"], [])])
def test_filters(phone, filters, shown):
    lines = logcat(phone, "-v", "raw", *filters).splitlines(keepends=True)
    assert lines == ([BEGIN] if shown else []) + [line + "\n" for line in shown]


def test_filters_of_the_environment(phone):
    phone.adb.environment["ANDROID_LOG_TAGS"] = "*:E"
    try:
        assert logcat(phone, "-v", "raw") == BEGIN + "third\n"
    finally:
        del phone.adb.environment["ANDROID_LOG_TAGS"]


def test_clearing_takes_nothing_from_the_phone_s_own_log(phone):
    assert phone.do("logcat", "-c").returncode == 0
    assert logcat(phone) == ""
    assert LOG in phone.log.read_text()
    write(phone, LOG)
    assert logcat(phone, "-v", "raw", "*:E") == BEGIN + "third\n"


def test_a_running_logcat_goes_on(phone):
    with phone.adb.start("-s", phone.serial, "logcat", "-v", "raw", "-s", "alpha",
                         stdout=subprocess.PIPE, text=True) as running:
        assert [running.stdout.readline() for _ in range(3)] == [BEGIN, "first\n", "third\n"]
        write(phone, LOG)
        assert [running.stdout.readline() for _ in range(2)] == ["first\n", "third\n"]
        running.kill()


def test_logcat_in_a_line_of_the_shell(phone):
    assert phone.shell("logcat -d -v raw | grep -c of") == (0, b"2\n", b"")  # and "beginning of"


def test_the_commands_of_the_service_are_there(phone):
    phone.shell("bex-wifi-client isSnifferMode")
    assert re.search(r'^\d\d-\d\d \d\d:\d\d:\d\d\.000 +\d+ +\d+ [A-Z] wifi@1\.0-\S+ *: cmd: "', logcat(phone),
                     re.MULTILINE)


@pytest.mark.parametrize("arguments, message", [
    (["-v", "json"], 'Invalid parameter "json" to -v'), (["-q"], "unknown option -- 'q'"),
    (["-v"], "option requires an argument -- 'v'"), (["alpha:X"], "Invalid filter expression 'alpha:X'")])
def test_wrong_usage_is_one_line(phone, arguments, message):
    wrong = phone.do("logcat", *arguments)
    assert wrong.returncode == 1
    assert wrong.stdout + wrong.stderr == f"logcat: {message}\n".encode()


def test_a_phone_that_is_not_on_adb_has_no_log_inside(phone):
    log = phone.root / "phone/log"
    away = log.rename(log.with_name("away"))
    try:
        done = subprocess.run(phone.command("logcat", "-d"), capture_output=True, check=False,
                              timeout=TIMEOUT)
    finally:
        away.rename(log)
    assert (done.returncode, done.stdout) == (1, b"")
    assert done.stderr == b"logcat: there is no log: the phone is not on adb\n"
