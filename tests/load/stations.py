# Copyright 2026 The BEX Wi-Fi Authors
# SPDX-License-Identifier: Apache-2.0
"""The phones of a soak: each is up all the time and gets its turn, with something going wrong now and
then."""

import collections
import json
import os
import re
import subprocess

import own_answers
from load import MEMORY_KIB, Gauge, Load, ServiceEnded, load_install
from support.phone import PHONE, ROOT
from support.waiting import wait_for
from test_every_phone import CHIPS, session

VALUES = {
    "channel": ["1", "6", "11", "36", "64", "149"],
    "bandwidth": ["20", "40", "80"],
    "rate": ["0", "1", "5.5", "7", "9", "54"],
    "power": ["10", "15"],
    "guardInterval": ["0", "1"],
    "antenna": ["1", "2", "3"],
    "vht": ["true", "false"],
    "ssid": ["test-ap", "another-ap"],
    "address": ["192.168.1.7", "10.0.0.9"],
}
# What a method can answer at all, by the type of its result: calls that overlap share one radio.
FORMS = {"int32": "-1|0", "bool": "true|false", "string": r"(Rx: )?\d*| |ok|failure"}
MODES = "-1|0|4|5"
# Ends whatever a chip family does and takes its driver back to normal.
RECOVERY = [["RunTxStStop", "6"], ["snifferStop"]]

FAULTS = [("exit", "3"), ("signal", "9"), ("sleep", "0.1"), ("missing",)]
# State that a tool keeps from its first use on.
FILES = 10


class Station:
    """A phone with its figures. `note(text)` hears of each call that went wrong, `tick()` is called
    while calls run."""

    def __init__(self, name, phone, note, tick):
        self.name, self.phone, self.note, self.tick = name, phone, note, tick
        self.figures = collections.Counter()
        self.last = None
        phone.up()
        self.begin()
        self.resting = self.gauge.read()

    def begin(self):
        """A service has started."""
        self.gauge = Gauge(self.phone)
        self.first = None

    def round(self, random):
        """One turn, after which the service is at rest."""
        try:
            self.work(random)
            self.rest()
        except ServiceEnded:
            self.count("lost", "the service has ended by itself")
            self.phone.up()
            self.begin()
        self.figures["rounds"] += 1
        os.truncate(self.phone.log, 0)

    def rest(self):
        """Waits until the calls of clients that have gone are over, and looks for what has stayed."""
        def at_rest():
            held = self.gauge.read()
            return (held.descriptors, held.processes) == (
                self.resting.descriptors, self.resting.processes)

        try:
            wait_for(at_rest)
        except AssertionError:
            self.count("grown", f"{self.gauge.read()} instead of {self.resting}")
        self.last = self.gauge.read()
        self.first = self.first or self.last
        if (self.last.memory > self.first.memory + MEMORY_KIB
                or self.last.threads != self.first.threads
                or self.last.files > self.first.files + FILES):
            self.count("grown", f"{self.last}, at first {self.first}")

    def count(self, figure, what):
        self.figures[figure] += 1
        self.note(f"{self.name}: {figure}: {what}")

    def load(self, clients, calls, disturb=None, when=1):
        """Makes the calls; `disturb(load)` happens when so many are answered. Returns the load, at its
        end."""
        load = Load(self.phone, clients, calls)
        try:
            for _ in load.arrivals():
                self.tick()
                if disturb is not None and load.answered() >= when:
                    disturb(load)
                    disturb = None
                    if load.ended is not None:
                        break
        except BaseException:
            load.kill()
            raise
        self.figures["calls"] += len(calls)
        return load

    def judge(self, calls, load, fits, may_fail=0, killed=False):
        """Counts the calls by what they got. As many as `may_fail` are excused, and those without an
        answer when the clients were killed."""
        for number, (call, got) in enumerate(zip(calls, load.answers)):
            delivered = [answer for answer in got if answer is not None]
            if len(got) == 1 and delivered:
                self.figures["answered"] += 1
                if not fits(number, delivered[0]):
                    self.count("wrong", f"{call} got {delivered[0]!r}")
            elif len(got) > 1:
                self.count("wrong", f"{call} got {got}")
            elif killed and not got:
                self.figures["cut off"] += 1
            elif got and may_fail > 0:
                may_fail -= 1
                self.figures["cut off"] += 1
            else:
                self.count("lost", f"{call} got {got}")

    def kill(self, load):
        load.kill()
        self.figures["kills"] += 1


