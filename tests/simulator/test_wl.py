# Copyright 2026 The BEX Wi-Fi Authors
# SPDX-License-Identifier: Apache-2.0
"""The chip's tool, and the driver under it."""

import subprocess

import pytest

from conftest import ENDLESS
from support.waiting import wait_for

FIRMWARE = "/sys/module/bcmdhd/parameters/firmware_path"
MAC = "00:11:22:33:44:55"
COUNT = ("wl counters  | busybox grep pktengrxdmcast | busybox awk '{for(i = 1;i <= NF;i++) "
         "{if(\"pktengrxdmcast\" == $i) print $(i + 1)} }' ")
TEST_MODE = ('ifconfig wlan0 down ; echo -n "/etc/firmware/fw_bcmdhd_mfg.bin" > '
             f"{FIRMWARE} ; ifconfig wlan0 up")


@pytest.fixture(scope="module", name="new_tester")
def new_tester_fixture(new_phone, patterns):
    phone = new_phone.copy(patterns / "tester")
    phone.output(TEST_MODE)
    return phone


@pytest.fixture(name="tester")
def tester_fixture(new_tester, place):
    """A phone on its manufacturing firmware, interface up."""
    return new_tester.copy(place / "phone")


def refusal(phone, line):
    """What a failing command prints on stderr; nothing goes to stdout."""
    result = phone.shell(line)
    assert result.returncode == 1 and result.stdout == "", result
    return result.stderr


def test_bringing_the_interface_up_loads_the_firmware(phone):
    phone.output("ifconfig wlan0 up")
    assert phone.driver()["firmware"] == "production"
    phone.output(TEST_MODE)
    assert phone.driver()["firmware"] == "manufacturing"
    phone.output("ifconfig wlan0 down")
    assert phone.driver()["firmware"] == ""


def test_a_firmware_change_counts_from_the_next_up(phone):
    phone.output(f"ifconfig wlan0 up; echo -n /etc/firmware/fw_bcmdhd_mfg.bin > {FIRMWARE}; "
                 "ifconfig wlan0 up")
    assert phone.driver()["firmware"] == "production"


@pytest.mark.parametrize("spoil", [
    f"echo -n /etc/firmware/none.bin > {FIRMWARE}", f"echo -n > {FIRMWARE}",
    "rm /etc/firmware/fw_bcmdhd.bin", "echo rubbish > /etc/firmware/fw_bcmdhd.bin",
    f"rm {FIRMWARE}"])
def test_without_firmware_the_interface_stays_down(phone, spoil):
    phone.output(spoil)
    assert "ifconfig: ioctl 8914: Operation not permitted\n" in refusal(phone, "ifconfig wlan0 up")
    assert "UP" not in phone.output("ifconfig wlan0")


@pytest.mark.parametrize("command", ["up", "mpc 0", "counters", "fqacurcy 0", "nonesuch"])
def test_needs_the_interface_up(phone, command):
    assert refusal(phone, f"wl {command}") == "wl: wl driver adapter not found\n"


@pytest.mark.parametrize("command", [
    f"pkteng_start {MAC} rx", "pkteng_stop tx", "fqacurcy 6", "fqacurcy 0"])
def test_tests_need_the_manufacturing_firmware(phone, command):
    assert refusal(phone, f"ifconfig wlan0 up; wl {command}") == "wl: Unsupported\n"


