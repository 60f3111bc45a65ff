# Copyright 2026 The BEX Wi-Fi Authors
# SPDX-License-Identifier: Apache-2.0
"""ifconfig, iw and the properties."""

import pytest

CON_MODE = "/sys/module/wlan/parameters/con_mode"


def test_ifconfig_gives_an_address(phone):
    phone.output("ifconfig wlan0 192.168.1.7 up ")
    assert "inet addr:192.168.1.7\n" in phone.output("ifconfig wlan0")
    phone.output("/vendor/bin/ifconfig wlan0 down")
    assert "inet" not in phone.output("ifconfig")
    phone.output("ifconfig wlan0 10.0.0.1")
    assert " UP " in phone.output("ifconfig wlan0")


@pytest.mark.parametrize("arguments, complaint", [
    ("wlan1 up", "ioctl 8914: No such device"), ("eth0 down", "ioctl 8914: No such device"),
    ("wlan0 sideways", "bad argument 'sideways'"), ("wlan0 1.2.3 up", "bad argument '1.2.3'"),
    ("wlan0 1.2.3.256 up", "bad argument '1.2.3.256'"), ("wlan0 '' up", "bad argument ''"),
    ("wlan0 1.2.3.4.5", "bad argument '1.2.3.4.5'"),
])
def test_ifconfig_refuses(phone, arguments, complaint):
    result = phone.shell(f"ifconfig {arguments}; echo $?; ifconfig")
    assert result.stdout.startswith("1\nwlan0 ") and " UP " not in result.stdout
    assert result.stderr == f"ifconfig: {complaint}\n"


@pytest.mark.parametrize("channel, mode", [
    ("6", "HT20"), ("14", "HT20"), ("165", "HT20"), ("1", "HT40+"), ("36", "HT40+"),
    ("149", "HT40+"), ("6", "HT40-"), ("40", "HT40-")])
def test_iw_sets_a_channel(phone, channel, mode):
    phone.output(f"echo 4 > {CON_MODE} ; /vendor/bin/ifconfig wlan0 up ; "
                 f"/vendor/bin/iw wlan0 set channel {channel} {mode} ")
    state = phone.driver()
    assert (state["monitor_channel"], state["monitor_width"]) == (channel, mode)


@pytest.mark.parametrize("channel, mode", [
    ("15", "HT20"), ("0", "HT20"), ("1", "HT40-"), ("36", "HT40-"), ("165", "HT40+"),
    ("14", "HT40+")])
def test_iw_refuses_what_the_kernel_refuses(phone, channel, mode):
    result = phone.shell(f"echo 4 > {CON_MODE}; ifconfig wlan0 up; "
                         f"iw wlan0 set channel {channel} {mode}")
    assert (result.returncode, result.stdout) == (234, "")
    assert result.stderr == "command failed: Invalid argument (-22)\n"


@pytest.mark.parametrize("arguments", ["", "wlan0 set channel", "wlan0 set channel x HT20",
                                       "wlan1 set channel 6", "wlan0 set channel 6 HT80",
                                       "wlan0 set channel 6 HT20 now"])
def test_iw_usage(phone, arguments):
    result = phone.shell(f"iw {arguments}")
    assert (result.returncode, result.stdout) == (1, "")
    assert "Usage: iw" in result.stderr


def test_iw_needs_the_interface_and_monitor_mode(phone):
    result = phone.shell(f"echo 4 > {CON_MODE}; iw wlan0 set channel 6 HT20")
    assert (result.returncode, result.stderr) == (156, "command failed: Network is down (-100)\n")
    result = phone.shell(f"echo 0 > {CON_MODE}; ifconfig wlan0 up; iw wlan0 set channel 6 HT20")
    assert (result.returncode, result.stderr) \
        == (240, "command failed: Device or resource busy (-16)\n")


def test_properties_are_kept(phone):
    phone.output("setprop vendor.x 'a b  c=d'")
    assert phone.output("getprop vendor.x") == "a b  c=d"
    phone.output("setprop vendor.x ''")
    assert phone.output("getprop vendor.x fallback") == "fallback"
    assert phone.output("getprop nonesuch") == ""
    phone.output("setprop log.tag V")
    assert phone.output("getprop").splitlines() == [
        "[log.tag]: [V]", "[ro.hardware.wlan.chip]: [bcm4375]", "[ro.hardware.wlan.mimo]: [1]",
        "[ro.hardware.wlan.vendor]: [broadcom]", "[vendor.x]: []"]


@pytest.mark.parametrize("arguments", [
    "", "vendor.x", "vendor.x 1 2", "'' 1", ".x 1", "x. 1", "a..b 1", "a/b 1", "'a b' 1",
    "ro.hardware.wlan.chip other", f"vendor.x {'v' * 92}"])
def test_setprop_refuses(phone, arguments):
    result = phone.shell(f"setprop {arguments}; echo $?; getprop")
    assert result.stdout.splitlines() == [
        "1", "[log.tag]: [D]", "[ro.hardware.wlan.chip]: [bcm4375]", "[ro.hardware.wlan.mimo]: [1]",
        "[ro.hardware.wlan.vendor]: [broadcom]"]
    assert result.stderr.startswith("setprop: ") and result.stderr.count("\n") == 1


def test_properties_control_the_capture_services(phone):
    states = "; ".join(f"setprop vendor.hardware.wlan.run{service} {word}; "
                       f"getprop init.svc.vendor.{service}"
                       for service in ("sniffer", "tcpdump") for word in ("start", "stop", "x"))
    assert phone.output(states).split() == ["running", "stopped", "stopped"] * 2


def test_properties_set_at_once_all_stay(phone):
    names = [f"vendor.p{number}" for number in range(12)]
    phone.output("".join(f"setprop {name} {name} & " for name in names) + "wait")
    assert phone.output("; ".join(f"getprop {name}" for name in names)).split() == names