class StandInStation(Station):
    """64 clients, each call with an answer of its own. The service is never restarted, so that it is
    the one to show what grows."""

    CLIENTS = 64
    CALLS = 1280

    def work(self, random):
        calls = own_answers.make_calls(self.CALLS, random)
        own_answers.journal_of(self.phone).unlink(missing_ok=True)
        killed = random.random() < 0.2
        load = self.load(self.CLIENTS, calls, self.kill if killed else None,
                         when=random.randint(1, self.CALLS))
        journal = own_answers.Journal(self.phone)
        wrong = own_answers.wrong_answers(calls, load.answers, journal)
        self.judge(calls, load, lambda number, _: number not in wrong, killed=killed)
        if journal.most_at_once > 2:
            self.count("wrong", f"{journal.most_at_once} calls at once")
        expected = own_answers.expected_commands(self.phone, calls)
        if journal.commands() - expected or not killed and expected - journal.commands():
            self.count("wrong", "other commands than the calls have")


class ChipStation(Station):
    """A phone with its models of tools and radio: a session of one client, then calls of chance by
    several at once, with a fault, a kill, a restart or nothing."""

    CLIENTS = 8
    CALLS = 24

    def __init__(self, name, phone, note, tick):
        super().__init__(name, phone, note, tick)
        self.methods = json.loads(phone.client("list", "--json").stdout)["methods"]
        mimo = "wlan.mimo=1" in (phone.root / "vendor/build.prop").read_text()
        self.session = session(name, "true" if mimo else "false")
        description = (ROOT / "simulator/phones" / name).read_text()
        self.tools = re.findall(r"\S+", " ".join(re.findall(r"^tool (.*)$", description, re.M)))

    def work(self, random):
        self.alone()
        self.together(random)

    def alone(self):
        calls = RECOVERY + [call for call, _ in self.session]
        forms = [FORMS["int32"]] * len(RECOVERY) + [form for _, form in self.session]
        load = self.load(1, calls)
        self.judge(calls, load, lambda number, answer: re.fullmatch(forms[number], answer))

    def together(self, random):
        methods = random.choices(self.methods, k=self.CALLS)
        calls = [[method["name"], *(random.choice(VALUES[argument["name"]])
                                    for argument in method["arguments"])] for method in methods]

        def fits(number, answer):
            method = methods[number]
            form = MODES if method["name"] == "getWlanMode" else FORMS[method["result"]["type"]]
            return re.fullmatch(form, answer)

        disturbance = random.choice(["", "", "fault", "kill", "restart"])
        tool = random.choice(self.tools)
        if disturbance == "fault":
            self.phone.fault(tool, *random.choice(FAULTS))
            self.figures["faults"] += 1
        disturb = {"kill": self.kill, "restart": self.restart}.get(disturbance)
        load = self.load(self.CLIENTS, calls, disturb, when=random.randint(1, self.CALLS // 2))
        if disturbance == "fault":
            self.phone.fault(tool, "clear")
        # Each client's call under way, and the next when it finds the service that is just ending.
        self.judge(calls, load, fits, killed=disturbance == "kill",
                   may_fail=2 * self.CLIENTS if disturbance == "restart" else 0)

    def restart(self, _load):
        self.phone.phone("restart-service", self.phone.folder)
        self.figures["restarts"] += 1
        self.begin()


def make_stations(make_phone, note, tick):
    """One of each kind of phone; `make_phone` makes a phone of a description and of files to install."""
    yield StandInStation("stand-in", own_answers.make_stand_in_phone(make_phone), note, tick)
    for chip in CHIPS:
        yield ChipStation(chip, make_phone(chip, load_install()), note, tick)


def switch_off(phone):
    subprocess.run([PHONE, "down", phone.folder], check=False, capture_output=True, timeout=60)