@pytest.mark.parametrize("lines, state", [
    # 802.11b/g transmission, channel 6 and 36
    (["mpc 0", "phy_watchdog 0", "up", "country ALL", "band b", "2g_rate -r 5.5 -b 20", "channel 6",
      "phy_forcecal 1", "scansuppress 1", "phy_txpwrctrl 1", "txpwr1 -o -d 15", "pkteng_stop tx",
      "txchain 1", f"pkteng_start {MAC} tx 100 1024 0"],
     {"engine": "tx", "channel": "6", "power": "15", "txchain": "1", "mpc": "0"}),
    (["band a", "5g_rate -r 54 -b 20", "channel 36", f"pkteng_start {MAC} tx 100 1024 0"],
     {"engine": "tx", "channel": "36", "rate_5g": "-r 54 -b 20 -s 1"}),
    # 802.11n and ac
    (["down", "mpc 0", "bw_cap 2g 3", "up", "country ALL", "band a", "5g_rate -v 9 -b 80 -s 2",
      "chanspec 36/80", "chanspec -s 0 -c 36 -w 80 -b 5", "txpwr1 -o -d 12", "txchain 3",
      f"pkteng_start {MAC} tx 100 1024 0", "pkteng_stop tx"],
     {"engine": "idle", "channel": "36", "width": "80", "bw_cap_2g": "3"}),
    (["band b", "2g_rate -h 7 -b 40", "chanspec 6/40", "chanspec -s 0 -c 6 -w 40 -b 2"],
     {"width": "40", "rate_2g": "-h 7 -b 40 -s 1"}),
    # single tone
    (["band b", "txchain 2", "out", "fqacurcy 11"], {"tone": "11", "core": "out"}),
    (["band b", "out", "fqacurcy 11", "fqacurcy 0"], {"tone": "0"}),
    # reception and the join
    (["band a", "chanspec 149/40", "rxchain 3", f"pkteng_start {MAC} rx"], {"engine": "rx"}),
    (["join lab imode bss", "mpc 0", "PM 0", "scansuppress 1", "frameburst 1", "roam_off 1"],
     {"ssid": "lab", "PM": "0"}),
])
def test_every_sequence_of_the_tests(tester, lines, state):
    assert tester.output(" && ".join(f"wl {line} " for line in lines)) == ""
    found = tester.driver()
    assert {name: found[name] for name in state} == state


NONSENSE = [
    ("nonesuch", "Unsupported"), ("nonesuch 1", "Unsupported"),
    ("mpc 2", "Bad Argument"), ("mpc x", "Bad Argument"), ("mpc 0 0", "Bad Argument"),
    ("up now", "Bad Argument"), ("country all", "Bad Argument"), ("band c", "Bad Argument"),
    ("channel 15", "Bad Channel"), ("channel x", "Bad Channel"), ("channel 0", "Bad Channel"),
    ("chanspec 6/80", "Bad Channel"), ("chanspec 165/40", "Bad Channel"),
    ("chanspec 36/", "Bad Argument"), ("chanspec -c 6 -w 20 -b 5", "Bad Argument"),
    ("chanspec -s 0 -c", "Bad Argument"), ("bw_cap 2g 3", "Not Down"), ("bw_cap 6g 3",
                                                                      "Bad Argument"),
    ("2g_rate -r 7 -b 20", "Bad Rate Set"), ("5g_rate -r 11 -b 20", "Bad Rate Set"),
    ("2g_rate -h 7 -b 80", "Bad Argument"), ("5g_rate -v 10 -b 80 -s 1", "Bad Rate Set"),
    ("5g_rate -v 9 -b 80 -s 3", "Bad Argument"), ("2g_rate -b 20", "Bad Rate Set"),
    ("2g_rate -r", "Bad Argument"),
    ("txpwr1 15", "Bad Argument"), ("txpwr1 -o -d", "Bad Argument"),
    ("txpwr1 -o -d loud", "Bad Argument"), ("txpwr1 -o -d -1", "Not In Range"),
    ("txchain 0", "Bad Argument"), ("rxchain 4", "Bad Argument"), ("PM 3", "Bad Argument"),
    ("pkteng_start 00:11 rx", "Bad Argument"), (f"pkteng_start {MAC}", "Bad Argument"),
    (f"pkteng_start {MAC} tx 100 1024", "Bad Argument"), (f"pkteng_start {MAC} up", "Bad Argument"),
    (f"pkteng_start {MAC} tx 100 0 0", "Bad Argument"), ("pkteng_stop", "Bad Argument"),
    ("out", "Not band locked"), ("fqacurcy 6", "Not Down"), ("fqacurcy", "Bad Argument"),
    ("join", "Bad SSID Len"), (f"join {'x' * 33}", "Bad SSID Len"),
    ("join my lab imode bss", "Bad Argument"), ("", "no command; wl COMMAND [VALUE...]"),
]


