# Copyright 2026 The BEX Wi-Fi Authors
# SPDX-License-Identifier: Apache-2.0
"""In a build with sanitizers: what they are there for they see, on the machine and in a phone, and no
test can pass with it. Without sanitizers there is nothing to run."""

import os
import subprocess

import pytest

from support.phone import REPORT, REPORT_EXIT_CODE, SANITIZE

# Each flaw with a part of its report.
FLAWS = {
    "address": [
        ("leak", "detected memory leaks"),
        ("lost-reference", "detected memory leaks"),
        ("overflow", "heap-buffer-overflow"),
        ("use-after-free", "heap-use-after-free"),
        ("undefined", "signed integer overflow"),
    ],
    "thread": [
        ("race", "data race"),
        ("count-race", "data race"),
        ("deadlock", "lock-order-inversion"),
    ],
}.get(SANITIZE, [])

every_flaw = pytest.mark.parametrize("flaw, report", FLAWS)


@every_flaw
def test_of_a_program(flaw, report):
    flawed = subprocess.run([os.environ["FLAWED_PROGRAM"], flaw], capture_output=True, text=True,
                            check=False, timeout=60)
    assert flawed.returncode == REPORT_EXIT_CODE
    assert report in REPORT.search(flawed.stderr)[0]
    assert "Flaws.cpp:" in flawed.stderr


@pytest.mark.skipif(not SANITIZE, reason="built without sanitizers")
def test_of_nothing():
    clean = subprocess.run([os.environ["FLAWED_PROGRAM"], "none"], capture_output=True, check=False,
                           timeout=60)
    assert (clean.returncode, clean.stderr) == (0, b"")


@every_flaw
def test_of_a_client_in_a_phone(make_phone, flaw, report):
    """The client ends with _exit()."""
    phone = make_phone("broadcom", client=os.environ["FLAWED_PROGRAM"])
    with pytest.raises(AssertionError, match=report):
        phone.client(flaw, "_exit")


@every_flaw
def test_of_the_service_in_a_phone(make_phone, flaw, report):
    """The service is killed, in the end."""
    phone = make_phone("broadcom", service=os.environ["FLAWED_SERVICE"])
    phone.up()
    phone.client("RunTxStop", flaw)
    with pytest.raises(AssertionError, match=report):
        phone.down()
    phone.expected_report = report
