#!/usr/bin/python3
# Copyright 2026 The BEX Wi-Fi Authors
# SPDX-License-Identifier: Apache-2.0
"""A client session on a simulated phone that is up: demo.py CHIP PHONE-FOLDER.

Shows for each call the exact command lines that the service ran (between quotes, since their blanks
count), what each returned, and the call's result. The lines come from the service's own log.
"""

import pathlib
import subprocess
import sys

import servicelog

PHONE = pathlib.Path(__file__).resolve().parents[1] / "simulator" / "phone"

# What the calls are for, and how long the radio runs before the next one.
SESSION = [
    ("What does the phone declare?", ["isMimoSupport"]),
    ("Which mode is the driver in?", ["getWlanMode"]),
    ("Transmit 802.11g at 54 Mbit/s on channel 6", ["RunTxBGStart", "6", "54", "15", "1"]),
    ("Stop transmitting", ["RunTxStop", "6"]),
    ("Receive on channel 6, with a count of the packets", ["RunRxBgStart", "6", "54", "1"]),
    ("Stop receiving and read the count", ["RunRxStop", "6"]),
    ("Listen to channel 36, 40 MHz wide", ["snifferStart", "36", "40"]),
    ("Is the driver in monitor mode?", ["isSnifferMode"]),
    ("Stop listening", ["snifferStop"]),
    ("Send a single tone on channel 11", ["RunTxStStart", "11", "20", "1"]),
    ("Stop the tone", ["RunTxStStop", "11"]),
]


def show_commands(log):
    """Prints the commands of a piece of log, each with its outcome and what it printed."""
    for command in servicelog.commands(log):
        print(f'  "{command.line}" -> {"ok" if command.succeeded else "FAILED"}')
        for line in command.printed.splitlines():
            if line:
                print(f"      printed: {line}")


def main():
    chip, phone = sys.argv[1], sys.argv[2]
    log = pathlib.Path(phone) / "log"
    print(f"The simulated {chip} phone is up; its service answers a client in another process.")
    for purpose, call in SESSION:
        print(f"\n{purpose}\n$ bex-wifi-client {' '.join(call)}")
        seen = log.stat().st_size
        client = subprocess.run(
            [PHONE, "run", phone, "/vendor/bin/bex-wifi-client", "--timeout", "60", *call],
            stdout=subprocess.PIPE, text=True, check=False)
        with log.open(encoding="utf-8", errors="replace") as stream:
            stream.seek(seen)
            show_commands(stream.read())
        print(f"  result: {client.stdout.rstrip()}")
        if client.returncode != 0:
            sys.exit(f"demo: {call[0]} failed: the client ended with {client.returncode}")
    print("\nEvery call succeeded.")


if __name__ == "__main__":
    main()
