#!/usr/bin/env python3
# Copyright 2026 The BEX Wi-Fi Authors
# SPDX-License-Identifier: Apache-2.0
"""What the station kit adds to `adb shell`, on simulated phones. Prints one JSON object for tools/bench.py.

usage: station.py BUILD CALLS PHONES
"""

import concurrent.futures
import contextlib
import json
import os
import pathlib
import resource
import statistics
import subprocess
import sys
import tempfile
import time

ROOT = pathlib.Path(__file__).resolve().parents[1]
sys.path[:0] = [str(ROOT / folder) for folder in ("station", "tests", "tools")]

# pylint: disable=wrong-import-position
import bexwifi  # noqa: E402  (found only through the lines above)
from support.adb import Adb, made_phone  # noqa: E402
from support.phone import CHIPS, SERVICE  # noqa: E402

METHOD = "isMimoSupport"  # runs no command, so the way there and back is all that it takes


def seconds(function):
    begin = time.perf_counter()
    function()
    return time.perf_counter() - begin


def by_hand(serial):
    subprocess.run(["adb", "-s", serial, "shell", f"bex-wifi-client --json --timeout 60 {METHOD}"],
                   stdin=subprocess.DEVNULL, capture_output=True, check=True)


def latency(phone, calls):
    """The medians of a call by hand and through the kit, which go by turns."""
    pairs = [(seconds(lambda: by_hand(phone.serial)), seconds(lambda: phone.call(METHOD)))
             for _ in range(calls)]
    return [statistics.median(column) for column in zip(*pairs)]


def processor_time(server):
    """Seconds that this process has had, and those of adb: its clients and the server."""
    own, clients = (resource.getrusage(who) for who in (resource.RUSAGE_SELF, resource.RUSAGE_CHILDREN))
    fields = pathlib.Path(f"/proc/{server}/stat").read_text("ascii", "replace").rpartition(")")[2].split()
    ticks = sum(map(int, fields[11:13])) / os.sysconf("SC_CLK_TCK")
    return own.ru_utime + own.ru_stime, clients.ru_utime + clients.ru_stime + ticks


def share(phones, calls, server):
    """The kit's part of the processor time while all phones are called at once."""
    before = processor_time(server)
    with concurrent.futures.ThreadPoolExecutor(len(phones)) as pool:
        list(pool.map(lambda phone: [phone.call(METHOD) for _ in range(calls)], phones))
    kit, adb = (after - first for after, first in zip(processor_time(server), before))
    return kit / (kit + adb)


def server_of(home):
    for entry in pathlib.Path("/proc").glob("[0-9]*/cmdline"):
        with contextlib.suppress(OSError):
            if f"{home}/socket\0fork-server\0".encode() in entry.read_bytes():
                return int(entry.parent.name)
    raise SystemExit("adb's server is not there")


def main(build, calls, count):
    os.environ["BEX_SERVICE"] = f"{build}/service/{SERVICE}"
    os.environ["BEX_CLIENT"] = f"{build}/client/bex-wifi-client"
    with tempfile.TemporaryDirectory(prefix="bex-adb-") as home, contextlib.ExitStack() as ends:
        adb = Adb(home)
        os.environ.update(adb.environment)
        ends.callback(adb, "kill-server")
        phones = []
        for chip in CHIPS[:count]:
            simulated = ends.enter_context(made_phone(adb, chip))
            simulated.up()
            phones.append(bexwifi.Phone(simulated.serial))
            phones[-1].call(METHOD)  # reads the list of methods
        floor, kit = latency(phones[0], calls)
        print(json.dumps({"call": kit, "by hand": floor, "phones": len(phones),
                          "share": share(phones, calls, server_of(home))}))


if __name__ == "__main__":
    main(sys.argv[1], int(sys.argv[2]), int(sys.argv[3]))
