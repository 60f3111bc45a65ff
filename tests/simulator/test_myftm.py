# Copyright 2026 The BEX Wi-Fi Authors
# SPDX-License-Identifier: Apache-2.0
"""The factory test tool, in the two forms that the chips have it."""

import re

import pytest

from qualcomm import CON_MODE, copies, refusals, test_mode as enter
from support.waiting import wait_for

FRAMES = "-X 00:03:7F:44:55:11 -Y 00:03:7F:44:55:22 -N 00:03:7F:44:55:33"
PLAIN, NEWER = ("qca", "wcn39xx"), ("qca639x", "wcn685x", "wcn6750")


@pytest.fixture(name="phone_of")
def phone_of_fixture(launcher, patterns, place):
    return copies(launcher, patterns, place)


def newer(chip, line):
    """A line for a newer chip: with -J and the radio of the frequency."""
    radio = "0" if chip == "wcn6750" or "-f 5" in line else "1"
    return f"myftm -J -I {radio} {line}"


def line_for(chip, test):
    """A line that starts a test."""
    if chip in PLAIN:
        return {"rx": "myftm -a 1 -f 2437 -r 14 -M 0 -x 1", "tone": "myftm -a 1 -f 2437 -t 1",
                "tx": "myftm -a 2 -M 6 -r 22 -f 5180 -p 15 -t 3"}[test]
    return newer(chip, {
        "rx": f"{FRAMES} -a 1 -f 2437 -r 10 -M 0 -x 1", "tone": f"{FRAMES} -a 1 -k 1 -f 2437 -t 1",
        "tx": f"-a 1 -k 1 -M 6 {FRAMES} -r 22 -f 5180 -p 15 --dpdflag enable -t 3"}[test])


def stop_for(chip, option="-x 0"):
    return f"myftm {option}" if chip in PLAIN else newer(chip, option)


def ready(phone):
    """A phone that can start a test."""
    enter(phone)
    radios = {"wcn6750": "phya", "qca639x": "dbs", "wcn685x": "dbs"}.get(phone.folder.name)
    if radios:
        phone.output(f"myftm -J -B {radios}")
    return phone


@pytest.mark.parametrize("chip", PLAIN + NEWER)
def test_every_test_starts_and_stops(phone_of, chip):
    phone = ready(phone_of(chip))
    for test in ("rx", "tone", "tx"):
        for option in ("-t 0", "-x 0"):
            phone.output(line_for(chip, test))
            assert phone.driver()["engine"] == test
            phone.output(stop_for(chip, option))
            assert phone.driver()["engine"] == "idle"


@pytest.mark.parametrize("chip, line", [
    # 802.11b/g
    ("qca", "-a 1 -f 2412 -r 6 -M 4 -x 1"), ("qca", "-a 1 -f 5825 -r 5 -M 0 -x 1"),
    ("qca", "-a 1 -f 2412 -r 1 -M 0 -x 1"), ("wcn39xx", "--dpdflag -a 1 -r 6 -f 2412 -p 18 -t 3"),
    ("qca639x", f"-I 1 -a 1 -r 3 {FRAMES} -M 0 -f 2484 -p 15.5 --dpdflag enable -t 3"),
    # 802.11n and ac
    ("qca", "-a 2 -M 8 -r 24 -f 5180 -p 15 -t 3"), ("qca", "-a 1 -f 2437 -M 1 -r 15 -x 1"),
    ("wcn39xx", "--dpdflag -a 3 -M 5 -r 23 -f 5745 -p 0 -t 3"),
    ("wcn6750", f"-I 0 -a 3 -k 1 -M 2 {FRAMES} -r 30 -f 2437 -p 9 --dpdflag enable -t 3"),
    ("wcn685x", f"-I 0 {FRAMES} -a 2 -f 5180 --nss 1 --rateBw 20 -M 29 -r 24 -x 1"),
    # 802.11ax
    ("wcn685x", f"-I 0 --gI 0.8 --rateBw 10 -M 4 -a 3 -k 1 --nss 2 {FRAMES} -r 26 -f 5180 -p 12 "
                "--dpdflag enable -t 3"),
    ("qca639x", f"-I 1 --rateBw 8 -M 2 {FRAMES} --nss 1 -a 1 -f 2437 -r 15 -x 1"),
    ("qca639x", f"-I 0 --rateBw 9 -M 3 {FRAMES} --nss 2 -a 3 -f 5180 -r 22 -x 1"),
    ("qca639x", f"-I 0 --rateBw 16 -M 29 {FRAMES} --nss 2 -a 3 -f 5180 -r 22 -x 1")])
