# Copyright 2026 The BEX Wi-Fi Authors
# SPDX-License-Identifier: Apache-2.0
"""docs/station.md: what it tells a reader to type works, from the first block to the last."""

import contextlib
import os
import pathlib
import re
import shutil
import subprocess
import sys

import pytest

import bexwifi
from bexwifi import errors
from support.adb import Running
from support.phone import ROOT
from support.processes import children
from support.radio import radio_use
from support.waiting import wait_during

PAGE = (ROOT / "docs/station.md").read_text(encoding="utf-8")
BLOCKS = re.findall(r"^```(\w+)\n(.*?)^```$", PAGE, re.M | re.S)
TIMEOUT = 600
# The serial numbers on the page, and what they stand for.
PHONES = {"R58M123ABC": "broadcom", "R58M456DEF": "qca639x"}
# Each block goes on where the one before has left the reader's shell.
SHELL = 'set -euo pipefail; [ ! -e "$STATE" ] || . "$STATE"\n{}\nexport -p >"$STATE"\n'


@pytest.fixture(scope="module", name="reader")
def reader_fixture(tmp_path_factory, phone_of):
    """Does what a block says, in a folder with the station kit."""
    folder = tmp_path_factory.mktemp("checkout")
    programs = tmp_path_factory.mktemp("programs")
    shutil.copytree(ROOT / "station", folder / "station", ignore=shutil.ignore_patterns("__pycache__"))
    (programs / "python3").symlink_to(sys.executable)
    (programs / "apt-get").write_text('#!/bin/sh\necho "$@" >"${0%/*}/apt-get.arguments"\n')
    (programs / "apt-get").chmod(0o755)
    environment = {**os.environ, "PATH": f"{programs}:{os.environ['PATH']}", "STATE": str(programs / "state"),
                   "PYTHONPATH": "", "PYTHONDONTWRITEBYTECODE": "1",
                   # The example has a test of its own.
                   "PYTEST_ADDOPTS": "-p no:cacheprovider --deselect station/example/plan.py::test_transmission"
                                     " -k 'not test_reception or my_plan'"}

    def do(language, text):
        for serial, chip in PHONES.items():
            text = text.replace(serial, phone_of(chip).serial)
        name = re.match(r"# (\w+\.py)\n", text)
        if name:
            (folder / name[1]).write_text(text)
            return None
        if language == "python":
            (programs / "block.py").write_text(text)
            text = f'PYTHONPATH=$PYTHONPATH:. python3 "{programs}/block.py"'
        done = subprocess.run(["bash", "-c", SHELL.format(text)], cwd=folder, env=environment, check=False,
                              timeout=TIMEOUT, capture_output=True, text=True)
        assert done.returncode == 0, text + done.stdout + done.stderr
        assert done.stderr == ""
        return done.stdout

    do.folder, do.programs = folder, programs
    return do


@pytest.fixture(scope="module", name="outputs")
def outputs_fixture(reader):
    return [reader(language, text) for language, text in BLOCKS if language != "mermaid"]


def output_of(outputs, words):
    """The output of the block that has the words."""
    blocks = [text for language, text in BLOCKS if language != "mermaid"]
    output, = [output for output, text in zip(outputs, blocks) if words in text]
    return output


def test_every_block_works(outputs, reader, phone_of):
    assert len(outputs) > 10
    assert ", 0 problem, " in output_of(outputs, "adb devices")
    assert "RunTxStop" in output_of(outputs, "print(phone.stop()")
    assert "worth nothing" not in output_of(outputs, "RadioMayBeOn")
    assert int(output_of(outputs, "import RadioPlug")) >= 0
    report = reader.folder / "report"
    for name in ("report.html", "measurements.csv", "junit.xml", "doctor.json", "kit.log"):
        assert (report / name).stat().st_size > 0, name
    assert 'cmd: "wl pkteng_start' in (report / "logcat.txt").read_text(encoding="utf-8")
    for chip in PHONES.values():
        assert radio_use(phone_of(chip)) == "idle"


def sleeps(script):
    """Whether it has come to its sleep; its other children end at any moment."""
    for child in children(script.pid):
        with contextlib.suppress(OSError):
            if pathlib.Path(f"/proc/{child}/comm").read_text(encoding="ascii") == "sleep\n":
                return True
    return False


def test_a_signal_ends_the_script_at_once(outputs, reader, phone_of):
    assert outputs
    simulated = phone_of("broadcom")
    with Running(["bash", "transmit.sh", simulated.serial, "1000"], cwd=reader.folder) as script:
        wait_during(script, lambda: sleeps(script))
        assert radio_use(simulated) == "tx"
        script.terminate()
        assert script.wait(60) == 130
    assert radio_use(simulated) == "idle"
    with pytest.raises(ProcessLookupError):
        os.killpg(script.pid, 0)


def test_it_installs_what_the_entry_script_installs(outputs, reader):
    assert outputs
    script = (ROOT / "tools/dev/packages.sh").read_text(encoding="utf-8")
    packages = re.search(r"^readonly STATION_PACKAGES=\((.*?)\)", script, re.M | re.S)[1].split()
    asked = (reader.programs / "apt-get.arguments").read_text(encoding="utf-8").split()
    assert asked == ["install", *packages]


STARTS = {
    "RunTxBGStart": (6, 11, 15, 1), "RunTxNStart": (36, 40, 7, 15, True, 1),
    "RunTxAxStart": (36, 80, 7, 15, 0, 1), "RunTxStStart": (6, 20, 1), "RunRxBgStart": (6, 11, 1),
    "RunRxNStart": (36, 40, 7, False, 1), "RunRxAxStart": (36, 80, 7, 1), "snifferStart": (6, 20)}


def test_the_radio_has_the_states_of_the_diagram(phone_of):
    simulated = phone_of("qca639x")
    phone = bexwifi.Phone(simulated.serial)
    diagram, = [text for language, text in BLOCKS if language == "mermaid"]
    edges = re.findall(r"^ +(\w+) --> (\w+): ([\w, ]+)$", diagram, re.M)
    starts = [(to, method) for start, to, methods in edges if start == "idle"
              for method in methods.split(", ") if method in phone.methods]
    ends = {state: method for state, to, method in edges if to == "idle"}
    assert {method for _, method in starts} == set(STARTS)
    for state, method in starts:
        phone.call(method, *STARTS[method])
        assert radio_use(simulated) == state, method
        end = phone.methods[ends[state]]
        phone.call(end.name, *([STARTS[method][0]] if end.arguments else []))
        assert radio_use(simulated) == "idle", end.name
    phone.call("RunTxBGStart", *STARTS["RunTxBGStart"])
    assert ends["unknown"] == "stop"
    phone.stop()
    assert radio_use(simulated) == "idle"


def test_the_table_has_every_exception():
    rows = re.findall(r"^\| ([\d, ]*)\| `(\w+)` \| .+ \|$", PAGE, re.M)
    told = {int(code): name for codes, name in rows for code in codes.replace(" ", "").split(",") if code}
    assert told == {code: kind.__name__ for code, kind in errors.OF_EXIT_CODE.items()}
    every = {name for name in bexwifi.__all__ if isinstance(getattr(bexwifi, name), type)
             and issubclass(getattr(bexwifi, name), errors.BexWifiError)}
    assert {name for _, name in rows} == every - {"BexWifiError"}
