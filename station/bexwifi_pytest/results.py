# Copyright 2026 The BEX Wi-Fi Authors
# SPDX-License-Identifier: Apache-2.0
"""What a run has found: the tests of each phone, as all the reports show them."""

import dataclasses
import datetime


@dataclasses.dataclass
class Result:
    """Of one test on one phone."""
    phone: str  # its serial number; empty for a test without a phone
    name: str
    # "passed", "failed", "skipped", "interrupted" or "not run"
    outcome: str = "not run"
    duration: float = 0.0  # seconds
    # Of each failure one line and the whole text; a test and its clean-up may both fail.
    failures: list = dataclasses.field(default_factory=list)
    # Why it was skipped.
    reason: str = ""
    # The service's log of a test that failed.
    log: list = dataclasses.field(default_factory=list)
    measurements: list = dataclasses.field(default_factory=list)


@dataclasses.dataclass(frozen=True)
class Failure:
    line: str
    text: str


class Results(list):
    """Of one phone or of all."""

    def count(self, outcome):
        return sum(each.outcome == outcome for each in self)

    @property
    def verdict(self):
        """pass, fail, or incomplete: a test was interrupted or has not run, or there was none."""
        if self.count("failed"):
            return "fail"
        done = self.count("passed") + self.count("skipped")
        return "pass" if self.count("passed") and done == len(self) else "incomplete"

    @property
    def measurements(self):
        """Pairs of result and measurement."""
        return [(result, each) for result in self for each in result.measurements]

    @property
    def sweeps(self):
        """The measurements that were taken somewhere, by name: {"packets": [...]}."""
        found = {}
        for _, each in self.measurements:
            if each.at:
                found.setdefault(each.name, []).append(each)
        return found


class Run:
    """A run of a plan. Phones are in the order of the command line."""

    def __init__(self, phones):
        self.started = datetime.datetime.now().astimezone()
        self.phones = list(phones)
        self.interrupted = False
        self.results = Results()

    def of_phone(self, phone):
        return Results(each for each in self.results if each.phone == phone)

    @property
    def groups(self):
        """(serial number, its results); the last one is of tests without a phone, where there are any."""
        groups = [(phone, self.of_phone(phone)) for phone in self.phones]
        alone = self.of_phone("")
        return groups + [("", alone)] if alone else groups

    @property
    def verdict(self):
        verdicts = {results.verdict for _, results in self.groups}
        if "fail" in verdicts:
            return "fail"
        return "incomplete" if self.interrupted or "incomplete" in verdicts else "pass"
