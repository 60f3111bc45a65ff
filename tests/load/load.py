# Copyright 2026 The BEX Wi-Fi Authors
# SPDX-License-Identifier: Apache-2.0
"""Many calls at once on a simulated phone, and what the service holds meanwhile."""

import contextlib
import dataclasses
import json
import os
import pathlib
import select
import subprocess
import tempfile
import time

from support.phone import SERVICE

HERE = pathlib.Path(__file__).resolve().parent

LOAD = "/vendor/bin/wifi-load"
SILENCE_SECONDS = 120
# How much more memory a service may hold after many calls: in ten thousand, 26 bytes for each.
MEMORY_KIB = 256


def load_install():
    """Brings the load program into a phone."""
    return f"{os.environ['BEX_LOAD']}={LOAD}"


class Load:
    """The calls, each a list of words, made by many client processes of a phone at once.

    `answers` keeps for each call what came back, in a list, for it should be one answer: its text,
    or None for a call that failed; `ended` is the load program's exit code.
    """

    def __init__(self, phone, clients, calls):
        self.answers = [[] for _ in calls]
        self.ended = None
        with tempfile.TemporaryFile() as lines:
            lines.write("".join(" ".join(call) + "\n" for call in calls).encode())
            lines.seek(0)
            # Ctrl-C is for whoever started the load, who ends it in order.
            self.process = subprocess.Popen(phone.command(LOAD, str(clients)), stdin=lines,
                                            stdout=subprocess.PIPE, start_new_session=True)

    def arrivals(self, pause=0.2):
        """Yields after some answers have come in, and at each pause; ends with the load."""
        pipe = self.process.stdout.fileno()
        rest = b""
        heard = time.monotonic()
        while True:
            if select.select([pipe], [], [], pause)[0]:
                heard = time.monotonic()
                piece = os.read(pipe, 1 << 16)
                if not piece:
                    self.ended = self.process.wait()
                    self.process.stdout.close()
                    return
                *lines, rest = (rest + piece).split(b"\n")
                for line in lines:
                    number, answer = json.loads(line)[:2]
                    self.answers[number].append(answer)
            elif time.monotonic() > heard + SILENCE_SECONDS:
                self.kill()  # the answers that are missing will tell
                return
            yield

    def kill(self):
        """Ends all the clients, those in the middle of a call as well."""
        self.process.kill()
        self.ended = self.process.wait()
        self.process.stdout.close()

    def answered(self):
        return sum(len(answers) for answers in self.answers)


@dataclasses.dataclass
class Held:
    """What a service holds: its private memory in KiB, descriptors, threads; and what its phone
    does: processes and files."""

    memory: int
    descriptors: int
    threads: int
    processes: int
    files: int


class ServiceEnded(Exception):
    """There is nothing left to measure."""


class Gauge:
    """Measures the service of a phone that is up, until that service ends."""

    def __init__(self, phone):
        self.root = phone.root
        self.keeper = int((phone.folder / "pid").read_text())
        # Its children come after it: what it has just forked looks like itself.
        self.service = next(pid for pid in descendants(self.keeper)
                            if command_of(pid) == f"/vendor/bin/hw/{SERVICE}\0")

    def read(self):
        process = pathlib.Path(f"/proc/{self.service}")
        try:
            text = (process / "status").read_text()
            status = dict(line.split(":", 1) for line in text.splitlines())
            memory = int(status["RssAnon"].split()[0])
            descriptors = len(os.listdir(process / "fd"))
        except (OSError, KeyError) as gone:
            raise ServiceEnded from gone
        return Held(
            memory=memory,
            descriptors=descriptors,
            threads=int(status["Threads"]),
            processes=len(descendants(self.keeper)),
            files=sum(len(files) for _, _, files in os.walk(self.root)))


def command_of(pid):
    try:
        return pathlib.Path(f"/proc/{pid}/cmdline").read_text()
    except OSError:
        return ""  # it has ended


def descendants(pid):
    """The processes below a process, those of its threads included."""
    found = []
    # A process may end while it is looked at.
    with contextlib.suppress(OSError):
        for task in pathlib.Path(f"/proc/{pid}/task").iterdir():
            for child in (task / "children").read_text().split():
                found += [int(child), *descendants(child)]
    return found
