# Copyright 2026 The BEX Wi-Fi Authors
# SPDX-License-Identifier: Apache-2.0
"""The wlan driver and its modules, the network tools, and init's services."""

import pytest

from qualcomm import CON_MODE, DRIVERS, MODULES, copies, refusals, replace, test_mode as enter

TOOLS = {
    "wcn": "ifconfig insmod iw iwconfig iwlist iwpriv ping rmmod",
    "qca639x": "ifconfig insmod iwconfig iwlist iwpriv myftm ping rmmod",
    "wcn6750": "ifconfig insmod iwconfig iwlist iwpriv myftm ping rmmod start stop",
}


@pytest.fixture(name="phone_of")
def phone_of_fixture(launcher, patterns, place):
    return copies(launcher, patterns, place)


def loaded(phone):
    """The modules that are loaded; the tools record the state when they change it."""
    return sorted(phone.driver()["modules"].split())


@pytest.mark.parametrize("chip", DRIVERS)
def test_every_driver_reloads_in_both_modes(phone_of, chip):
    phone = phone_of(chip)
    assert phone.output(f"cat {CON_MODE}; ifconfig wlan0").startswith("0")
    for parameter, mode in (("con_mode=5", "5"), ("", "0"), ("con_mode=4", "4")):
        phone.output(f"/vendor/bin/rmmod wlan.ko && /vendor/bin/insmod {DRIVERS[chip]} {parameter}")
        assert phone.output(f"cat {CON_MODE}") == mode
        assert loaded(phone) == ["wlan"]
    phone.output(f"rmmod wlan && insmod {DRIVERS[chip]}")


@pytest.mark.parametrize("chip", ["wcn", "wcn685x"])
def test_without_the_driver_there_is_no_interface_and_no_mode(phone_of, chip):
    phone = phone_of(chip)
    phone.output("rmmod wlan.ko")
    lines = {
        "rmmod wlan.ko": "rmmod: failed to unload wlan: No such file or directory",
        "rmmod wlan": "rmmod: failed to unload wlan: No such file or directory",
        "ifconfig wlan0 up": "ifconfig: ioctl 8914: No such device",
        "ifconfig wlan0 192.168.1.9": "ifconfig: ioctl 8914: No such device",
        "iwlist wlan0 scan": "iwlist: wlan0     Interface doesn't support scanning.",
        "iwpriv wlan0 ftm 0": "iwpriv: wlan0     no private ioctls.",
        "ping -c 4 192.168.1.1": "ping: connect: Network is unreachable",
    }
    assert refusals(phone, lines) == list(lines.values())
    assert phone.shell("iwconfig wlan0 essid bench").returncode == 1
    assert "No such file or directory" in phone.shell(f"cat {CON_MODE}").stderr
    assert phone.shell(f"echo 5 > {CON_MODE}").returncode == 1


def test_iw_finds_no_interface_without_the_driver(phone_of):
    result = phone_of("qca").shell("rmmod wlan; iw wlan0 set channel 6 HT20")
    assert (result.returncode, result.stderr) == (237, "command failed: No such device (-19)\n")


def test_insmod_refuses_as_the_kernel_does(phone_of):
    phone = phone_of("wcn685x")
    phone.output("rmmod wlan")
    path = f"{MODULES}/qca_cld3_"
    fits = DRIVERS["wcn685x"]
    lines = {
        "insmod": "insmod: Needs 1 argument",
        f"insmod {path}none.ko": f"insmod: {path}none.ko: No such file or directory",
        f"insmod {MODULES}": f"insmod: {MODULES}: No such file or directory",
        f"/vendor/bin/insmod {path}qca6390.ko con_mode=5":
            f"insmod: failed to load {path}qca6390.ko: No such device",
        f"insmod {path}wcn7850.ko": f"insmod: failed to load {path}wcn7850.ko: "
                                    "Invalid module format",
        f"insmod {fits} con_mode=7": f"insmod: failed to load {fits}: Invalid argument",
        f"insmod {fits} con_mode=": f"insmod: failed to load {fits}: Invalid argument",
    }
    assert refusals(phone, lines) == list(lines.values())
    assert not (phone.root / "sys/module/wlan").exists()
    phone.output(f"insmod {fits} unknown=1")
    assert refusals(phone, [f"insmod {fits} con_mode=5"]) \
        == [f"insmod: failed to load {fits}: File exists"]
    assert phone.output(f"cat {CON_MODE}") == "0"


