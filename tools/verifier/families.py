# Copyright 2026 The BEX Wi-Fi Authors
# SPDX-License-Identifier: Apache-2.0
"""Each chip family has every row that docs/adding-a-chip.md asks for.

The families are those of chips/ChipFamily.cpp; the suites are the files of suites/.
"""

import re

CHIPS = "chips/ChipFamily.cpp"
PHONES = "simulator/phones"
FAMILY = re.compile(r'^\s*\{"(\w+)", "\w+", "\w*", DriverModules::')
# By family, and by suite.
FAMILY_ROWS = ("service/ChipChoice.cpp", "tests/support/families.py")
SUITE_ROWS = ("tests/fuzz/Operations.cpp", "benchmarks/TextBench.cpp")


def verify(checkout):
    families = {match[1]: number for number, line in checkout.lines(CHIPS)
                if (match := FAMILY.match(line))}
    for family, number in families.items():
        for path in FAMILY_ROWS:
            if f'"{family}"' not in checkout.text(path):
                checkout.report(CHIPS, number, f"{path} has no row for '{family}'")
        if not checkout.paths(PHONES, family):
            checkout.report(CHIPS, number, f"there is no {PHONES}/{family}")
    for path in checkout.paths(PHONES, "*"):
        if path.rpartition("/")[2] not in families:
            checkout.report(path, 1, f"{CHIPS} has no such family")
    suites(checkout)


def suites(checkout):
    for header in checkout.paths("suites", "*TestSuit.h"):
        suite = header.rpartition("/")[2].removesuffix(".h")
        for path in SUITE_ROWS:
            if suite != "VendorTestSuit" and suite not in checkout.text(path):
                checkout.report(header, 1, f"{path} has no row for {suite}")
