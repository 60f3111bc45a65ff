# Copyright 2026 The BEX Wi-Fi Authors
# SPDX-License-Identifier: Apache-2.0
"""Every test here drives simulated phones by the station kit and the real adb: see support/adb.py."""

import contextlib

import pytest

import bexwifi
from support.adb import adb_fixture, made_phone  # noqa: F401  (pytest finds the fixture here)


@pytest.fixture(scope="session", autouse=True)
def kit_environment(adb):
    """The kit runs adb with the server of the tests."""
    with pytest.MonkeyPatch.context() as patch:
        for name, value in adb.environment.items():
            patch.setenv(name, value)
        adb("start-server")
        yield


@pytest.fixture(scope="session", name="phone_of")
def phone_of_fixture(adb):
    """The simulated phone of a chip, which the tests share."""
    phones = {}
    with contextlib.ExitStack() as ends:

        def phone_of(chip):
            if chip not in phones:
                phones[chip] = ends.enter_context(made_phone(adb, chip))
                phones[chip].up()
            return phones[chip]

        yield phone_of


@pytest.fixture(name="simulated")
def simulated_fixture(phone_of):
    """A simulated phone; its faults end with the test."""
    phone = phone_of("broadcom")
    yield phone
    for tool in ("wl", "ifconfig"):
        phone.fault(tool, "clear")


@pytest.fixture(name="phone")
def phone_fixture(simulated):
    """The kit's phone for it."""
    return bexwifi.Phone(simulated.serial)


@pytest.fixture(name="own")
def own_fixture(adb):
    """A phone that the test may spoil."""
    with made_phone(adb, "wcn") as simulated:
        simulated.up()
        yield simulated
