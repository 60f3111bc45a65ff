# Copyright 2026 The BEX Wi-Fi Authors
# SPDX-License-Identifier: Apache-2.0
"""What the service does when the phone runs out of something, and that it goes on afterwards."""

import contextlib
import os
import pathlib
import re
import resource
import shutil
import subprocess
import tempfile

import pytest

from support.phone import PHONE
from support.waiting import wait_for
from faults import nothing_lost, processes, service_process, stage

NOBODY = 65534
CALL = ["RunTxBGStart", "6", "54", "15", "1"]
FAILED = (1, b"-1\n", 1)
WORKED = (0, b"0\n", 0)
BROKEN = (4, b"", 1)
# What the C library reserves at once for a thread's allocations: so much fits without asking for more.
ARENA = 64 << 20


def outcome(client):
    """A client's exit code, its stdout, and the number of its lines on stderr."""
    out, err = client.communicate(timeout=60)
    return client.returncode, out, len(err.splitlines())


def result(phone, *call):
    with phone.start(*call) as client:
        return outcome(client)


@contextlib.contextmanager
def limited(phone, kind, value):
    """The running service has less of something in the block."""
    service = service_process(phone)
    soft, hard = resource.prlimit(service, kind)
    resource.prlimit(service, kind, (value, hard))
    yield
    resource.prlimit(service, kind, (soft, hard))


def descriptors(phone):
    return len(os.listdir(f"/proc/{service_process(phone)}/fd"))


@pytest.fixture(name="phone", params=["bwrap", "proot"])
def phone_fixture(request, monkeypatch, make_phone):
    monkeypatch.setenv("BEX_PHONE_SANDBOX", request.param)
    phone = make_phone("broadcom")
    phone.up()
    assert result(phone, *CALL) == WORKED  # from here on the chip's state has its file
    return phone


def test_no_descriptor_left(phone):
    """A new client waits, and is served once there are descriptors again, without another's help."""
    with nothing_lost(phone):
        with limited(phone, resource.RLIMIT_NOFILE, descriptors(phone)):
            client = phone.start("getWlanMode")
            wait_for(lambda: "accept: " in phone.log.read_text())
        assert outcome(client) == WORKED


@pytest.mark.parametrize("power", ["15", "1" * 100_000], ids=["short", "long"])
def test_few_descriptors_left(phone, power):
    """The calls fail: with -1 for a command that cannot run, in the transport for a long argument that
    cannot come in."""
    outcomes = []
    with nothing_lost(phone):
        for spare in range(1, 6):
            with limited(phone, resource.RLIMIT_NOFILE, descriptors(phone) + spare):
                outcomes.append(result(phone, *CALL[:3], power, *CALL[4:]))
            assert result(phone, *CALL) == WORKED
    assert outcomes[0] == (FAILED if power == "15" else BROKEN)
    assert set(outcomes) <= {FAILED, BROKEN}  # the tools have no more descriptors than the service


def test_no_shell(phone):
    shell = phone.root / "system/bin/sh"
    seen = phone.log.stat().st_size
    with nothing_lost(phone):
        kept = shell.rename(shell.with_name("sh.kept"))
        assert result(phone, *CALL) == FAILED
        assert result(phone, "isSnifferMode") == (0, b"true\n", 0)
        assert result(phone, "RunRxStop", "6") == (0, b"\n", 0)
        assert phone.commands(seen) == []
        kept.rename(shell)
        assert result(phone, *CALL) == WORKED


def test_no_memory_left(phone):
    """Output that does not fit ends the service, as the runtime ends it for any exception that leaves
    a method; started again, it serves."""
    flood = phone.folder / "flood"
    flood.write_bytes(b"7" * ARENA)
    stage(phone, "cat", "wait", "print", flood)
    left_behind = processes(phone)
    with phone.start("getWlanMode") as client:
        wait_for((phone.root / "phone/faults/cat.waiting").exists)  # the tool is not limited
        service = service_process(phone)
        # By now the thread that serves the call has what address space it takes for itself.
        status = pathlib.Path(f"/proc/{service}/status").read_text()
        size = int(re.search(r"VmSize:\s+(\d+)", status)[1]) << 10
        resource.prlimit(service, resource.RLIMIT_AS, (size + (4 << 20),) * 2)
        stage(phone, "cat", "release")
        assert outcome(client) == BROKEN
    wait_for(lambda: not any(pathlib.Path(f"/proc/{number}").exists() for number in left_behind))
    wait_for(lambda: not phone.is_up())
    stage(phone, "cat", "clear")
    phone.up()
    assert result(phone, "getWlanMode") == WORKED


