#!/usr/bin/python3
# Copyright 2026 The BEX Wi-Fi Authors
# SPDX-License-Identifier: Apache-2.0
"""Calls the service of a simulated phone that is up: trace.py PHONE-FOLDER ARGUMENT...

The client gets the arguments, and its output and exit code are this program's. Afterwards stderr shows
each command line that the service ran, between quotes since its blanks count, what it returned and what
its tools printed. Lines of other calls at the same time are among them.
"""

import contextlib
import pathlib
import subprocess
import sys

import script
from demo import PHONE, show_commands


def main():
    phone, arguments = sys.argv[1], sys.argv[2:]
    log = pathlib.Path(phone) / "log"
    seen = log.stat().st_size
    client = subprocess.run([PHONE, "run", phone, "/vendor/bin/bex-wifi-client", *arguments],
                            check=False)
    with log.open(encoding="utf-8", errors="replace") as stream:
        stream.seek(seen)
        with contextlib.redirect_stdout(sys.stderr):
            show_commands(stream.read())
    return client.returncode


if __name__ == "__main__":
    script.run(main)
