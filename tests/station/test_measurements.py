# Copyright 2026 The BEX Wi-Fi Authors
# SPDX-License-Identifier: Apache-2.0
"""Measurements, their limits, and the files that they go to."""

import csv
import decimal
import io
import math
import os
import resource
import subprocess
import sys

import pytest

from bexwifi_pytest import files
from bexwifi_pytest.measurements import Measurement, MeasurementError
from bexwifi_pytest.results import Result, Results, Run


@pytest.mark.parametrize("value, low, high, missed", [
    (950, 950, 1000, ""), (1000, 950, 1000, ""),
    (949, 950, 1000, "packets: 949 is below 950"), (1001, 950, 1000, "packets: 1001 is above 1000"),
    (-5, None, 0, ""), (5, None, 0, "packets: 5 is above 0"), (0, 0.5, None, "packets: 0 is below 0.5"),
    (math.inf, 950, None, ""), (math.nan, 950, None, "packets: nan is within no limits"),
    (decimal.Decimal("0.25"), 1, None, "packets: 0.25 is below 1"), (-1, None, None, "")])
def test_limits(value, low, high, missed):
    measurement = Measurement.of("packets", value, low=low, high=high)
    assert measurement.missed == missed
    assert measurement.verdict == ("fail" if missed else "" if low is high else "pass")


def test_a_missed_limit_tells_where_and_the_unit():
    measurement = Measurement.of("loss", 12.5, "%", high=10, at={"channel": 6, "mode": "HT"})
    assert measurement.missed == "loss at channel=6, mode=HT: 12.5 % is above 10"


@pytest.mark.parametrize("value, limits, message", [
    (5, {"low": 2, "high": 1}, "loss: the limits are the wrong way round: low=2 is above high=1"),
    (5, {"low": math.nan}, "loss: the limit nan is no number"),
    (5, {"high": "7"}, "loss: the limit '7' is no number"),
    (10 ** 310, {"low": 1}, f"loss: {10 ** 310} is neither a number nor a text"),
    (None, {}, "loss: None is neither a number nor a text"),
    ("5", {"low": 1}, "loss: '5' has limits but is no number"),
    (True, {"low": 1}, "loss: True has limits but is no number")])
def test_what_is_no_measurement(value, limits, message):
    with pytest.raises(MeasurementError) as raised:
        Measurement.of("loss", value, **limits)
    assert str(raised.value) == message


def test_the_verdict_of_a_phone():
    passed, skipped, failed = (Result("R1", "a", outcome) for outcome in ("passed", "skipped", "failed"))
    unfinished = Result("R1", "a")
    for results, verdict in [([passed, skipped], "pass"), ([passed, failed, unfinished], "fail"),
                             ([passed, unfinished], "incomplete"), ([], "incomplete"),
                             ([skipped], "incomplete")]:
        assert Results(results).verdict == verdict


def test_the_verdict_of_a_run():
    run = Run(["R1", "R2"])
    run.results.append(Result("R1", "a", "passed"))
    assert run.verdict == "incomplete"
    run.results.append(Result("R2", "a", "passed"))
    assert run.verdict == "pass"
    run.interrupted = True
    assert run.verdict == "incomplete"
    run.results.append(Result("", "b", "failed"))
    assert run.verdict == "fail"


def test_a_spreadsheet_reads_every_row_and_no_formula():
    run = Run(["=R1"])
    run.results.append(Result("=R1", "+a", "passed", measurements=[
        Measurement.of("@loss,\n\"", -0.5, "-dBm", None, -0.25, {"channel": 6}),
        Measurement.of("version", "=1+1"), Measurement.of("mimo", True)]))
    assert list(csv.reader(io.StringIO(files.measurements_csv(run)))) == [
        files.COLUMNS,
        ["'=R1", "'+a", "'@loss,\n\"", "channel=6", "-0.5", "'-dBm", "", "-0.25", "pass"],
        ["'=R1", "'+a", "version", "", "'=1+1", "", "", "", ""],
        ["'=R1", "'+a", "mimo", "", "true", "", "", "", ""]]


def test_a_file_is_written_as_a_whole(tmp_path):
    path = tmp_path / "report"
    files.write(path, "ö\n")
    assert path.read_bytes() == "ö\n".encode()
    program = "import sys; from bexwifi_pytest import files; files.write(sys.argv[1], 'x' * 100000)"
    full = subprocess.run(
        [sys.executable, "-B", "-c", program, path], check=False, capture_output=True, text=True, timeout=60,
        env={**os.environ, "PYTHONPATH": os.pathsep.join(sys.path)},
        preexec_fn=lambda: resource.setrlimit(resource.RLIMIT_FSIZE, (4096, 4096)))
    assert full.stderr.splitlines()[-1].startswith("OSError")
    assert path.read_bytes() == "ö\n".encode()
    assert list(tmp_path.iterdir()) == [path]
