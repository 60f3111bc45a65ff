# Copyright 2026 The BEX Wi-Fi Authors
# SPDX-License-Identifier: Apache-2.0
"""One program at a time uses a phone: the kit's lock, and that of shell scripts."""

import pathlib
import re
import subprocess
import sys
import tempfile
import threading

import pytest

import bexwifi
from bexwifi import lock
from support.adb import TIMEOUT, Adb, Running
from support.kit import raises
from support.phone import ROOT
from support.waiting import wait_for

README = (ROOT / "client/README.md").read_text(encoding="utf-8")
RADIO_SCRIPT = re.search(r"^cat >transmit.sh <<'END'\n(.*?)^END$", (ROOT / "docs/station.md").read_text(
    encoding="utf-8"), re.M | re.S)[1]


def path_of(serial):
    """The file that client/README.md tells shell scripts to lock."""
    name = re.search(r"flock -o (/tmp/\S+\.lock) adb", README)[1]
    return pathlib.Path(name.replace("$SERIAL", serial))


def is_free(serial):
    return subprocess.run(["flock", "-n", path_of(serial), "true"], check=False,
                          timeout=TIMEOUT).returncode == 0


def test_a_use_of_the_radio_keeps_shell_scripts_away(phone):
    with phone.monitor(6, 20):
        assert phone.call("isSnifferMode").value
        assert not is_free(phone.serial)
    assert is_free(phone.serial)


def test_the_lock_of_a_shell_script_keeps_the_kit_away(phone, caplog):
    assert phone.methods
    with Running(["flock", path_of(phone.serial), "sh", "-c", "echo locked; read line"],
                 stdin=subprocess.PIPE, stdout=subprocess.PIPE) as script:
        assert script.stdout.readline() == b"locked\n"
        answers = []
        call = threading.Thread(target=lambda: answers.append(phone.call("isMimoSupport").value))
        call.start()
        wait_for(lambda: caplog.messages == [f"phone {phone.serial}: another program uses it; waiting"])
        assert answers == []
        script.communicate(b"\n")
        call.join(TIMEOUT)
    assert answers == [True]


@pytest.mark.parametrize("script", [
    "SERIAL=$1; " + re.search(r"^flock .*$", README, re.M)[0], RADIO_SCRIPT], ids=["flock", "transmit.sh"])
def test_a_server_that_adb_starts_does_not_keep_the_lock(script):
    with tempfile.TemporaryDirectory(prefix="bex-adb-") as home:
        adb, serial = Adb(home), pathlib.Path(home).name
        try:
            assert subprocess.run(["bash", "-c", script, "bash", serial, "0"], env=adb.environment, check=False,
                                  timeout=TIMEOUT, capture_output=True).returncode == 1
            assert pathlib.Path(home, "socket").exists()
            assert is_free(serial)
        finally:
            adb("kill-server")
            path_of(serial).unlink(missing_ok=True)


def test_other_calls_may_be_kept_away_for_longer(phone):
    with phone.lock:
        phone.call("isMimoSupport")
        assert not is_free(phone.serial)
        assert bexwifi.Phone(phone.serial).call("isMimoSupport").value
        assert not is_free(phone.serial)
    assert is_free(phone.serial)


def test_phones_have_locks_of_their_own(tmp_path, monkeypatch):
    monkeypatch.setattr(lock, "PATH", str(tmp_path / "{}"))
    with bexwifi.Phone("one").lock, bexwifi.Phone("an/other").lock:
        assert sorted(path.name for path in tmp_path.iterdir()) == ["an_other", "one"]


def test_threads_of_a_program_take_turns(tmp_path, monkeypatch):
    monkeypatch.setattr(lock, "PATH", str(tmp_path / "{}"))
    inside = []

    def use():
        for _ in range(50):
            with bexwifi.Phone("shared").lock:
                inside.append(threading.get_ident())
                assert inside == [threading.get_ident()]
                inside.clear()

    threads = [threading.Thread(target=use) for _ in range(4)]
    for thread in threads:
        thread.start()
    for thread in threads:
        thread.join(TIMEOUT)
    assert not inside


@pytest.mark.parametrize("end", ["kill -9 $PPID", "exit 0"])
def test_the_lock_is_free_however_a_program_ends(phone, end):
    program = ("import os, sys, bexwifi; lock = bexwifi.Phone(sys.argv[1]).lock.__enter__(); "
               "os.system(sys.argv[2]); os._exit(3)")
    ended = subprocess.run([sys.executable, "-c", program, phone.serial, end], check=False,
                           cwd=ROOT / "station", timeout=TIMEOUT)
    assert ended.returncode == (3 if end == "exit 0" else -9)
    assert is_free(phone.serial)


def test_a_lock_that_cannot_be_had(tmp_path, monkeypatch):
    monkeypatch.setattr(lock, "PATH", str(tmp_path / "{}"))
    (tmp_path / "link").symlink_to("/dev/null")
    (tmp_path / "folder").mkdir()
    for serial in ("link", "folder"):
        phone = bexwifi.Phone(serial)
        raises(bexwifi.NoLock, f"{tmp_path}/{serial}: ", phone.doctor)
