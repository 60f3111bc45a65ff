# Copyright 2026 The BEX Wi-Fi Authors
# SPDX-License-Identifier: Apache-2.0
"""A simulated phone with the built service and client, for tests that drive all of them together."""

import os
import pathlib
import re
import subprocess
import tempfile
import time

import pytest

ROOT = pathlib.Path(__file__).resolve().parents[2]
PHONE = ROOT / "simulator/phone"
SERVICE = "vendor.korvan.bex.wifi@1.0-service"
CLIENT = "/vendor/bin/bex-wifi-client"
CHIPS = sorted(path.name for path in (ROOT / "simulator/phones").iterdir())

# Long ones, which CTest runs beside the others.
collect_ignore_glob = ["test_faults_*.py", "test_overlap.py"]

# How liblog prints on a host: tag, priority, date, time, process, thread, text.
LOG_HEAD = r"\S+ [A-Z] \d\d-\d\d \d\d:\d\d:\d\d +\d+ +\d+ "
COMMAND = re.compile(
    rf'^{LOG_HEAD}cmd: "(.*?)" (successful|unsuccessful) execution$', re.MULTILINE | re.DOTALL)


def wait_for(condition):
    """Waits until the condition holds; a minute means that it never will."""
    deadline = time.monotonic() + 60
    while not condition():
        assert time.monotonic() < deadline
        time.sleep(0.005)


class Phone:
    """One phone; `folder` is where it lives on this machine, `installs` are SRC=DEST texts."""

    def __init__(self, chip, folder, *installs):
        self.folder = folder
        self.root = folder / "root"
        self.log = folder / "log"
        self.phone("create", chip, folder,
                   "--install", f"{os.environ['BEX_SERVICE']}=/vendor/bin/hw/{SERVICE}",
                   "--install", f"{ROOT}/service/{SERVICE}.xml=/vendor/etc/vintf/manifest/{SERVICE}.xml",
                   "--install", f"{os.environ['BEX_CLIENT']}={CLIENT}",
                   *(f"--install={pair}" for pair in installs))

    @staticmethod
    def phone(*arguments):
        return subprocess.run([PHONE, *arguments], check=True, timeout=60)

    def up(self):
        self.phone("up", self.folder)

    def down(self):
        self.phone("down", self.folder)

    def fault(self, *arguments):
        self.phone("fault", self.folder, *arguments)

    def command(self, *arguments):
        """The machine's command line for a command inside the phone."""
        return [PHONE, "run", self.folder, *arguments]

    def run(self, *arguments, timeout=60):
        return subprocess.run(self.command(*arguments), capture_output=True, check=False,
                              timeout=timeout)

    def client(self, *arguments):
        return self.run(CLIENT, *arguments)

    def outside(self, *arguments, **options):
        """Starts a program of this machine that is a client of the phone's service: it is there sooner
        than one inside, and needs nothing of the phone but its socket."""
        return subprocess.Popen(arguments, env={**os.environ, "HIDL_HOST_ROOT": str(self.root)},
                                **{"stdout": subprocess.PIPE, "stderr": subprocess.PIPE, **options})

    def start(self, *arguments, **options):
        """Starts the client outside."""
        return self.outside(os.environ["BEX_CLIENT"], *arguments, **options)

    def call(self, *arguments):
        """The client outside: (exit code, stdout, stderr)."""
        with self.start(*arguments) as client:
            out, err = client.communicate(timeout=60)
        return client.returncode, out, err

    def commands(self, since=0):
        """The command lines in the service's log from a byte on, each with whether it succeeded."""
        text = self.log.read_bytes()[since:].decode(errors="surrogateescape")
        return [(line, outcome == "successful") for line, outcome in COMMAND.findall(text)]

    def explain(self, *arguments):
        """The command lines that the explain program expects of a call."""
        result = subprocess.run(
            [os.environ["BEX_EXPLAIN"], *arguments], check=True, capture_output=True,
            env={**os.environ, "HIDL_HOST_ROOT": str(self.root)}, timeout=60)
        return result.stdout.decode(errors="surrogateescape").splitlines()


@pytest.fixture(name="make_phone")
def make_phone_fixture():
    """Makes a phone that is not up yet, with options of `phone create` at will; it is switched off
    when the test ends."""
    made = []
    # A short path: in a deep folder the phone would borrow another place for its sockets.
    with tempfile.TemporaryDirectory(prefix="bex-") as folder:

        def make(chip, *installs):
            made.append(Phone(chip, pathlib.Path(folder, str(len(made))), *installs))
            return made[-1]

        yield make
        for phone in made:
            subprocess.run([PHONE, "down", phone.folder], check=True, capture_output=True,
                           timeout=60)
