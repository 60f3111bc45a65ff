# Copyright 2026 The BEX Wi-Fi Authors
# SPDX-License-Identifier: Apache-2.0
"""Phones with Qualcomm chips, and how their driver is loaded."""

import os

from conftest import Phone

CON_MODE = "/sys/module/wlan/parameters/con_mode"
MODULES = "/vendor/lib/modules"

# The module file that fits the chip.
DRIVERS = {
    "wcn": f"{MODULES}/wlan.ko",
    "qca": f"{MODULES}/qca_cld3_wlan.ko",
    "wcn39xx": f"{MODULES}/qca_cld3/qca_cld3_wlan.ko",
    "qca639x": f"{MODULES}/qca_cld3_qca6390.ko",
    "wcn685x": f"{MODULES}/qca_cld3_wcn6855.ko",
    "wcn6750": f"{MODULES}/qca_cld3_wcn6750.ko",
}


def copies(launcher, patterns, place):
    """A function that gives a phone of a chip; each chip's is created once, then copied."""
    def copy(chip):
        folder = patterns / chip
        pattern = Phone(launcher, folder) if folder.exists() \
            else Phone.create(launcher, folder, chip=chip)
        return pattern.copy(place / chip)
    return copy


def test_mode(phone):
    """Reloads the driver in factory test mode, as the tests do, and brings the interface up."""
    driver = DRIVERS[phone.folder.name]
    phone.output(f"rmmod wlan.ko; insmod {driver} con_mode=5 && ifconfig wlan0 up")
    return phone


def refusals(phone, lines):
    """What each of the lines prints, which must all fail and change nothing."""
    state = phone.driver()
    script = "".join(f"{{ {line}; }} 2>&1 && echo SUCCEEDED; echo; " for line in lines)
    printed = phone.shell(script).stdout.split("\n\n")
    assert phone.driver() == state
    return printed[:-1]


def replace(phone, path, text):
    """A new file in the phone; the old one may be shared with other phones."""
    os.remove(f"{phone.root}{path}")
    with open(f"{phone.root}{path}", "w", encoding="ascii") as file:
        file.write(text)
