# Copyright 2026 The BEX Wi-Fi Authors
# SPDX-License-Identifier: Apache-2.0
"""Calls and uses of the radio through the kit, on phones that are well."""

import datetime
import json

import pytest

import bexwifi
from support.radio import radio_use


def starts_of(phone):
    """One `with` block for each start, with the start's name."""
    return {
        "RunTxBGStart": phone.transmit("RunTxBGStart", channel=6, rate="5.5", power=20, antenna=1),
        "RunTxNStart": phone.transmit("RunTxNStart", 36, 40, 7, 15, True, 1),
        "RunTxAxStart": phone.transmit("RunTxAxStart", 36, 80, 7, 15, guardInterval=0, antenna=1),
        "RunTxStStart": phone.tone(channel=6, bandwidth=20, antenna=1),
        "RunRxBgStart": phone.receive("RunRxBgStart", 6, 11, 1),
        "RunRxNStart": phone.receive("RunRxNStart", 36, 40, 7, False, 1),
        "RunRxAxStart": phone.receive("RunRxAxStart", 36, 80, 7, 1),
        "snifferStart": phone.monitor(channel=6, bandwidth=20),
    }


def test_the_methods_are_those_of_the_client(phone, simulated):
    listed = json.loads(simulated.shell("bex-wifi-client list --json")[1])["methods"]
    assert list(phone.methods) == [method["name"] for method in listed]
    channel = phone.methods["RunTxStop"].arguments[0]
    assert (channel.name, channel.type, channel.unit) == ("channel", "string", None)
    assert set(starts_of(phone)) == {name for name in phone.methods if name.endswith("Start")}


def test_a_call_s_answer(phone):
    before = datetime.datetime.now(datetime.timezone.utc)
    answer = phone.call("isMimoSupport")
    after = datetime.datetime.now(datetime.timezone.utc)
    assert (answer.method, answer.arguments, answer.value, answer.count) == (
        "isMimoSupport", {}, True, None)
    moment = datetime.timedelta(milliseconds=1)
    assert before - moment <= answer.started_at <= after
    assert 0 <= answer.duration <= (after - before).total_seconds()
    assert (answer.exit_code, answer.error, answer.radio_may_be_on) == (0, None, None)
    assert answer.client_version.count(".") == 2


@pytest.mark.parametrize("name", ["my lab", "it's \"5 GHz\"", "$HOME `id` \\ *", "--lab", "é\n"])
def test_arguments_arrive_as_they_are(phone, simulated, name):
    simulated.fault("ifconfig", "exit", "1")
    with pytest.raises(bexwifi.CommandFailed) as failed:
        phone.call("RunRxApJoinHoc", name, address="10.0.0.2")
    assert failed.value.answer.arguments == {"ssid": name, "address": "10.0.0.2"}


USES = {"RunTxBGStart": "tx", "RunTxNStart": "tx", "RunTxStStart": "tone", "RunRxBgStart": "rx",
        "RunRxNStart": "rx", "snifferStart": "monitor"}


@pytest.mark.parametrize("chip", ["broadcom", "qca639x", "wcn"])
def test_the_radio_is_in_use_in_the_block_and_idle_after_it(phone_of, chip):
    simulated = phone_of(chip)
    for method, use in starts_of(bexwifi.Phone(simulated.serial)).items():
        with use as entered:
            assert entered is use
            assert (use.started.method, use.started.radio_may_be_on) == (method, True)
            assert radio_use(simulated) == USES.get(method, radio_use(simulated))
        assert radio_use(simulated) == "idle", method
        assert use.ended.exit_code == 0


def test_packets_are_the_difference_where_the_chip_counts_on(phone, simulated, tmp_path):
    def count(packets):
        (tmp_path / "counters").write_text(f"pktengrxdmcast {packets}\n")
        simulated.fault("wl", "--when", "counters", "print", tmp_path / "counters")

    count(500)
    with phone.receive("RunRxBgStart", channel=6, rate=11, antenna=1) as reception:
        with pytest.raises(bexwifi.NoCount):
            reception.packets  # pylint: disable=pointless-statement
        count(1482)
    assert reception.packets == 982
    with phone.receive("RunRxBgStart", channel=6, rate=11, antenna=1) as reception:
        count(1480)
    with pytest.raises(bexwifi.NoCount, match="1482.*1480"):
        reception.packets  # pylint: disable=pointless-statement


def test_packets_are_the_count_where_the_chip_begins_anew(phone_of, tmp_path):
    simulated = phone_of("qca639x")
    phone = bexwifi.Phone(simulated.serial)
    with phone.receive("RunRxNStart", 36, 40, 7, False, 1) as reception:
        (tmp_path / "statistics").write_text("goodPackets : 977\n")
        simulated.fault("myftm", "--when", "*-t 0", "print", tmp_path / "statistics")
    simulated.fault("myftm", "clear")
    assert reception.packets == 977
