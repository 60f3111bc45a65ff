# Copyright 2026 The BEX Wi-Fi Authors
# SPDX-License-Identifier: Apache-2.0
"""The driver's private commands: factory tests on one chip, the monitor's channel on newer ones."""

import re

import pytest

from qualcomm import CON_MODE, copies, refusals, test_mode as enter
from support.waiting import wait_for

RATES = ["11B_LONG_1_MBPS", "11B_LONG_5_5_MBPS", "11A_54_MBPS", "MCS_6_5_MBPS", "MCS_72_2_MBPS",
         "MCS_CB_135_MBPS", "MCS_VHT20_NGI_78_MBPS", "MCS_VHT40_NGI_CB_180_MBPS",
         "MCS_VHT80_NGI_CB_29_3_MBPS", "MCS_VHT80_NGI_CB_390_MBPS"]


@pytest.fixture(name="phone_of")
def phone_of_fixture(launcher, patterns, place):
    return copies(launcher, patterns, place)


@pytest.fixture(name="tester")
def tester_fixture(phone_of):
    """A phone in factory test mode, test commands on."""
    phone = enter(phone_of("wcn"))
    phone.output("iwpriv wlan0 ftm 1")
    return phone


def script(*commands):
    return " && ".join(f"iwpriv wlan0 {command} " for command in commands)


def count(phone):
    printed = phone.run("iwpriv", "wlan0", "get_rxpktcnt").stdout
    assert re.fullmatch(r"wlan0     get_rxpktcnt:[0-9]+\n", printed)
    return int(printed.split(":")[1])


@pytest.mark.parametrize("commands, state", [
    # 802.11b/g
    (["ena_chain 2", "set_channel 11", "pwr_cntl_mode 2", "set_txpower 12",
      "set_txrate 11B_LONG_5_5_MBPS", "tx 1"],
     {"engine": "tx", "channel": "11", "power": "12", "rate": "11B_LONG_5_5_MBPS"}),
    # 802.11ac
    (["ena_chain 2", "set_cb 4", "set_channel 36", "pwr_cntl_mode 2", "set_txpower 15",
      "set_txrate MCS_VHT80_NGI_CB_390_MBPS", "tx 1", "tx 0"],
     {"engine": "idle", "bonding": "4", "channel": "36", "ftm": "1"}),
    # single tone
    (["set_cb 0", "set_channel 1", "ena_chain 2", "set_tx_wf_gain 0 1", "tx_cw_rf_gen 1"],
     {"engine": "tone", "gain_to": "1"}),
    (["tx_cw_rf_gen 1", "tx_cw_rf_gen 0", "ftm 0"], {"engine": "idle", "ftm": "0"}),
    # reception
    (["ena_chain 1", "set_channel 6", "rx 0", "clr_rxpktcnt 1", "rx 1"], {"engine": "rx"}),
    # the end of the test commands ends the test
    (["tx 1", "ftm 0"], {"engine": "idle"}),
])
def test_every_sequence_of_the_tests(tester, commands, state):
    assert tester.output(script(*commands)) == ""
    found = tester.driver()
    assert {name: found[name] for name in state} == state


def test_power_save_is_set_in_normal_mode(phone_of):
    phone = phone_of("wcn")
    phone.output(script("ftm 0", "setPower 2", "setPower 10", "setPower 0"))


def test_knows_the_rates_of_the_driver(tester):
    tester.output(script(*(f"set_txrate {rate}" for rate in RATES)))


NONSENSE = ["ftm 2", "ftm", "ena_chain 4", "set_channel 15", "set_channel x", "set_channel",
            "set_cb 5", "pwr_cntl_mode 3", "set_txpower -1", "set_txpower 31", "set_txpower",
            "set_txrate", "set_txrate 11B_LONG_7_MBPS", "set_txrate 11B_LONG_1_MBPS 1",
            "set_txrate MBPS", "tx", "tx 2", "rx on", "clr_rxpktcnt 0", "get_rxpktcnt 1",
            "set_tx_wf_gain 0", "tx_cw_rf_gen", "setPower 11"]


