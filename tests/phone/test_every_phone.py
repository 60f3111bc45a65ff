# Copyright 2026 The BEX Wi-Fi Authors
# SPDX-License-Identifier: Apache-2.0
"""All sixteen methods on every simulated phone, through the client."""

import json
import re

import pytest

from support.families import FAMILIES
from support.phone import CHIPS

COUNT = r"\d+"


def session(chip, mimo):
    """Each call with the form of its answer, in an order in which each finds the phone in a state
    that it can work in."""
    family = FAMILIES[chip]
    started = COUNT if family.label else "ok"
    stopped = COUNT if family.label else f"Rx: {COUNT}"
    ax_started = family.ax_started.decode() or "ok"
    ax_stopped = "Rx: " if family.ax_is_idle else stopped
    return [
        (["isMimoSupport"], mimo),
        (["getWlanMode"], "0"),
        (["isSnifferMode"], "false"),
        (["RunTxBGStart", "6", "54", "15", "1"], "0"),
        (["RunTxStop", "6"], "0"),
        (["RunTxNStart", "36", "80", "9", "12", "true", "3"], "0"),
        (["RunTxStop", "36"], "0"),
        (["RunTxAxStart", "36", "80", "9", "12", "0", "1"], "0"),
        (["RunTxStop", "36"], "0"),
        (["RunTxStStart", "11", "20", "1"], "0"),
        (["RunTxStStop", "11"], "0"),
        (["RunRxBgStart", "6", "54", "1"], started),
        (["RunRxStop", "6"], stopped),
        (["RunRxNStart", "149", "40", "7", "false", "2"], started),
        (["RunRxStop", "149"], stopped),
        (["RunRxAxStart", "36", "80", "9", "1"], ax_started),
        (["RunRxStop", "36"], ax_stopped),
        (["RunRxApJoinHoc", "test-ap", "192.168.1.7"], "0"),
        (["snifferStart", "36", "40"], "0"),
        (["isSnifferMode"], "true"),
        (["getWlanMode"], "4"),
        (["snifferStop"], "0"),
        (["getWlanMode"], "0"),
    ]


@pytest.mark.parametrize("chip", CHIPS)
def test_every_method(make_phone, chip):
    """Each call gives its result and runs exactly the lines that explain prints for it."""
    phone = make_phone(chip)
    phone.up()
    mimo = "wlan.mimo=1" in (phone.root / "vendor/build.prop").read_text()
    calls = session(chip, "true" if mimo else "false")
    for call, form in calls:
        seen = phone.log.stat().st_size
        client = phone.client(*call)
        text = client.stdout.decode()
        assert re.fullmatch(f"{form}\n", text), (call, text, phone.commands(seen))
        assert (client.returncode, client.stderr) == (0, b""), call
        commands = phone.commands(seen)
        assert [line for line, _ in commands] == phone.explain(*call), call
        failed = [line for line, ok in commands if not ok]
        assert FAMILIES[chip].ill_fitting or not failed, call
        assert all("insmod " in line for line in failed), call
    methods = json.loads(phone.client("list", "--json").stdout)["methods"]
    assert {call[0] for call, _ in calls} == {method["name"] for method in methods}
    explained = phone.client("RunTxAxStart", "--help").stdout.decode()
    assert f"\nChip family of this phone: {chip}\n" in explained