def test_a_spoiled_module_is_refused(phone_of):
    phone = phone_of("qca")
    replace(phone, DRIVERS["qca"], "rubbish\n")
    assert "Invalid module format" in phone.shell(f"rmmod wlan; insmod {DRIVERS['qca']}").stderr
    replace(phone, DRIVERS["qca"], "")
    assert phone.shell(f"insmod {DRIVERS['qca']}").returncode == 1
    assert phone.shell("ifconfig wlan0 up").returncode == 1


def test_another_module_comes_and_goes_alone(phone_of):
    phone = phone_of("wcn6750")
    phone.output(f"insmod {MODULES}/rmnet.ko con_mode=5")
    assert phone.output(f"cat {CON_MODE}") == "0"
    assert loaded(phone) == ["rmnet", "wlan"]
    phone.output("rmmod wlan.ko")
    assert loaded(phone) == ["rmnet"]
    phone.output("rmmod rmnet")
    assert loaded(phone) == []


@pytest.mark.parametrize("order", ["qca6390 spectral", "spectral qca6390"])
def test_a_driver_of_two_modules_reloads_whole(phone_of, order):
    phone = phone_of("qca639x")
    reload = "rmmod wlan.ko && " + " && ".join(
        f"/vendor/bin/insmod {MODULES}/qca_cld3_{name}.ko con_mode=5" for name in order.split())
    for _ in range(2):
        phone.output(reload)
        assert loaded(phone) == ["wlan", "wlan_spectral"]
        assert phone.output(f"cat {CON_MODE}") == "5"


def test_a_reload_forgets_all_but_the_mode(phone_of):
    phone = enter(phone_of("wcn"))
    phone.output("iwpriv wlan0 ftm 1; iwpriv wlan0 set_channel 36; iwpriv wlan0 tx 1; "
                 "ifconfig wlan0 192.168.1.9; iwconfig wlan0 essid bench; rmmod wlan")
    phone.output(f"insmod {DRIVERS['wcn']}")
    found = phone.driver()
    expected = {"interface": "down", "address": "", "ssid": "", "ftm": "0", "channel": "1",
                "engine": "idle"}
    assert {name: found[name] for name in expected} == expected


def test_power_on_loads_the_driver_normally(phone_of):
    phone = enter(phone_of("qca"))
    phone.output("rmmod wlan")
    phone.output("sh /phone/lib/init boot /system/bin/true")
    assert phone.output(f"cat {CON_MODE}; ifconfig wlan0").startswith("0")


def test_a_mode_file_that_cannot_be_read(phone_of):
    phone = phone_of("wcn39xx")
    (phone.root / CON_MODE[1:]).chmod(0)
    assert phone.shell(f"/vendor/bin/cat {CON_MODE}").returncode == 1
    phone.output("ifconfig wlan0 up")
    assert phone.shell("/vendor/bin/iw wlan0 set channel 6 HT20").returncode == 240
    assert phone.shell("/vendor/bin/myftm -a 1 -f 2412 -t 1").returncode == 1


@pytest.mark.parametrize("chip", ["wcn", "qca", "wcn39xx"])
def test_iw_listens_in_monitor_mode(phone_of, chip):
    phone = phone_of(chip)
    listen = "/vendor/bin/iw wlan0 set channel 36 HT40+"
    assert phone.shell(f"ifconfig wlan0 up; {listen}").returncode == 240
    phone.output(f"echo 4 > {CON_MODE} && {listen}")
    assert phone.driver()["monitor_channel"] == "36"


