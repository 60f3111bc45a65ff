# Copyright 2026 The BEX Wi-Fi Authors
# SPDX-License-Identifier: Apache-2.0
"""Waiting for what another process does."""

import time


def wait_for(condition):
    """Waits until the condition is true; fails after a minute."""
    deadline = time.monotonic() + 60
    while not condition():
        assert time.monotonic() < deadline, "the condition never came true"
        time.sleep(0.005)


def wait_during(run, condition):
    """Waits, however slow the machine is, until the condition is true or the process has ended."""
    while run.poll() is None and not condition():
        time.sleep(0.005)
