# Copyright 2026 The BEX Wi-Fi Authors
# SPDX-License-Identifier: Apache-2.0
"""Simulated phones in both sandboxes, of this user and, when that is root, of an ordinary one."""

import contextlib
import os
import pathlib
import shutil
import subprocess
import tempfile

import pytest

from support.waiting import wait_for

SOURCE = pathlib.Path(__file__).resolve().parents[2]
SERVICE = "/vendor/bin/hw/vendor.korvan.bex.wifi@1.0-service"
# Some containers refuse namespaces, and with them bwrap.
NAMESPACES = subprocess.run(["bwrap", "--unshare-all", "--unshare-user", "--dev-bind", "/", "/", "true"],
                            capture_output=True, check=False).returncode == 0
KINDS = ("bwrap", "proot")
DEFAULT_KIND = "bwrap" if NAMESPACES else "proot"
NOBODY = 65534
ENDLESS = str(80000 + os.getpid() % 6000)  # an argument of sleep that tells ours from others
DEEP = "bex-phone-test-in-a-folder-that-lies-too-deep-for-the-path-of-a-socket-"
USERS = ("root", "nobody") if os.geteuid() == 0 else ("self",)


STARTED = []


def command_line(process):
    """The arguments of a process, each with a NUL after it; nothing when it has gone."""
    try:
        return pathlib.Path(f"/proc/{process}/cmdline").read_text()
    except OSError:
        return ""


class Launcher:
    """simulator/phone as one user, with one sandbox."""

    def __init__(self, program, kind, user):
        self.kind = kind
        self.user = user
        drop = ["setpriv", f"--reuid={NOBODY}", f"--regid={NOBODY}", "--clear-groups"]
        self.line = (drop if user == "nobody" else []) + [str(program)]
        self.environment = {"PATH": os.environ["PATH"], "BEX_PHONE_SANDBOX": kind,
                            "SECRET_OF_THE_HOST": "1"}

    def __call__(self, *arguments, **options):
        return subprocess.run(self.line + [str(word) for word in arguments], check=False,
                              env=self.environment, timeout=100,
                              **{"capture_output": True, "text": True, **options})

    def start(self, *arguments, **options):
        """A launcher that runs on, at most until the test ends."""
        STARTED.append(subprocess.Popen(self.line + [str(word) for word in arguments],
                                        env=self.environment, **options))
        return STARTED[-1]


class Phone:
    """One phone of a launcher."""

    def __init__(self, launcher, folder):
        self.launcher = launcher
        self.folder = folder
        self.root = folder / "root"

    @classmethod
    def create(cls, launcher, folder, *arguments, chip="broadcom"):
        made = launcher("create", chip, folder, *arguments)
        assert (made.returncode, made.stdout, made.stderr) == (0, "", "")
        return cls(launcher, folder)

    def copy(self, folder):
        """The same phone once more, in less time than it takes to create one: it shares the files
        that no test writes to."""
        subprocess.run(["cp", "-al", self.folder, folder], check=True)
        subprocess.run(["cp", "-a", "--remove-destination", "--parents",
                        "dev", "phone/state", "sys", "system/etc", folder / "root"],
                       cwd=self.root, check=True)
        return Phone(self.launcher, folder)

    def run(self, *command, **options):
        return self.launcher("run", self.folder, *command, **options)

    def shell(self, line, **options):
        return self.run("sh", "-c", line, **options)

    def output(self, line):
        """What a shell line prints that must succeed."""
        result = self.shell(line)
        assert result.returncode == 0, result.stderr
        return result.stdout.rstrip("\n")

    def start(self, line, **options):
        return self.launcher.start("run", self.folder, "sh", "-c", line, **options)

    def do(self, command, *arguments):
        """A launcher command on this phone that must succeed in silence."""
        result = self.launcher(command, self.folder, *arguments)
        assert (result.returncode, result.stdout, result.stderr) == (0, "", "")

    def fault(self, *arguments):
        self.do("fault", *arguments)

    def borrowed_folder(self):
        """Where proot keeps the sockets of a phone in a deep folder."""
        status = self.folder.stat()
        return pathlib.Path(f"/tmp/bex-phone-{status.st_dev:x}-{status.st_ino:x}")

    def sleepers(self):
        """The process numbers of the endless sleeps inside."""
        lines = (f"/phone/bin/busybox\0sleep\0{ENDLESS}\0", f"sleep\0{ENDLESS}\0")
        return [number for number in self.processes() if command_line(number) in lines]

    def processes(self):
        """The process numbers of this phone's commands and sandboxes on this machine."""
        found = []
        for entry in pathlib.Path("/proc").iterdir():
            try:
                line = (entry / "cmdline").read_bytes().decode(errors="replace")
                if str(self.folder) in line or os.readlink(entry / "root") == str(self.root) \
                        or line.split("\0")[-2:-1] == [ENDLESS]:
                    found.append(int(entry.name))
            except (OSError, ValueError):
                continue  # no process, or gone by now
        return found

    def driver(self):
        """The driver's state, by name."""
        text = (self.root / "phone/state/radio").read_text()
        return dict(line.replace("'", "").split("=", 1) for line in text.splitlines())


