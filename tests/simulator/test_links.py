# Copyright 2026 The BEX Wi-Fi Authors
# SPDX-License-Identifier: Apache-2.0
"""What a phone plants in its files, for the launcher to stumble over: the machine's files stay."""

import os
import socket

import pytest

from support.waiting import wait_for

MARK = ". /phone/lib/tool\n"


@pytest.fixture(name="victim")
def victim_fixture(place):
    """A folder of the machine that everybody may write to, with a file, a tool and a socket. It
    must stay as it is."""
    folder = place / "victim"
    (folder / "hidl").mkdir(parents=True)
    for name in ("bin", "faults", "missing", "socket"):  # what a link further up would lead to
        (folder / name).symlink_to(".")
    for name in ("file", "wl", "wl.gate", "wl.waiting", "null"):
        (folder / name).write_text(MARK)
        (folder / name).chmod(0o666)
    for path in (folder, folder / "hidl"):
        path.chmod(0o777)
        with socket.socket(socket.AF_UNIX) as server:
            directory = os.open(path, os.O_RDONLY)  # the path itself is too long for a socket's
            server.bind(f"/proc/self/fd/{directory}/standin")
            os.close(directory)
        (path / "standin").chmod(0o777)
    before = listing(folder)
    yield folder
    assert listing(folder) == before


def listing(folder):
    return {path: (path.lstat().st_mode, path.lstat().st_mtime_ns,
                   path.read_text() if path.is_file() else "")
            for path in [folder, *folder.rglob("*")]}


def replace(phone, folder, target):
    """Puts a link in the place of a folder, as what runs inside could under proot."""
    os.rename(phone.root / folder[1:], phone.root / "moved")
    (phone.root / folder[1:]).symlink_to(target)


def refused(phone, command, *arguments):
    """Whether a launcher command fails with one line."""
    result = phone.launcher(command, phone.folder, *arguments)
    assert result.stdout == ""
    if result.returncode == 0:
        return False
    assert (result.returncode, result.stderr.count("\n")) == (1, 1), result.stderr
    assert result.stderr.startswith("phone: "), result.stderr
    return True


@pytest.mark.parametrize("name", [
    "wl", "wl.new", "wl.gate", "wl.new.gate", "wl.bytes1", "wl.new.bytes1", "wl.waiting"])
def test_a_link_in_place_of_a_fault_is_replaced(phone, victim, name):
    phone.output(f"ln -s {victim}/file /phone/faults/{name}")
    assert not refused(phone, "fault", "wl", "print", victim / "file", "wait", "exit", 5)
    call = phone.start("wl up")
    wait_for((phone.root / "phone/faults/wl.waiting").exists)
    phone.fault("wl", "release")
    assert call.wait(60) == 5
    phone.output(f"ln -sf {victim}/file /phone/faults/{name}")
    phone.fault("wl", "clear")
    assert [name for name in os.listdir(phone.root / "phone/faults") if "new" not in name] == []


@pytest.mark.parametrize("folder", ["/phone/faults", "/phone/missing", "/phone", "/vendor/bin",
                                    "/vendor"])
def test_a_link_in_place_of_a_folder_is_refused(phone, victim, folder):
    replace(phone, folder, victim)
    for actions in (("exit", 1), ("print", victim / "file", "wait"), ("missing",), ("clear",),
                    ("release",)):
        assert refused(phone, "fault", "wl", *actions)


@pytest.mark.parametrize("planted", ["mkfifo wl", "mkdir wl", "ln -s /dev/zero wl", "ln -s wl wl"])
def test_a_tool_that_is_no_file_is_no_tool(phone, planted):
    phone.output(f"cd /vendor/bin; rm wl; {planted}")
    for actions in (("exit", 1), ("missing",), ("clear",)):
        assert refused(phone, "fault", "wl", *actions)


@pytest.mark.parametrize("planted", [
    "rm -r /dev/socket/hidl; ln -s {} /dev/socket/hidl",
    "mv /dev/socket/hidl /dev/socket/moved; ln -s {} /dev/socket/hidl"])
def test_a_link_in_place_of_the_sockets_is_not_followed(any_phone, victim, planted):
    any_phone.do("up")
    any_phone.output(planted.format(victim))
    # Under proot the folder of the sockets is made anew each time.
    assert refused(any_phone, "restart-service") == (any_phone.launcher.kind == "bwrap")
    any_phone.launcher("down", any_phone.folder)


@pytest.mark.parametrize("folder", ["/dev", "/proc", "/dev/socket"])
def test_a_link_in_place_of_a_mount_is_not_followed(any_phone, victim, folder):
    """While bwrap mounts, the machine's files lie below /oldroot."""
    for target in (str(victim), f"/oldroot{victim}"):
        replace(any_phone, folder, target)
        for command in ("up", "down"):
            any_phone.launcher(command, any_phone.folder)
        any_phone.run("true")
        (any_phone.root / folder[1:]).unlink()
        os.rename(any_phone.root / "moved", any_phone.root / folder[1:])


def test_what_is_mounted_on_cannot_be_replaced_inside(any_new_phone):
    if any_new_phone.launcher.kind == "bwrap":
        for folder in ("/dev", "/proc"):
            result = any_new_phone.shell(f"rename {folder} {folder}.moved")
            assert "busy" in result.stderr, result.stderr