def test_takes_every_form_of_the_tests(phone_of, chip, line):
    phone = ready(phone_of(chip))
    phone.output(f"/vendor/bin/myftm {'-J ' if chip in NEWER else ''}{line} ")
    assert phone.driver()["engine"] == ("rx" if line.endswith("-x 1") else "tx")


PLAIN_NONSENSE = {
    "": "nothing to do", "-t 0 -x 0": "nothing to do", "-a 1 -f 2412": "nothing to do",
    "-t": "'-t'", "-t 2": "'-t'", "-x 3": "'-x'", "-q 1": "unrecognized option '-q'",
    "-J -t 0": "unrecognized option '-J'", "-I 1 -t 0": "'-I'", "--nss 1 -t 0": "'--nss'",
    "-a": "'-a'", "-a 4 -f 2412 -t 1": "'-a'", "-a '' -f 2412 -t 1": "'-a'",
    "-a -f 2412 -t 1": "'-a'",
    "-f 2412 -t 1": "-a is missing", "-a 1 -t 1": "-f is missing",
    "-a 1 -f 2412 -r 1 -t 3": "-p is missing", "-a 1 -f 2412 -p 9 -t 3": "-r is missing",
    "-a 1 -f 2412 -r 1 -x 1": "-M is missing",
    "-a 1 -f 2413 -t 1": "no channel", "-a 1 -f 2477 -t 1": "no channel",
    "-a 1 -f 5005 -t 1": "no channel", "-a 1 -f 5182 -t 1": "no channel",
    "-a 1 -f 5185 -t 1": "no channel",
    "-a 1 -f 12 -t 1": "'-f'",
    "-a 1 -f 2412 -r 9 -M 0 -x 1": "no rate 9", "-a 1 -f 2412 -r 15 -M 0 -x 1": "no rate 15",
    "-a 1 -f 2412 -r 4 -M 4 -x 1": "no rate 4", "-a 1 -f 2412 -r 14 -M 1 -x 1": "no rate 14",
    "-a 1 -f 5180 -r 25 -M 8 -x 1": "no rate 25", "-a 1 -f 2412 -r -5 -M 1 -x 1": "'-r'",
    "-a 1 -f 2412 -r 15 -M 3 -x 1": "no mode", "-a 1 -f 2412 -r 15 -M 8 -x 1": "no channel of 80",
    "-a 1 -f 2412 -r 1 -p loud -t 3": "'-p'", "-a 1 -f 2412 -r 1 -p 31 -t 3": "'-p'",
}

NEWER_NONSENSE = {
    "-t 0": "-J is missing", "-J -t 0": "-I is missing", "-J -I 2 -t 0": "'-I'",
    "-J": "-I is missing", "-J -I 1": "nothing to do", "-J -B phya": "'-B'", "-J -B": "'-B'",
    "-J -B dbs -I 1 -t 0": "nothing to do",
    "-J -I 1 -a 1 -k 1 -f 2437 -t 1": "-X is missing",
    f"-J -I 0 {FRAMES} -a 1 -k 1 -f 2437 -t 1": "radio 0 has no 2437",
    f"-J -I 1 {FRAMES} -a 1 -k 1 -f 5180 -t 1": "radio 1 has no 5180",
    f"-J -I 1 {FRAMES[:-3]} -a 1 -f 2437 -t 1": "'-N'",
    f"-J -I 1 {FRAMES} -a 1 -f 2437 -r 15 -x 1": "-M is missing",
    f"-J -I 1 {FRAMES} -a 1 -f 2437 -r 15 -M 1 -p 9 -t 3": "-dpdflag is missing",
    f"-J -I 1 {FRAMES} -a 1 -f 2437 -r 15 -M 1 -p 9 --dpdflag -t 3": "'--dpdflag'",
    f"-J -I 1 {FRAMES} --rateBw 8 -M 3 -a 1 -f 2437 -r 15 -x 1": "no mode",
    f"-J -I 1 {FRAMES} --rateBw 8 -M 2 -a 1 -f 2437 -r 27 -x 1": "no rate 27",
    f"-J -I 0 {FRAMES} --rateBw 16 -M 29 -a 1 -f 5745 -r 15 -x 1": "no channel of 160",
    f"-J -I 1 {FRAMES} --nss 3 --rateBw 8 -M 2 -a 1 -f 2437 -r 15 -x 1": "'--nss'",
    f"-J -I 1 --gI soft {FRAMES} -M 1 -a 1 -f 2437 -r 15 -x 1": "'--gI'",
}


