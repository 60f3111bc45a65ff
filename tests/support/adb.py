# Copyright 2026 The BEX Wi-Fi Authors
# SPDX-License-Identifier: Apache-2.0
"""Debian's adb with a server of its own, and phones that answer it.

The server has a socket in a temporary folder in place of a port, its keys are there too, and it does not
look for emulators: it does not touch the user's server and phones.
"""

import contextlib
import os
import pathlib
import signal
import subprocess
import tempfile

import pytest

from support.phone import PHONE, Phone
from support.waiting import wait_for

TIMEOUT = 60


class Running(subprocess.Popen):
    """A program and what it starts. A test that fails in its `with` block ends them: it neither waits
    for them nor leaves them behind."""

    def __init__(self, *arguments, **options):
        super().__init__(*arguments, **{**options, "start_new_session": True})

    def __exit__(self, kind, *rest):
        if kind is not None and self.poll() is None:
            os.killpg(self.pid, signal.SIGKILL)
        super().__exit__(kind, *rest)


class Adb:
    """The adb program, with its server."""

    def __init__(self, home):
        self.environment = {
            "PATH": os.environ["PATH"], "HOME": home, "ADB_VENDOR_KEYS": home,
            "ADB_SERVER_SOCKET": f"localfilesystem:{home}/socket",
            "ADB_LOCAL_TRANSPORT_MAX_PORT": "5553", "TERM": "xterm"}

    def __call__(self, *arguments, **options):
        """The finished process."""
        stdin = {} if "input" in options else {"stdin": subprocess.DEVNULL}
        return subprocess.run(["adb", *arguments], env=self.environment, check=False,
                              timeout=TIMEOUT, **{"capture_output": True, **stdin, **options})

    def start(self, *arguments, **options):
        return Running(["adb", *arguments], env=self.environment, **options)


class AdbPhone(Phone):
    """A phone on adb."""

    def __init__(self, adb, *arguments):
        super().__init__(*arguments)
        self.adb = adb
        self.serial = None

    def up(self, *port):
        up = subprocess.run([PHONE, "up", self.folder, "--adb", *port], check=True, timeout=TIMEOUT,
                            stdout=subprocess.PIPE, text=True)
        new = self.serial is None
        self.serial = up.stdout.strip()
        if new:
            self.forget_lock()  # an earlier phone at this port may have left one
        wait_for(self.connects)

    def connects(self):
        """Whether adb reaches it within adb's own deadline."""
        self.forget()
        return self.adb("connect", self.serial).stdout == f"connected to {self.serial}\n".encode()

    def forget(self):
        """Makes the server give up a phone that has gone."""
        if self.serial:
            self.adb("disconnect", self.serial)

    def forget_lock(self):
        """Removes the lock file that the programs of a station share."""
        if self.serial:
            pathlib.Path(f"/tmp/bex-{self.serial}.lock").unlink(missing_ok=True)

    def down(self):
        super().down()
        self.forget()

    def kill_service(self):
        """Kills the service; the phone stays on adb."""
        os.kill(int((self.folder / "pid").read_text()), signal.SIGKILL)
        wait_for(lambda: not self.is_up())

    def do(self, *arguments, **options):
        """An adb command on this phone."""
        return self.adb("-s", self.serial, *arguments, **options)

    def shell(self, *arguments, **options):
        """What adb shell does: its exit code, stdout and stderr."""
        done = self.do("shell", *arguments, **options)
        return done.returncode, done.stdout, done.stderr


@pytest.fixture(scope="session", name="adb")
def adb_fixture():
    with tempfile.TemporaryDirectory(prefix="bex-adb-") as home:
        adb = Adb(home)
        try:
            yield adb
        finally:
            adb("kill-server")


@contextlib.contextmanager
def made_phone(adb, chip):
    """A phone that is not up yet, and is switched off at the end."""
    with tempfile.TemporaryDirectory(prefix="bex-") as folder:
        phone = AdbPhone(adb, chip, pathlib.Path(folder, "0"))
        try:
            yield phone
        finally:
            phone.down()
            phone.forget_lock()


@pytest.fixture(scope="session", name="phone")
def phone_fixture(adb):
    """A phone on adb that the tests share."""
    with made_phone(adb, "broadcom") as phone:
        phone.up()
        yield phone


@contextlib.contextmanager
def held(phone, tool):
    """Holds a tool of the phone at each call. Gives two functions: one waits until so many calls wait, the
    other lets all go on."""
    waiting = phone.root / f"phone/faults/{tool}.waiting"
    phone.fault(tool, "wait")
    with contextlib.ExitStack() as ends:
        ends.callback(phone.fault, tool, "clear")

        def wait_until_waiting(count=1):
            wait_for(lambda: waiting.exists() and len(waiting.read_text().split()) >= count)

        yield wait_until_waiting, ends.close


def processes_of(phone):
    """The `phone run` processes that adb's clients have running, by number."""
    found = []
    for entry in pathlib.Path("/proc").glob("[0-9]*/cmdline"):
        with contextlib.suppress(OSError):
            words = entry.read_bytes().split(b"\0")
            if b"run" in words and os.fsencode(phone.folder) in words:
                found.append(int(entry.parent.name))
    return found