@pytest.mark.parametrize("chip", DRIVERS)
def test_joins_a_network_in_every_mode(phone_of, chip):
    phone = phone_of(chip)
    ping = "/vendor/bin/ping -c 4 192.168.1.1"
    lines = ["iwlist wlan0 scan", "/vendor/bin/iwconfig wlan0 essid bench-2g",
             "ifconfig wlan0 192.168.1.77 up"]
    assert phone.output(lines[0]).count("ESSID:") == 2
    for left_out in range(1, 3):
        assert phone.shell(f"ifconfig wlan0 down; {lines[left_out]}; {ping}").returncode == 2
        phone.output(f"rmmod wlan; insmod {DRIVERS[chip]} con_mode=5")
    printed = phone.output(" && ".join(lines + [ping]))
    assert printed.count("64 bytes from 192.168.1.1") == 4
    assert "4 packets transmitted, 4 received, 0% packet loss" in printed
    assert phone.shell(f"ifconfig wlan0 down; {ping}").returncode == 2


def test_the_network_tools_refuse_nonsense(phone_of):
    lines = ["iwlist wlan0", "iwlist eth0 scan", "iwconfig wlan0 essid", "iwconfig wlan0 essid ''",
             "iwconfig wlan0 essid my lab", f"iwconfig wlan0 essid {'x' * 33}", "iwconfig",
             "ping", "ping -c x 192.168.1.1", "ping -c 4", "rmmod", "rmmod wlan rmnet",
             "ifconfig wlan0 192.168.1.300"]
    printed = refusals(enter(phone_of("qca")), lines)
    assert len(printed) == len(lines)
    assert not [text for text in printed if "SUCCEEDED" in text or not text]


def test_services_are_started_by_name_and_by_property(phone_of):
    phone = phone_of("wcn6750")
    state = "getprop init.svc.vendor.sniffer"
    phone.output("/vendor/bin/start vendor.sniffer")
    assert phone.output(state) == "running"
    phone.output("setprop vendor.hardware.wlan.runsniffer stop")
    assert phone.output(state) == "stopped"
    phone.output("setprop vendor.hardware.wlan.runsniffer start; /vendor/bin/stop vendor.sniffer")
    assert phone.output(state) == "stopped"
    assert phone.output("getprop init.svc.vendor.tcpdump") == ""
    lines = ["start vendor.none", "stop vendor.none", "start", "stop vendor.sniffer vendor.tcpdump"]
    assert [phone.shell(line).returncode for line in lines] == [1] * 4
    assert phone.shell(lines[0]).stderr == "start: Unable to start service 'vendor.none'\n"


@pytest.mark.parametrize("chip", TOOLS)
def test_every_tool_obeys(phone_of, chip):
    phone = phone_of(chip)
    for code, tool in enumerate(TOOLS[chip].split(), 10):
        phone.fault(tool, "exit", code)
        assert phone.run(f"/vendor/bin/{tool}", "x").returncode == code
        phone.fault(tool, "missing")
        assert phone.run(tool).returncode == 127


def test_a_broadcom_phone_has_none_of_these_tools(phone):
    assert phone.shell("insmod x || iwpriv x || myftm x").returncode == 127


@pytest.mark.parametrize("chip, name, mimo", [
    ("wcn", "WCN3990", "1"), ("qca", "QCA6174", "1"), ("wcn39xx", "wcn3950", ""),
    ("qca639x", "qca639x", "1"), ("wcn685x", "wcn685x", "1"), ("wcn6750", "wcn6750", "1")])
def test_properties_name_the_chip(phone_of, chip, name, mimo):
    read = "; ".join(f"getprop ro.hardware.wlan.{word}" for word in ("vendor", "chip", "mimo"))
    assert phone_of(chip).output(read) == f"qcom\n{name}\n{mimo}".rstrip()
