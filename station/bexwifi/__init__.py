# Copyright 2026 The BEX Wi-Fi Authors
# SPDX-License-Identifier: Apache-2.0
"""Drives the Wi-Fi radio of phones on adb, for test stations.

    from bexwifi import Phone

    phone = Phone("127.0.0.1:41235")
    with phone.transmit("RunTxBGStart", channel=6, rate=11, power=20, antenna=1):
        measure_the_spectrum()
    with phone.receive("RunRxBgStart", channel=6, rate=11, antenna=1) as reception:
        send_packets(1000)
    print(reception.packets)

The radio is off after each `with` block, however the block ends: by an exception, a deadline, SIGINT,
SIGTERM or SIGHUP, or with a phone that was unplugged and comes back. Where that cannot be proven,
RadioMayBeOn is raised and a line on stderr says so. Python sees signals in its main thread only: a program
whose blocks run in other threads has to end these itself on SIGTERM.

Needs Python 3.9 or newer, nothing but its standard library, and the program `adb`. The phone needs
`bex-wifi-client`, whose README says what its exit codes mean; here each is an exception.
"""

from bexwifi.answers import Answer, Argument, Check, Doctor, Method, StopAnswer, StopCall
from bexwifi.errors import (
    AdbFailed, BexWifiError, CommandFailed, DeadlinePassed, Interrupted, NoAnswer, NoClient, NoCount,
    NoLock, NoService, NotWritten, Offline, RadioMayBeOn, TransportFailed, Unauthorised, UnknownPhone,
    WrongClient, WrongUsage)
from bexwifi.phone import Phone
from bexwifi.radio import EndedByStop, Reception, Use

__all__ = [
    "AdbFailed", "Answer", "Argument", "BexWifiError", "Check", "CommandFailed", "DeadlinePassed",
    "Doctor", "EndedByStop", "Interrupted", "Method", "NoAnswer", "NoClient", "NoCount", "NoLock",
    "NoService", "NotWritten", "Offline", "Phone", "RadioMayBeOn", "Reception", "StopAnswer", "StopCall",
    "TransportFailed", "Unauthorised", "UnknownPhone", "Use", "WrongClient", "WrongUsage"]
