# Copyright 2026 The BEX Wi-Fi Authors
# SPDX-License-Identifier: Apache-2.0
"""The example plan on simulated phones, two at once, and what it tells of a phone that is not well."""

import csv
import os
import subprocess
import sys

import pytest

from support.phone import ROOT
from support.radio import radio_use

PLAN = ROOT / "station/example/plan.py"
TIMEOUT = 300


@pytest.fixture(name="run_plan")
def run_plan_fixture(tmp_path):
    """Runs the plan on phones; returns (exit code, stdout, rows of the table, the page)."""

    def run(phones, *arguments):
        done = subprocess.run(
            [sys.executable, "-B", "-m", "pytest", "-p", "bexwifi_pytest", "-p", "no:cacheprovider", PLAN,
             f"--wifi-report={tmp_path}", *(f"--wifi-phone={phone.serial}" for phone in phones), *arguments],
            env={**os.environ, "PYTHONPATH": str(ROOT / "station")}, check=False, timeout=TIMEOUT,
            stdout=subprocess.PIPE, text=True)
        with open(tmp_path / "measurements.csv", encoding="utf-8", newline="") as table:
            rows = list(csv.DictReader(table))
        return done.returncode, done.stdout, rows, (tmp_path / "report.html").read_text(encoding="utf-8")

    return run


def test_two_phones_pass(phone_of, run_plan):
    phones = [phone_of("broadcom"), phone_of("qca639x")]
    code, out, rows, page = run_plan(phones, "-n2")
    assert code == 0, out
    for phone in phones:
        found = [row for row in rows if row["phone"] == phone.serial]
        assert [row["name"] for row in found].count("packets received") == 8
        assert [row["name"] for row in found].count("time to start") == 6
        assert {row["verdict"] for row in found if row["low"] or row["high"]} == {"pass"}
        assert radio_use(phone) == "idle"
    assert page.count("<svg") == 4


def test_a_failure_tells_the_command_lines(simulated, run_plan):
    simulated.fault("wl", "--when", "pkteng_start*", "exit", "1")
    code, out, rows, page = run_plan([simulated], "-k", "identity or 11g")
    assert code == 1
    assert [row["name"] for row in rows] == ["MIMO", "client", "driver mode"]
    assert 'cmd: "wl pkteng_start' in out
    assert "wl pkteng_start" in page
    log = out.partition("The service's command lines")[2].partition("====")[0]
    lines = [line.partition('cmd: "')[2].rpartition('" ')[0] for line in log.splitlines() if "cmd: " in line]
    started = simulated.explain("RunTxBGStart", "6", "54", "15", "1")
    assert lines[:len(started)] == started
    assert radio_use(simulated) == "idle"