def test_nonsense_is_refused_and_changes_nothing(tester):
    state = tester.driver()
    result = tester.shell("".join(f"wl {command} 2>&1; print $?; " for command, _ in NONSENSE))
    found = iter(result.stdout.splitlines())
    for command, complaint in NONSENSE:
        assert (next(found), next(found)) == (f"wl: {complaint}", "1"), command
    assert tester.driver() == state


def test_a_channel_of_the_other_band_is_refused(tester):
    tester.output("wl band b")
    assert refusal(tester, "wl channel 36") == "wl: Bad Band\n"
    tester.output("wl band a")
    assert tester.driver()["channel"] == "36"


@pytest.mark.parametrize("command", [f"pkteng_start {MAC} rx", "channel 6", "join lab"])
def test_a_core_that_is_down_does_nothing(tester, command):
    tester.output("wl down")
    assert refusal(tester, f"wl {command}") == "wl: Not Up\n"


def test_a_second_engine_start_is_refused(tester):
    tester.output(f"wl pkteng_start {MAC} rx")
    assert refusal(tester, f"wl pkteng_start {MAC} rx") == "wl: Busy\n"


def test_without_a_value_the_present_one_is_printed(tester):
    assert tester.output("wl txchain ; wl country; wl chanspec; wl txpwr1; wl 2g_rate; "
                         "wl bw_cap 5g") \
        == "3\nUS\n1/20\nauto\nauto\n7"
    assert "current mac channel\t1\n" in tester.output("wl channel ")


def test_counters_are_a_long_listing_of_names_and_numbers(tester):
    lines = tester.output("wl counters").splitlines()
    words = [line.split() for line in lines]
    assert len(lines) > 10 and max(map(len, words)) > 8
    assert all(len(line) % 2 == 0 and all(number.isdigit() for number in line[1::2])
               for line in words)


def test_packets_are_counted_only_while_receiving(tester):
    assert tester.output(COUNT) == "0"
    tester.output(f"wl pkteng_start {MAC} rx")
    wait_for(lambda: int(tester.output(COUNT)) > 0)
    first = int(tester.output(COUNT))
    wait_for(lambda: int(tester.output(COUNT)) > first)
    tester.output("wl pkteng_stop rx")
    stopped = tester.output(COUNT)
    assert int(stopped) > first
    assert tester.output(COUNT) == stopped
    tester.output(f"wl pkteng_start {MAC} rx")
    wait_for(lambda: int(tester.output(COUNT)) > int(stopped))
    tester.output(TEST_MODE)
    assert tester.output(COUNT) == "0"


def test_transmitting_counts_no_packets(tester):
    tester.output(f"wl pkteng_start {MAC} tx 100 1024 0")
    assert tester.output(f"{COUNT}; sleep 0.01; {COUNT}") == "0\n0"


def test_commands_at_once_lose_nothing(tester):
    """Each of them changes the state that all the others change, too."""
    lines = ["mpc 0", "phy_watchdog 0", "scansuppress 1", "frameburst 1", "roam_off 1", "PM 0",
             "txchain 1", "rxchain 2", "country ALL", "phy_forcecal 1", "channel 11",
             "txpwr1 -o -d 9"]
    tester.output("".join(f"wl {line} & " for line in lines) + "wait")
    expected = {"mpc": "0", "phy_watchdog": "0", "scansuppress": "1", "frameburst": "1",
                "roam_off": "1", "PM": "0", "txchain": "1", "rxchain": "2", "country": "ALL",
                "phy_forcecal": "1", "channel": "11", "power": "9"}
    state = tester.driver()
    assert {name: state[name] for name in expected} == expected


def test_a_killed_tool_leaves_no_lock(tester):
    holder = tester.start(f". /phone/lib/radio; radio_open; echo locked; sleep {ENDLESS}",
                          stdout=subprocess.PIPE)
    assert holder.stdout.readline() == b"locked\n"
    holder.kill()
    holder.communicate()
    assert tester.output("wl mpc") == "1"
