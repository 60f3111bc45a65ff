# Copyright 2026 The BEX Wi-Fi Authors
# SPDX-License-Identifier: Apache-2.0
"""An example of a station's plan. Run it on each phone that adb has:

    PYTHONPATH=station pytest -p bexwifi_pytest station/example/plan.py \
        --wifi-phone SERIAL --wifi-phone SERIAL -n 2 --wifi-report report
"""

import time

import pytest

STANDARDS = {
    "802.11b": ("RunTxBGStart", {"channel": 6, "rate": 11}),
    "802.11g": ("RunTxBGStart", {"channel": 6, "rate": 54}),
    "802.11a": ("RunTxBGStart", {"channel": 36, "rate": 54}),
    "802.11n": ("RunTxNStart", {"channel": 6, "bandwidth": 20, "rate": 7, "vht": False}),
    "802.11ac": ("RunTxNStart", {"channel": 36, "bandwidth": 80, "rate": 9, "vht": True}),
    "802.11ax": ("RunTxAxStart", {"channel": 36, "bandwidth": 80, "rate": 9, "guardInterval": 0}),
}


def test_identity(phone, measure):
    doctor = phone.doctor()
    assert doctor.ok, [check.found for check in doctor.checks if check.status == "problem"]
    mimo = phone.call("isMimoSupport")
    measure("MIMO", mimo.value)
    measure("client", mimo.client_version)
    measure("driver mode", phone.call("getWlanMode").value, low=0, high=0)


@pytest.mark.parametrize("standard", STANDARDS)
def test_transmission(phone, measure, standard):
    method, arguments = STANDARDS[standard]
    with phone.transmit(method, **arguments, power=15, antenna=1) as transmission:
        pass  # the station's power meter measures here
    measure("time to start", transmission.started.duration, "s", high=60, at={"standard": standard})


def test_reception(phone, measure):
    for rate in 6, 54:
        for channel in 1, 6, 11, 36:
            with phone.receive("RunRxBgStart", channel=channel, rate=rate, antenna=1) as reception:
                time.sleep(0.2)  # the station's generator sends here; a simulated phone always receives
            measure("packets received", reception.packets, "packets", low=150,
                    at={"channel": channel, "rate": rate})


def test_monitor_mode(phone):
    with phone.monitor(channel=6, bandwidth=20):
        assert phone.call("isSnifferMode").value
    assert not phone.call("isSnifferMode").value
