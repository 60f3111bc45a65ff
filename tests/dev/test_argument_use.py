# Copyright 2026 The BEX Wi-Fi Authors
# SPDX-License-Identifier: Apache-2.0
"""What becomes of arguments, on phones that are made up."""

import pathlib
import sys

import pytest

sys.path.insert(0, str(pathlib.Path(__file__).resolve().parents[2] / "tools"))
import argument_use  # noqa: E402
import code_tables  # noqa: E402
import explained  # noqa: E402

CHANNEL = explained.Argument("channel", "string", "", None, "decimal")
BANDWIDTH = explained.Argument("bandwidth", "string", "", "MHz", "20, 40 or 80")
POWER = explained.Argument("power", "string", "", None, "any")
VHT = explained.Argument("vht", "bool", "", None, "true, false, 1 or 0")


class MadeUpPhone:
    """Runs for each call the lines that a function of its arguments gives."""

    def __init__(self, lines):
        self._lines = lines

    def lines(self, calls):
        return [self._lines(*call[1:]) for call in calls]


def use(lines, *arguments, name="RunTxNStart"):
    return argument_use.MethodUse(MadeUpPhone(lines), explained.Method(name, arguments))


def shown(found):
    return [" ".join(map(str, line)) for line in found.lines]


def test_as_it_stands_and_ignored():
    found = use(lambda channel, power: ["up ", f"tool -c {channel} -t 3 "], CHANNEL, POWER)
    assert shown(found) == ["tool -c <channel> -t 3"]
    assert found.ignored() == ("power",)


def test_two_arguments_in_one_word():
    found = use(lambda channel, width: [f"wl chanspec {channel}/{width} "], CHANNEL, BANDWIDTH)
    assert shown(found) == ["wl chanspec <channel>/<bandwidth>"]


def test_an_argument_that_counts_with_another_one_alone():
    """In the first base the power changes nothing."""
    found = use(lambda vht, power: [f"tool {power if vht == 'true' else 'low'} "], VHT, POWER)
    assert shown(found) == ["tool {vht, power}"]
    assert found.ignored() == ()


def test_a_word_that_is_missing_at_times():
    found = use(lambda width, vht: [f"tool -b {width} {'-s 1 ' if vht == 'true' else ''}"],
                BANDWIDTH, VHT)
    assert shown(found) == ["tool -b <bandwidth> {vht}"]


def test_an_option_that_brings_others_along():
    found = use(lambda width: [f"tool -k 1 {'--nss 1 -M 29' if width == '160' else '-M 1'} -r 5 "],
                BANDWIDTH)
    assert shown(found) == ["tool -k 1 {bandwidth} -r 5"]


@pytest.mark.parametrize("line, kind", [
    ("myftm -a 1 -t 3 ", "transmission"),
    ("myftm -a 1 -t 1 ", "tone"),
    ("myftm -a 1 -x 1 ", "reception"),
    ("myftm -t 0 ", None),
    ("wl pkteng_stop tx ", None),
    ("wl fqacurcy 0 ", None),
    ("iwpriv wlan0 tx 0 ", None),
])
def test_what_a_call_starts(line, kind):
    found = use(lambda: [line])
    assert found.starts() == kind
    assert found.tools() == ({line.split(" ")[0]} if kind else set())


def test_remarks():
    quiet = use(lambda width: [f"tool {width} "], BANDWIDTH, name="RunRxNStart")
    assert quiet.remarks() == ["Receives nothing: no test command follows what sets the chip up."]
    alike = use(lambda width, vht: [f"myftm {width == '20' and vht} -t 3 "], BANDWIDTH, VHT)
    assert alike.remarks() == [
        "bandwidth 40 and 80 MHz run the same lines with vht false.",
        "bandwidth 40 and 80 MHz run the same lines with vht true.",
        "vht false and true run the same lines with bandwidth 40.",
        "vht false and true run the same lines with bandwidth 80."]


def test_a_table_of_codes():
    def frequency(channel):
        number = 0 if channel == argument_use.OTHER else int(channel)
        return [f"tool -f {2407 + 5 * number if number < 14 else 2484} "]

    tables = code_tables.CodeTables()
    tables.add(use(frequency, CHANNEL))
    assert tables.text() == [
        "### channel", "",
        "| channel | `tool -f` |",
        "|---|---|",
        "| 1 to 13 | 2407 + 5 × channel |",
        "| 14 to 177 | `2484` |",
        "| no number | `2407` |",
        ""]