def test_nonsense_is_refused_and_changes_nothing(tester):
    printed = refusals(tester, [f"iwpriv wlan0 {command}" for command in NONSENSE])
    for command, text in zip(NONSENSE, printed, strict=True):
        assert text == ("Interface doesn't accept private ioctl...\n"
                        f"{command.split()[0]} (8BE0): Invalid argument")
    others = ["iwpriv wlan0 nonesuch 1", "iwpriv wlan0 setMonChan 6 0", "iwpriv wlan0",
              "iwpriv eth0 ftm 1"]
    assert refusals(tester, others) == [
        "iwpriv: Invalid command : nonesuch", "iwpriv: Invalid command : setMonChan",
        "iwpriv: Usage: iwpriv wlan0 COMMAND [VALUE...]", "iwpriv: eth0     no private ioctls."]


@pytest.mark.parametrize("bonding, channel", [(4, 6), (1, 14), (2, 165), (4, 165)])
def test_a_bonded_channel_must_fit(tester, bonding, channel):
    assert tester.shell(script(f"set_cb {bonding}", f"set_channel {channel}")).returncode == 255


@pytest.mark.parametrize("command", [
    "ftm 1", "ena_chain 2", "set_channel 6", "set_cb 0", "pwr_cntl_mode 2", "set_txpower 9",
    "set_txrate 11A_6_MBPS", "tx 1", "rx 1", "tx_cw_rf_gen 1", "set_tx_wf_gain 0 1",
    "clr_rxpktcnt 1", "get_rxpktcnt"])
def test_test_commands_need_the_test_mode(phone_of, command):
    result = phone_of("wcn").shell(f"iwpriv wlan0 {command}")
    assert (result.returncode, result.stdout) == (255, "")
    assert result.stderr.endswith("(8BE0): Operation not permitted\n")


def test_what_ends_a_test_succeeds_without_one(phone_of):
    phone_of("wcn").output(script("tx 0", "rx 0", "tx_cw_rf_gen 0", "ftm 0"))


@pytest.mark.parametrize("running", ["tx", "rx", "tx_cw_rf_gen"])
def test_one_test_at_a_time(tester, running):
    tester.output(script(f"{running} 1"))
    for command in ("tx", "rx", "tx_cw_rf_gen"):
        assert tester.shell(f"iwpriv wlan0 {command} 1").stderr.endswith(
            "Device or resource busy\n")
    tester.output(script(f"{running} 0", f"{running} 1"))


def test_packets_are_counted_only_while_receiving(tester):
    assert count(tester) == 0
    tester.output(script("rx 1"))
    wait_for(lambda: count(tester) > 0)
    first = count(tester)
    wait_for(lambda: count(tester) > first)
    tester.output(script("rx 0"))
    stopped = count(tester)
    assert stopped > first and count(tester) == stopped
    tester.output(script("rx 1"))
    wait_for(lambda: count(tester) > stopped)
    tester.output(script("rx 0", "clr_rxpktcnt 1"))
    assert count(tester) == 0


@pytest.mark.parametrize("chip", ["qca639x", "wcn685x", "wcn6750"])
def test_newer_chips_listen_on_a_channel(phone_of, chip):
    phone = phone_of(chip)
    phone.output(f"echo 4 > {CON_MODE}; ifconfig wlan0 up")
    for line, width in (("6 0", "20"), ("6 1", "40"), ("149 2", "80"), ("36 3", "160")):
        phone.output(f"/vendor/bin/iwpriv wlan0 setMonChan {line} ")
        assert phone.driver()["monitor_channel"] == line.split()[0]
        assert phone.driver()["monitor_width"] == width
    lines = ["6 2", "15 0", "149 3", "36 4", "36", "", "x 0", "36 0 0"]
    assert refusals(phone, [f"iwpriv wlan0 setMonChan {line}" for line in lines]) \
        == ["Interface doesn't accept private ioctl...\nsetMonChan (8BE0): Invalid argument"] * 8


def test_listening_needs_monitor_mode_and_the_interface_up(phone_of):
    phone = phone_of("wcn6750")
    listen = "iwpriv wlan0 setMonChan 36 2"
    assert phone.shell(f"echo 4 > {CON_MODE}; {listen}").stderr.endswith("Network is down\n")
    assert phone.shell(f"echo 0 > {CON_MODE}; ifconfig wlan0 up; {listen}").stderr.endswith(
        "Operation not permitted\n")
    assert phone.shell("iwpriv wlan0 ftm 1").stderr == "iwpriv: Invalid command : ftm\n"
