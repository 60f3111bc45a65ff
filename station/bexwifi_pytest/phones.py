# Copyright 2026 The BEX Wi-Fi Authors
# SPDX-License-Identifier: Apache-2.0
"""Which test is for which phone: the phone's part of a test's name."""

import urllib.parse

import pytest


def identifier(serial):
    """A serial number as it appears in a test's name: printable, without the characters that mean
    something there."""
    return urllib.parse.quote(serial, safe=":+=,", errors="surrogateescape")


def check(serials):
    """Raises pytest.UsageError."""
    if not serials:
        raise pytest.UsageError("no phone: give its serial number with --wifi-phone SERIAL,"
                                " once for each phone; `adb devices` lists them")
    for serial in serials:
        if not serial.strip():
            raise pytest.UsageError("--wifi-phone: the serial number is empty")
        if serials.count(serial) > 1:
            raise pytest.UsageError(f"--wifi-phone {identifier(serial)} is there more than once")


def parametrize(metafunc, serials):
    """Runs the test once on each phone; first, so that the phone comes first in the test's name."""
    xdist = metafunc.config.pluginmanager.hasplugin("xdist")
    metafunc.parametrize("phone", [
        pytest.param(serial, id=identifier(serial),
                     # All tests of a phone run in one worker.
                     marks=[pytest.mark.xdist_group(str(number))] if xdist else [])
        for number, serial in enumerate(serials, 1)], indirect=True, scope="session")


def without_group(nodeid):
    """The test's name without what xdist appends, `@` and the group."""
    return nodeid[:nodeid.rindex("@")] if nodeid.rfind("@") > nodeid.rfind("]") > -1 else nodeid


def split(nodeid, serials):
    """(serial number, test): ("R58M", "plan.py::test_sweep[6]") of `plan.py::test_sweep[R58M-6]`. The
    serial number is empty when the test has no phone."""
    path, _, name = nodeid.partition("::")
    name = f"{path.rpartition('/')[2]}::{name}" if name else path
    before, bracket, rest = name.partition("[")
    for serial in sorted(serials, key=len, reverse=True):
        known = identifier(serial)
        if bracket and rest.startswith((f"{known}]", f"{known}-")):
            others = rest[len(known):].lstrip("-")
            return serial, before if others == "]" else f"{before}[{others}"
    return "", name
