# Copyright 2026 The BEX Wi-Fi Authors
# SPDX-License-Identifier: Apache-2.0
"""The target test, which must pass on any phone, on the simulated ones.

A test of its own in CTest, beside the rest of this folder, as it takes minutes: pytest collects a
file of this name only when it is given by name.
"""

import os

import pytest

from support.phone import CHIPS

TARGET_TEST = "/data/vendor.korvan.bex.wifi@1.0-disruptive-target-test"


@pytest.mark.parametrize("chip", CHIPS)
def test_a_phone_passes_and_stays_usable(make_phone, chip):
    phone = make_phone(chip, f"{os.environ['BEX_TARGET_TEST']}={TARGET_TEST}")
    # The pauses that a real driver needs would take minutes.
    phone.fault("sleep", "print", "/dev/null")
    phone.up()
    done = phone.run(TARGET_TEST, "--disrupts-wifi", timeout=900)
    assert done.returncode == 0, done.stdout.decode(errors="replace")
    # The test has ended what it started, and its service goes on.
    assert "engine=idle" in (phone.root / "phone/state/radio").read_text().splitlines()
    for call, answer in [(["getWlanMode"], b"0\n"), (["isSnifferMode"], b"false\n"),
                         (["RunTxBGStart", "6", "54", "15", "1"], b"0\n"),
                         (["RunTxStop", "6"], b"0\n")]:
        assert phone.client(*call).stdout == answer, call
