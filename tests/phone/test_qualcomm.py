# Copyright 2026 The BEX Wi-Fi Authors
# SPDX-License-Identifier: Apache-2.0
"""What can go wrong with modules, the test tool and the mode file of Qualcomm phones."""

import pytest

from support.families import FAMILIES

# One chip for each form of the statistics and each tool, and how many blanks stand before its count.
COUNTING = {chip: FAMILIES[chip].field for chip in ("qca", "qca639x", "wcn6750")}


def statistics(*counts, blanks):
    """What the tool prints when a reception stops, with a label for each count."""
    field = "x " * (blanks - 1)
    return "".join(f"crcErrors 3\ngoodPackets {field}{count}\nrssi -40\n" for count in counts)


@pytest.fixture(name="up")
def phone_that_is_up(make_phone):
    def make(chip):
        phone = make_phone(chip)
        phone.up()
        return phone

    return make


def printing(phone, text):
    """Lets the test tool print a text in place of its own."""
    output = phone.folder / "output"
    output.write_bytes(text.encode())
    phone.fault("myftm", "print", output)


@pytest.mark.parametrize("chip", COUNTING)
def test_several_labels(up, chip):
    phone = up(chip)
    printing(phone, statistics(5, 77, blanks=COUNTING[chip]))
    assert phone.client("RunRxStop", "6").stdout == b"Rx: 77\n"


@pytest.mark.parametrize("chip", COUNTING)
def test_no_label(up, chip):
    phone = up(chip)
    printing(phone, "rssi -40\n")
    client = phone.client("RunRxStop", "6")
    assert (client.returncode, client.stdout) == (0, b"Rx: \n")


@pytest.mark.parametrize("chip", COUNTING)
def test_a_label_without_a_value(up, chip):
    phone = up(chip)
    printing(phone, "rssi -40\ngoodPackets")
    assert phone.client("RunRxStop", "6").stdout == b"Rx: goodPackets\n"


@pytest.mark.parametrize("chip", COUNTING)
def test_without_the_test_tool(up, chip):
    phone = up(chip)
    phone.fault("myftm", "missing")
    client = phone.client("RunTxBGStart", "6", "54", "15", "1")
    assert (client.returncode, client.stdout) == (1, b"-1\n")
    client = phone.client("RunRxBgStart", "6", "54", "1")
    assert (client.returncode, client.stdout) == (1, b"failure\n")
    assert phone.client("RunRxStop", "6").stdout == b"Rx: \n"
    phone.fault("myftm", "clear")
    assert phone.client("RunTxBGStart", "6", "54", "15", "1").stdout == b"0\n"


def test_a_module_that_cannot_be_loaded(up):
    """A driver of one file must load; of several files, one may fail."""
    phone = up("qca")
    phone.fault("insmod", "exit", "1")
    assert phone.client("RunTxStop", "6").stdout == b"-1\n"

    phone = up("qca639x")
    first = phone.explain("RunTxStop", "6")[2].split()[1]
    phone.fault("insmod", "--when", f"{first}*", "exit", "1")
    seen = phone.log.stat().st_size
    assert phone.client("RunTxStop", "6").stdout == b"0\n"
    assert (f"insmod {first} ", False) in phone.commands(seen)


def test_a_module_folder_that_vanishes(up):
    """The paths that the service found at its start are used as they were."""
    phone = up("qca639x")
    lines = phone.explain("RunTxStop", "6")
    modules = phone.root / "vendor/lib/modules"
    modules.rename(modules.with_name("gone"))
    seen = phone.log.stat().st_size
    assert phone.client("RunTxStop", "6").stdout == b"0\n"
    assert [line for line, _ in phone.commands(seen)] == lines


def test_a_phone_without_modules(make_phone):
    phone = make_phone("wcn6750")
    for module in (phone.root / "vendor/lib/modules").glob("qca_cld3_*"):
        module.unlink()
    phone.up()
    assert "cannot find wlan driver : Wcn6750TestSuit" in phone.log.read_text()
    seen = phone.log.stat().st_size
    phone.client("RunTxStop", "6")
    assert [line for line, _ in phone.commands(seen)] == ["myftm -J -I 0 -t 0 ", "rmmod wlan.ko "]


def test_hundreds_of_modules_of_any_name(make_phone):
    phone = make_phone("qca639x")
    modules = phone.root / "vendor/lib/modules"
    names = [f"qca_cld3_{number}" for number in range(300)] + ["qca_cld3_", "qca_cld3_a b", "qca_cld3"]
    for name in names:
        (modules / name).touch()
    phone.up()
    seen = phone.log.stat().st_size
    assert phone.client("--timeout", "50", "RunTxStop", "6").stdout == b"0\n"
    lines = [line for line, _ in phone.commands(seen)]
    assert lines == phone.explain("RunTxStop", "6")
    assert {f"insmod /vendor/lib/modules/{name} " for name in names[:-1]} <= set(lines)
    assert "insmod /vendor/lib/modules/qca_cld3 " not in lines


@pytest.mark.parametrize("chip", ["wcn39xx", "wcn685x"])
def test_an_unreadable_mode(up, chip):
    """Without the driver there is no mode file: that counts as monitor mode."""
    phone = up(chip)
    assert phone.run("rmmod", "wlan.ko").returncode == 0
    assert not (phone.root / "sys/module/wlan/parameters/con_mode").exists()
    assert phone.client("isSnifferMode").stdout == b"true\n"
    client = phone.client("getWlanMode")
    assert (client.returncode, client.stdout) == (1, b"-1\n")
    assert phone.client("snifferStart", "36", "40").stdout == b"-1\n"

    phone.fault("cat", "exit", "1")
    assert phone.client("isSnifferMode").stdout == b"true\n"
