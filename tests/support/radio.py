# Copyright 2026 The BEX Wi-Fi Authors
# SPDX-License-Identifier: Apache-2.0
"""What the radio of a simulated phone does, read from outside: the phone need not be up."""


def radio_use(phone):
    """"idle", "tx", "rx", "tone" or "monitor"."""
    radio = phone.root / "phone/state/radio"
    text = radio.read_text() if radio.exists() else "engine=idle"  # no tool has run yet
    state = dict(line.replace("'", "").split("=", 1) for line in text.splitlines())
    mode = phone.root / "sys/module/wlan/parameters/con_mode"
    if mode.exists() and mode.read_text().strip() == "4":
        return "monitor"
    return "tone" if state.get("tone", "0") != "0" else state["engine"]