@pytest.mark.parametrize("chip, nonsense", [("qca", PLAIN_NONSENSE), ("qca639x", NEWER_NONSENSE)])
def test_nonsense_is_refused_and_changes_nothing(phone_of, chip, nonsense):
    printed = refusals(ready(phone_of(chip)), [f"myftm {line}" for line in nonsense])
    for line, text in zip(nonsense, printed, strict=True):
        assert text.startswith("myftm: ") and nonsense[line] in text, (line, text)


@pytest.mark.parametrize("chip", PLAIN + NEWER)
@pytest.mark.parametrize("spoil", [f"echo 0 > {CON_MODE}", f"echo 4 > {CON_MODE}", f"rm {CON_MODE}",
                                   "rmmod wlan"])
def test_tests_need_the_factory_test_mode(phone_of, chip, spoil):
    phone = ready(phone_of(chip))
    phone.output(spoil)
    for test in ("tx", "rx", "tone"):
        result = phone.shell(line_for(chip, test))
        assert (result.returncode, result.stdout, result.stderr) \
            == (1, "", "myftm: the driver is not in factory test mode\n")
    assert phone.output(stop_for(chip)) == ""


@pytest.mark.parametrize("chip", PLAIN)
def test_the_mode_written_while_the_driver_runs_counts(phone_of, chip):
    phone = phone_of(chip)
    phone.output(f"echo 5 > {CON_MODE}; {line_for(chip, 'tx')}")
    assert phone.driver()["engine"] == "tx"


@pytest.mark.parametrize("chip", PLAIN + NEWER)
def test_stopping_when_nothing_runs_succeeds(phone_of, chip):
    phone = phone_of(chip)
    assert phone.output(f"{stop_for(chip)} && {stop_for(chip, '-t 0')}") == ""
    phone.output("rmmod wlan")
    assert phone.output(stop_for(chip)) == ""


@pytest.mark.parametrize("chip", ["qca", "qca639x"])
def test_a_second_start_is_refused(phone_of, chip):
    phone = ready(phone_of(chip))
    phone.output(line_for(chip, "tx"))
    assert phone.shell(line_for(chip, "rx")).stderr == "myftm: a test is running\n"
    assert phone.driver()["engine"] == "tx"


def test_newer_chips_choose_their_radios_after_each_load(phone_of):
    phone = enter(phone_of("qca639x"))
    assert phone.shell(line_for("qca639x", "tx")).stderr == "myftm: no radios are chosen\n"
    assert phone.shell("ifconfig wlan0 down; myftm -J -B dbs").stderr \
        == "myftm: wlan0: Network is down\n"
    phone.output(f"ifconfig wlan0 up; myftm -J -B dbs; {line_for('qca639x', 'tx')}")
    enter(phone)
    assert phone.shell(line_for("qca639x", "tx")).returncode == 1


@pytest.mark.parametrize("chip", PLAIN + NEWER)
def test_a_reception_ends_with_its_statistics(phone_of, chip):
    phone = ready(phone_of(chip))
    form = r"goodPackets (\d+)$" if chip in PLAIN else r"goodPackets = (\d+)$"
    for option in ("-x 0", "-t 0"):
        phone.output(line_for(chip, "rx"))
        since = float(phone.driver()["engine_since"])
        wait_for(lambda: float(phone.output("echo $EPOCHREALTIME")) > since + 0.002)
        printed = phone.output(stop_for(chip, option))
        assert printed.count("goodPackets") == 1 and printed.count("\n") > 2
        assert int(re.search(form, printed, re.MULTILINE).group(1)) > 0
        assert phone.output(stop_for(chip, option)) == ""
    phone.output(line_for(chip, "tx"))
    assert phone.output(stop_for(chip)) == ""


@pytest.mark.parametrize("text", ["no packets\n", "goodPackets", "goodPackets 1\ngoodPackets 2\n"])
def test_other_statistics_can_be_staged(phone_of, place, text):
    phone = ready(phone_of("qca"))
    (place / "statistics").write_text(text)
    phone.fault("myftm", "--when", "*-x 0", "print", place / "statistics")
    phone.output(line_for("qca", "rx"))
    assert phone.run("myftm", "-x", "0").stdout == text
