# Copyright 2026 The BEX Wi-Fi Authors
# SPDX-License-Identifier: Apache-2.0
"""What the fault tests share: command lines taken apart, and a census of what a phone holds."""

import contextlib
import os
import pathlib
import re
import shlex

from launcher import faults
from support.phone import SANITIZE
from support.waiting import wait_for

# Of the idle service; ThreadSanitizer's runtime brings one more, as does the search for leaks.
SERVICE_THREADS = 3 if SANITIZE else 2


def stage(phone, tool, *actions):
    """What `phone fault` does, without a process of its own."""
    faults.stage(str(phone.folder), tool, [str(action) for action in actions])


class Command:
    """One command of a line: a tool's name and its arguments, joined by blanks."""

    def __init__(self, words):
        self.tool = words[0].rpartition("/")[2]
        self.arguments = " ".join(words[1:])

    @property
    def pattern(self):
        """A pattern for `phone fault --when` that fits these arguments."""
        return re.sub(r"[^\w ./:=-]", "?", self.arguments)


class Line:
    """A command line: the commands of its pipeline, the file that it writes, the file that it reads."""

    def __init__(self, text):
        self.text = text
        pipeline, _, written = text.partition(" > ")
        words = [shlex.split(part) for part in pipeline.split("|")]
        self.writes = written.strip()
        self.reads = words[0][1] if words[0][0].endswith("/cat") else ""
        # The shell itself is what echoes.
        self.commands = [Command(part) for part in words if part[0] != "echo"]


def processes(phone):
    """The process numbers of the phone, its keeper's first."""
    found = [int((phone.folder / "pid").read_text())]
    for number in found:
        for task in os.listdir(f"/proc/{number}/task"):
            children = pathlib.Path(f"/proc/{number}/task/{task}/children").read_text()
            found += [int(child) for child in children.split()]
    return found


def service_process(phone):
    """The process number of the service on this machine."""
    found = [number for number in processes(phone)
             if pathlib.Path(f"/proc/{number}/comm").read_text().startswith("vendor.korvan")]
    assert len(found) == 1
    return found[0]


def _holds(number):
    """A process's name, its number of threads, and what its descriptors stand for."""
    folder = pathlib.Path(f"/proc/{number}")
    descriptors = [re.sub(r"\[?\d+\]?", "", os.readlink(entry)) for entry in (folder / "fd").iterdir()]
    return ((folder / "comm").read_text().strip(), len(os.listdir(folder / "task")),
            sorted(descriptors))


def census(phone):
    """What would grow if something leaked: processes, threads, descriptors, files. None when a
    process ended just now."""
    try:
        held = {number: _holds(number) for number in processes(phone)}
    except (FileNotFoundError, ProcessLookupError):
        return None
    held["files"] = sorted(os.path.join(folder, name)
                           for folder, folders, files in os.walk(phone.root)
                           for name in folders + files)
    return held


def idle_census(phone):
    """The same of a service that has its threads and no client, as soon as that is so."""
    service = service_process(phone)
    taken = []

    def idle():
        taken[:] = [census(phone)]
        _, threads, descriptors = (taken[0] or {}).get(service, ("", 0, []))
        return threads == SERVICE_THREADS and descriptors.count("socket:") == 1

    wait_for(idle)
    return taken[0]


def assert_holds(phone, before):
    """That the phone comes to hold what it held, as soon as it has seen its clients go."""
    with contextlib.suppress(AssertionError):
        wait_for(lambda: census(phone) == before)
    assert census(phone) == before


@contextlib.contextmanager
def nothing_lost(phone):
    """What the idle phone holds before the block it holds afterwards."""
    before = idle_census(phone)
    yield
    assert_holds(phone, before)
