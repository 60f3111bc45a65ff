#!/usr/bin/python3
# Copyright 2026 The BEX Wi-Fi Authors
# SPDX-License-Identifier: Apache-2.0
"""soak.py FOLDER MINUTES SEED: keeps the services of eight phones busy, and says what became of it.

The phones live in FOLDER. The seed decides which calls are made and what goes wrong when; how calls
overlap is the machine's. Each minute a line of figures: what the calls came to so far, and what the
services hold after their last turns; at the end, or at Ctrl-C, a table. The exit code is 1 when an
answer was wrong or lost, or when a service holds more than after its first turn. Cut off are calls
that a restart ended, and what killed clients had not got answered, or not called yet.
"""

import pathlib
import random
import signal
import sys
import tempfile
import time

ROOT = pathlib.Path(__file__).resolve().parents[2]
sys.path += [str(ROOT / folder) for folder in ("tests", "tests/phone", "tools")]

import stations  # noqa: E402  (what it imports is found only through the line above)
from support.phone import Phone  # noqa: E402

MINUTE = 60
FIGURES = ["calls", "answered", "cut off", "wrong", "lost", "faults", "kills", "restarts", "grown"]
FAILURES = ["wrong", "lost", "grown"]
HELD = ["KiB", "files open", "threads", "processes"]
SHOWN_NOTES = 50


def row(*cells):
    return "".join(f"{cell:>11}" for cell in cells)


class Soak:
    """The stations in turn until the time is over."""

    def __init__(self, minutes):
        self.minutes = minutes
        self.phones = []
        self.stations = []
        self.notes = 0
        self.started = self.next_line = None

    def note(self, text):
        """Something went wrong: the first ones are told at once."""
        self.notes += 1
        if self.notes <= SHOWN_NOTES:
            print(text, flush=True)

    def tick(self):
        if time.monotonic() >= self.next_line:
            self.next_line += MINUTE
            minutes = (time.monotonic() - self.started) / MINUTE
            print(row(f"{minutes:.1f} min", *self.totals(), *self.held()), flush=True)

    def totals(self):
        return [sum(station.figures[name] for station in self.stations) for name in FIGURES]

    def held(self):
        """What the services that have had a turn held after it, all together."""
        held = [station.last for station in self.stations if station.last]
        return [sum(h.memory for h in held), sum(h.descriptors for h in held),
                sum(h.threads for h in held), sum(h.processes for h in held)]

    def run(self, folder, chance):
        def make_phone(description, *installs):
            self.phones.append(Phone(description, folder / str(len(self.phones)), *installs))
            return self.phones[-1]

        for station in stations.make_stations(make_phone, self.note, self.tick):
            self.stations.append(station)
        print(row("", *FIGURES, *HELD), flush=True)
        self.started = time.monotonic()
        self.next_line = self.started + MINUTE
        while True:
            for station in self.stations:
                station.round(chance)
                self.tick()
                if time.monotonic() >= self.started + self.minutes * MINUTE:
                    return

    def end(self):
        """Switches off and prints a table. Returns whether all went well."""
        for phone in self.phones:
            stations.switch_off(phone)
        print("\n" + row("", *FIGURES) + "   " + ", ".join(HELD) + " of the service that ran last")
        for station in self.stations:
            print(row(station.name, *(station.figures[name] for name in FIGURES))
                  + f"   {told(station.first)} -> {told(station.last)}")
        print(row("all", *self.totals()), flush=True)
        return not any(station.figures[name] for station in self.stations for name in FAILURES)


def told(held):
    if held is None:
        return "none"
    return f"{held.memory} {held.descriptors} {held.threads} {held.processes}"


def main():
    parent, minutes, seed = sys.argv[1], float(sys.argv[2]), sys.argv[3]
    signal.signal(signal.SIGTERM, signal.default_int_handler)
    print(f"soak: {minutes:g} minutes, seed {seed}", flush=True)
    soak = Soak(minutes)
    with tempfile.TemporaryDirectory(prefix="soak-", dir=parent) as folder:
        try:
            soak.run(pathlib.Path(folder), random.Random(seed))
        except KeyboardInterrupt:
            print("\nsoak: broken off", flush=True)
        finally:
            well = soak.end()
    sys.exit(0 if well else 1)


if __name__ == "__main__":
    main()
