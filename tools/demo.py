#!/usr/bin/python3 -B
# Copyright 2026 The BEX Wi-Fi Authors
# SPDX-License-Identifier: Apache-2.0
"""A client session on a simulated phone that is up: demo.py CHIP PHONE-FOLDER.

Shows for each call the exact command lines that the service ran (between quotes, since their blanks
count), what each returned, and the call's result. The lines come from the service's own log.
"""

import pathlib
import subprocess
import sys

import script
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


# The driver is all module files of a folder. When an image is for several chips, insmod refuses the
# files for the others, and the one that fits is enough.
REFUSED = "FAILED, as it should: the module does not fit this phone"


def loads(command):
    return "insmod " in command.line


def show_commands(log):
    """Prints the commands of a piece of log, each with its outcome and what it printed. Returns how
    many modules were refused."""
    commands = list(servicelog.commands(log))
    loaded = any(loads(command) and command.succeeded for command in commands)
    refused = 0
    for command in commands:
        outcome = "ok" if command.succeeded else "FAILED"
        if loaded and loads(command) and not command.succeeded:
            outcome = REFUSED
            refused += 1
        print(f'  "{command.line}" -> {outcome}')
        for line in command.printed.splitlines():
            if line:
                print(f"      printed: {line}")
    return refused


def main():
    chip, phone = sys.argv[1], sys.argv[2]
    log = pathlib.Path(phone) / "log"
    refused = 0
    # So that each call shows at once also through a pipe.
    sys.stdout.reconfigure(line_buffering=True)
    print(f"The simulated {chip} phone is up; its service answers a client in another process.")
    for purpose, call in SESSION:
        print(f"\n{purpose}\n$ bex-wifi-client {' '.join(call)}")
        seen = log.stat().st_size
        client = subprocess.run(
            [PHONE, "run", phone, "/vendor/bin/bex-wifi-client", "--timeout", "60", *call],
            stdout=subprocess.PIPE, text=True, check=False)
        with log.open(encoding="utf-8", errors="replace") as stream:
            stream.seek(seen)
            refused += show_commands(stream.read())
        print(f"  result: {client.stdout.rstrip()}")
        if client.returncode != 0:
            sys.exit(f"demo: {call[0]} failed: the client ended with {client.returncode}")
    print("\nEvery call succeeded.")
    if refused:
        print(f"{refused} lines FAILED as they should: this phone's image has modules for several "
              "chips, the\nservice loads them all, and the one that fits is enough.")


if __name__ == "__main__":
    script.run(main)
