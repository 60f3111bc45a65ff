# Copyright 2026 The BEX Wi-Fi Authors
# SPDX-License-Identifier: Apache-2.0
"""./dev station: a plan on all simulated phones at once."""

import csv
import os
import pathlib
import re
import signal
import subprocess

import pytest

from support.phone import CHIPS, ROOT
from support.waiting import wait_during

TIMEOUT = 600
PLAN = """
import os, pathlib, time

def test_transmission(phone, measure):
    measure("transmits", True)
    with phone.transmit("RunTxBGStart", channel=6, rate=11, power=15, antenna=1):
        (pathlib.Path(__file__).parent / f"{phone.serial}.on").write_text(os.environ["ADB_SERVER_SOCKET"])
        time.sleep(600)
"""


@pytest.fixture(name="station")
def station_fixture(tmp_path):
    """Starts it in a folder of the test's own, as an interactive shell does: in a group of its own."""

    def start(*arguments):
        return subprocess.Popen(
            [ROOT / "dev", "station", *arguments, "--wifi-report=report"], text=True, cwd=tmp_path,
            stdin=subprocess.DEVNULL, stdout=subprocess.PIPE, stderr=subprocess.PIPE, start_new_session=True,
            env={**os.environ, "BEX_PHONES": str(tmp_path / "phones")})

    return start


def command_lines():
    for entry in pathlib.Path("/proc").glob("[0-9]*/cmdline"):
        try:
            yield entry.read_bytes().replace(b"\0", b" ").decode(errors="replace")
        except OSError:
            pass  # it has ended


def leaves_nothing(folder, serials, words):
    assert list((folder / "phones").iterdir()) == []
    assert [line for line in command_lines() if any(word in line for word in words)] == []
    assert [serial for serial in serials if os.path.exists(f"/tmp/bex-{serial}.lock")] == []


def test_the_example_passes_on_every_phone(station, tmp_path):
    with station("-k", "identity", "-n", "2") as run:
        out, complaints = run.communicate(timeout=TIMEOUT)
    assert run.returncode == 0, out + complaints
    up = re.findall(r"^dev: the (\S+) phone is up: (\S+)$", complaints, re.M)
    assert [chip for chip, _ in up] == CHIPS
    with open(tmp_path / "report/measurements.csv", encoding="utf-8", newline="") as table:
        measured = {(row["phone"], row["name"]) for row in csv.DictReader(table)}
    assert {(serial, "driver mode") for _, serial in up} <= measured
    assert f"wifi report: {tmp_path}/report/report.html\n" in out
    assert f" {len(CHIPS)} passed" in out.splitlines()[-1]
    leaves_nothing(tmp_path, [serial for _, serial in up], [str(tmp_path)])


def test_ctrl_c_leaves_a_report_and_nothing_else(station, tmp_path):
    (tmp_path / "my_plan.py").write_text(PLAN)
    with station("my_plan.py") as run:
        while f"the {CHIPS[-1]} phone is up" not in run.stderr.readline():
            assert run.poll() is None
        wait_during(run, lambda: len(list(tmp_path.glob("*.on"))) == len(CHIPS))
        os.killpg(run.pid, signal.SIGINT)
        out, complaints = run.communicate(timeout=TIMEOUT)
    assert run.returncode == 130, out + complaints
    assert "MAY BE ON" not in complaints
    page = (tmp_path / "report/report.html").read_text(encoding="utf-8")
    assert "The run was interrupted" in page
    serials = [path.name[:-len(".on")] for path in tmp_path.glob("*.on")]
    assert len(serials) == len(CHIPS)
    socket = (tmp_path / f"{serials[0]}.on").read_text().partition(":")[2]
    assert not os.path.exists(os.path.dirname(socket))
    leaves_nothing(tmp_path, serials, [str(tmp_path), socket])


def test_a_plan_that_is_not_there_is_one_line(station):
    with station("no_plan.py") as run:
        assert run.communicate(timeout=TIMEOUT) == ("", "dev: there is no plan no_plan.py\n")
    assert run.returncode == 2
