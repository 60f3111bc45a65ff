#!/usr/bin/python3
# Copyright 2026 The BEX Wi-Fi Authors
# SPDX-License-Identifier: Apache-2.0
"""A client session on a simulated phone that is up: demo.py CHIP PHONE-FOLDER.

Shows for each call the exact command lines that the service ran (between quotes, since their blanks
count), what each returned, and the call's result. The lines come from the service's own log.
"""

import pathlib
import re
import subprocess
import sys

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

# A log line as liblog prints it on a host: tag, priority, date, time, process, thread, text. A text of
# several lines goes on without that head.
LOG_HEAD = re.compile(r"^(\S+) ([A-Z]) \d\d-\d\d \d\d:\d\d:\d\d +\d+ +\d+ (.*)$")
# What follows such a line without a head is what the next command says on stderr.
COMMAND = re.compile(r'^cmd: "(.*?)" (successful|unsuccessful) execution(?:\n(.*))?$', re.DOTALL)
# The tags of the two that run commands.
RUNNERS = {"wifi@1.0-VendorTestSuit", "wifi@1.0-SnifferTool"}


def messages(log):
    """The (tag, text) pairs of a piece of log."""
    found = []
    for line in log.split("\n"):
        head = LOG_HEAD.match(line)
        if head:
            found.append([head[1], head[3]])
        elif found:
            found[-1][1] += "\n" + line
    return found


def show_commands(log):
    """Prints the commands of a piece of log, each with its outcome and what it printed."""
    output = ""
    for tag, text in messages(log):
        if tag not in RUNNERS:
            continue
        command = COMMAND.match(text.rstrip("\n"))
        if command is None:
            output += text.rstrip("\n") + "\n"
            continue
        outcome = "ok" if command[2] == "successful" else "FAILED"
        print(f'  "{command[1]}" -> {outcome}')
        for line in output.splitlines():
            if line:
                print(f"      printed: {line}")
        output = command[3] or ""


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
