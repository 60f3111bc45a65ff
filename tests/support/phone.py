# Copyright 2026 The BEX Wi-Fi Authors
# SPDX-License-Identifier: Apache-2.0
"""A simulated phone with the built service and client, for tests that drive all of them together.

In a build with sanitizers no test passes with a report in a phone: see tests/sanitizers/README.md.
"""

import contextlib
import errno
import fcntl
import os
import pathlib
import re
import subprocess
import tempfile

import pytest

import servicelog
from support import output
from support.waiting import wait_for

ROOT = pathlib.Path(__file__).resolve().parents[2]
PHONE = ROOT / "simulator/phone"
SERVICE = "vendor.korvan.bex.wifi@1.0-service"
CLIENT = "/vendor/bin/bex-wifi-client"
CHIPS = sorted(path.name for path in (ROOT / "simulator/phones").iterdir())

# What the service and the client were built with: "address", "thread", or nothing.
SANITIZE = os.environ.get("BEX_SANITIZE", "")
REPORT_EXIT_CODE = 66
REPORT = re.compile(r"(?:(?:ERROR|WARNING|FATAL): \w+Sanitizer|LeakSanitizer has |: runtime error: ).*")


class Phone:
    """One phone; `folder` is where it lives on this machine, `installs` are SRC=DEST texts."""

    def __init__(self, chip, folder, *installs, service=None, client=None):
        self.folder = folder
        self.root = folder / "root"
        self.log = folder / "log"
        # A pattern for the reports that a test expects.
        self.expected_report = None
        self.phone("create", chip, folder,
                   "--install", f"{service or os.environ['BEX_SERVICE']}=/vendor/bin/hw/{SERVICE}",
                   "--install", f"{ROOT}/service/{SERVICE}.xml=/vendor/etc/vintf/manifest/{SERVICE}.xml",
                   "--install", f"{client or os.environ['BEX_CLIENT']}={CLIENT}",
                   *(f"--install={pair}" for pair in installs))
        kind = os.environ.get("BEX_PHONE_SANDBOX") or (folder / "sandbox").read_text().strip()
        if SANITIZE and kind != "bwrap":
            pytest.skip("a sanitizer needs /proc, and under proot a phone has none")
        self.leak_requests = self.root / "phone/leaks"
        if SANITIZE == "address":
            os.mkfifo(self.leak_requests)

    @staticmethod
    def phone(*arguments):
        return subprocess.run([PHONE, *arguments], check=True, timeout=60)

    def up(self):
        self.phone("up", self.folder)

    def down(self):
        """Ends the phone, and the test when a sanitizer has reported something in it."""
        try:
            reports = self.reports()
        finally:
            self.phone("down", self.folder)
        assert reports == [], "\n".join(reports)

    def is_up(self):
        with open(self.folder / "pid", "rb") as pid:
            try:
                fcntl.flock(pid, fcntl.LOCK_EX | fcntl.LOCK_NB)
                return False
            except BlockingIOError:
                return True

    def reports(self):
        """What the sanitizers have reported in the service, after a last look for its leaks."""
        if not self.log.is_file():  # never up, or a test's device in its place
            return []
        if SANITIZE == "address":
            self.look_for_leaks()
        found = REPORT.findall(self.log.read_text(errors="replace"))
        return [report for report in found
                if not (self.expected_report and re.search(self.expected_report, report))]

    def look_for_leaks(self):
        """Makes the service look for leaks, unless it has ended."""
        def looks():
            return self.log.read_bytes().count(b"looked for leaks\n")

        before = looks()
        asked = []

        def ask():
            try:
                asked.append(os.open(self.leak_requests, os.O_WRONLY | os.O_NONBLOCK))
            except OSError as error:
                assert error.errno == errno.ENXIO
            return asked or not self.is_up()

        wait_for(ask)
        if asked:
            os.close(asked[0])
            wait_for(lambda: looks() > before or not self.is_up())

    def fault(self, *arguments):
        self.phone("fault", self.folder, *arguments)

    def command(self, *arguments):
        """The machine's command line for a command inside the phone."""
        return [PHONE, "run", self.folder, *arguments]

    def run(self, *arguments, timeout=60):
        result = subprocess.run(self.command(*arguments), capture_output=True, check=False,
                                timeout=timeout)
        assert SANITIZE == "" or result.returncode != REPORT_EXIT_CODE, result.stderr.decode()
        return result

    def client(self, *arguments):
        done = self.run(CLIENT, *arguments)
        output.validate(arguments, done.stdout)
        return done

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
        output.validate(arguments, out)
        return client.returncode, out, err

    def commands(self, since=0):
        """The command lines in the service's log from a byte on, each with whether it succeeded."""
        text = self.log.read_bytes()[since:].decode(errors="surrogateescape")
        return [(command.line, command.succeeded) for command in servicelog.commands(text)]

    def explain(self, *arguments):
        """The command lines that the explain program expects of a call."""
        result = subprocess.run(
            [os.environ["BEX_EXPLAIN"], *arguments], check=True, capture_output=True,
            env={**os.environ, "HIDL_HOST_ROOT": str(self.root)}, timeout=60)
        return result.stdout.decode(errors="surrogateescape").splitlines()


@pytest.fixture(name="make_phone")
def make_phone_fixture():
    """Makes a phone that is not up yet, with any options of `phone create`; it is switched off
    when the test ends."""
    made = []
    # A short path: in a deep folder the phone would use another place for its sockets.
    with tempfile.TemporaryDirectory(prefix="bex-") as folder, contextlib.ExitStack() as ends:

        def make(chip, *installs, **programs):
            made.append(Phone(chip, pathlib.Path(folder, str(len(made))), *installs, **programs))
            ends.callback(made[-1].down)
            return made[-1]

        yield make