@pytest.fixture(autouse=True)
def end_what_was_started():
    yield
    while STARTED:
        STARTED[-1].terminate()
        STARTED.pop().wait()


@pytest.fixture(scope="session", name="program")
def program_fixture():
    """simulator/phone, where every user can read it."""
    with tempfile.TemporaryDirectory(prefix="bex-simulator-") as folder:
        os.chmod(folder, 0o755)
        shutil.copytree(SOURCE / "simulator", f"{folder}/simulator",
                        ignore=shutil.ignore_patterns("__pycache__"))
        yield pathlib.Path(folder) / "simulator/phone"


@pytest.fixture(scope="session", name="standin")
def standin_fixture():
    """The stand-in for service and client, where every user can read it."""
    with tempfile.TemporaryDirectory(prefix="bex-standin-") as folder:
        os.chmod(folder, 0o755)
        yield shutil.copy(os.environ["BEX_STANDIN"], f"{folder}/standin")


@contextlib.contextmanager
def new_place():
    """A folder for phones, deep enough that proot's sockets need another one."""
    with tempfile.TemporaryDirectory(prefix=DEEP) as folder:
        if os.geteuid() == 0:
            os.chmod(folder, 0o777)
        yield pathlib.Path(folder)


@pytest.fixture(name="place")
def place_fixture():
    """A new folder for each test."""
    with new_place() as place:
        yield place


@pytest.fixture(scope="session", name="patterns")
def patterns_fixture():
    """The phones that were created once, to be copied for each test."""
    with new_place() as place:
        yield place


@pytest.fixture(scope="session", name="launcher")
def launcher_fixture(program):
    """This user's launcher, for what does not depend on sandbox and user."""
    return Launcher(program, DEFAULT_KIND, USERS[0])


@pytest.fixture(scope="session", name="new_phone")
def new_phone_fixture(launcher, patterns):
    return Phone.create(launcher, patterns / "new")


@pytest.fixture(name="phone")
def phone_fixture(new_phone, place):
    """A phone for the tests of its tools."""
    return new_phone.copy(place / "phone")


def launcher_kinds():
    """Each sandbox with each user; a sandbox that the machine refuses shows as skipped."""
    refused = pytest.mark.skipif(not NAMESPACES, reason="this machine refuses namespaces")
    return [pytest.param((kind, user), id=f"{kind}-{user}",
                         marks=[refused] if kind == "bwrap" else [])
            for kind in KINDS for user in USERS]


@pytest.fixture(scope="session", params=launcher_kinds(), name="any_launcher")
def any_launcher_fixture(request, program):
    """Every sandbox, as every user."""
    return Launcher(program, *request.param)


@pytest.fixture(scope="session", name="any_new_phone")
def any_new_phone_fixture(any_launcher, patterns, standin):
    folder = patterns / f"{any_launcher.kind}-{any_launcher.user}"
    return Phone.create(any_launcher, folder, "--install", f"{standin}={SERVICE}",
                        "--install", f"{standin}=/data/ask")


@pytest.fixture(name="any_phone")
def any_phone_fixture(any_new_phone, place):
    """A phone with the stand-in as its service and as /data/ask; switched off at the end."""
    phone = any_new_phone.copy(place / "phone")
    yield phone
    if (phone.folder / "pid").exists():
        phone.launcher("down", phone.folder)