def test_a_log_that_is_full(make_phone):
    phone = make_phone("broadcom")
    phone.log.symlink_to("/dev/full")
    phone.up()
    assert result(phone, *CALL) == WORKED
    with nothing_lost(phone):
        assert result(phone, *CALL) == WORKED


@pytest.mark.skipif(os.geteuid() != 0, reason="only root can become a user with nothing else running")
def test_no_process_left(make_phone):
    """The limit on processes does not count for root, so this phone is an ordinary user's."""
    phone = make_phone("broadcom")
    with tempfile.TemporaryDirectory(prefix="bex-simulator-") as folder:
        shutil.copytree(PHONE.parent, f"{folder}/simulator")
        for path in (folder, phone.folder.parent):
            os.chmod(path, 0o755)
        subprocess.run(["chown", "-R", f"{NOBODY}:{NOBODY}", phone.folder], check=True)

        def as_nobody(*command):
            return subprocess.run(
                ["setpriv", f"--reuid={NOBODY}", f"--regid={NOBODY}", "--clear-groups", *command],
                capture_output=True, check=False, timeout=60)

        def launcher(*arguments):
            return as_nobody(f"{folder}/simulator/phone", *arguments)

        def client(*call):
            ran = launcher("run", phone.folder, "/vendor/bin/bex-wifi-client", *call)
            return ran.returncode, ran.stdout, len(ran.stderr.splitlines())

        assert launcher("up", phone.folder).returncode == 0
        assert client(*CALL) == WORKED
        service = service_process(phone)
        with nothing_lost(phone):
            seen = phone.log.stat().st_size
            as_nobody("prlimit", f"--pid={service}", "--nproc=0:")
            assert client(*CALL) == FAILED
            assert client("RunRxBgStart", "6", "54", "1") == (0, b"\n", 0)
            assert phone.commands(seen) == []
            as_nobody("prlimit", f"--pid={service}", f"--nproc={resource.getrlimit(resource.RLIMIT_NPROC)[0]}:")
            assert client(*CALL) == WORKED
        assert launcher("down", phone.folder).returncode == 0
        subprocess.run(["chown", "-R", f"{os.geteuid()}:{os.getegid()}", phone.folder], check=True)


# Without a vendor there is no suite, and the first call that needs one ends the service.
RUBBISH = {
    "missing": None,
    "empty": b"",
    "binary": bytes(range(256)) * 40,
    "one long line": b"ro.hardware.wlan.vendor" * 100_000,
    "too long for a property": b"ro.hardware.wlan.vendor=" + b"x" * 100_000,
    "no values": b"ro.hardware.wlan.vendor\nro.hardware.wlan.vendor=\n=broadcom\n",
}


@pytest.mark.parametrize("content", RUBBISH.values(), ids=list(RUBBISH))
def test_a_start_without_usable_properties(make_phone, content):
    phone = make_phone("broadcom")
    properties = phone.root / "vendor/build.prop"
    good = properties.read_bytes()
    properties.unlink()
    if content is not None:
        properties.write_bytes(content)
    phone.up()
    assert result(phone, "isMimoSupport") == (0, b"false\n", 0)
    assert result(phone, "getWlanMode") == BROKEN
    phone.down()
    properties.write_bytes((content or b"") + b"\n" + good)  # rubbish beside the good does no harm
    phone.up()
    assert result(phone, "getWlanMode") == WORKED
    assert result(phone, "isMimoSupport") == (0, b"true\n", 0)
