# Copyright 2026 The BEX Wi-Fi Authors
# SPDX-License-Identifier: Apache-2.0
"""The answers that a client gets on the phones of each chip family, where the families differ."""

import dataclasses


@dataclasses.dataclass(frozen=True)
class Family:
    """The family counts with myftm, unless it has a label."""

    # What its counter prints before the count; removed from the answer, which is the bare count. Its
    # reception starts answer a count as well.
    label: bytes = b""
    # The field of myftm's statistics that is the count: 1 is the one after "goodPackets".
    field: int = 1
    # The answer to RunRxAxStart; empty: "ok" or "failure".
    ax_started: bytes = b""
    # Whether the start of an 802.11ax reception receives nothing, so that there is nothing to count.
    ax_is_idle: bool = False
    # Whether the driver is several modules, of which insmod may refuse some.
    several_modules: bool = False
    # Whether the simulated phone has modules that do not fit its chip.
    ill_fitting: bool = False


FAMILIES = {
    "broadcom": Family(label=b"pktengrxdmcast"),
    "wcn": Family(label=b"wlan0     get_rxpktcnt:", ax_started=b" "),
    "qca": Family(ax_is_idle=True),
    "wcn39xx": Family(ax_is_idle=True),
    "qca639x": Family(field=2, several_modules=True),
    "wcn685x": Family(field=2, several_modules=True, ill_fitting=True),
    "wcn6750": Family(field=2, several_modules=True),
}
