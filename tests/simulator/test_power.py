# Copyright 2026 The BEX Wi-Fi Authors
# SPDX-License-Identifier: Apache-2.0
"""Switching phones on and off and running commands in them, in both sandboxes and as every user."""

import os
import pathlib
import signal

import pytest

from conftest import ENDLESS, SERVICE, Launcher, Phone
from support.processes import children
from support.waiting import wait_for

ASK = "/data/ask"


def ask(phone, line):
    """What a shell line prints that the stand-in runs for its client, with "same " ahead when both
    are the same user."""
    result = phone.run(ASK, line)
    assert (result.returncode, result.stderr) == (0, "")
    return result.stdout


def test_a_client_reaches_the_service(any_phone):
    any_phone.do("up")
    assert ask(any_phone, "getprop ro.hardware.wlan.vendor") == "same broadcom\n"
    assert (any_phone.folder / "log").read_text() == "standin: serving\n"
    # Both see one phone: what one changes the other finds.
    any_phone.output("ifconfig wlan0 up; echo 5 > /sys/module/wlan/parameters/con_mode")
    assert ask(any_phone, "wl mpc; cat /sys/module/wlan/parameters/con_mode") == "same 1\n5\n"


def test_down_leaves_no_process_and_no_file(any_phone):
    any_phone.do("up")
    inside = any_phone.processes()
    assert inside
    assert any_phone.borrowed_folder().exists() == (any_phone.launcher.kind == "proot")
    sleeping = any_phone.start(f"{ASK} 'sleep {ENDLESS}'")
    wait_for(any_phone.sleepers)
    any_phone.do("down")
    assert sleeping.wait(60) == 0  # its service has gone
    assert any_phone.processes() == []
    assert not any_phone.borrowed_folder().exists()
    assert not [path for number in inside
                for path in pathlib.Path("/tmp").glob(f"prooted-{number}-*")]


def test_up_and_down_twice(any_phone):
    folder = any_phone.folder
    any_phone.do("up")
    again = any_phone.launcher("up", folder)
    assert (again.returncode, again.stderr) == (0, f"phone: {folder} is up already\n")
    any_phone.do("down")
    again = any_phone.launcher("down", folder)
    assert (again.returncode, again.stderr) == (0, f"phone: {folder} is not up\n")
    any_phone.do("up")
    assert ask(any_phone, "echo again") == "same again\n"


def test_booting_resets_and_restarting_the_service_does_not(any_phone):
    change = "ifconfig wlan0 up; setprop vendor.x 1; echo 4 > /sys/module/wlan/parameters/con_mode"
    read = ("ifconfig | busybox grep -c UP; getprop vendor.x; "
            "cat /sys/module/wlan/parameters/con_mode")
    any_phone.do("up")
    any_phone.output(change)
    any_phone.do("restart-service")
    assert ask(any_phone, read) == "same 1\n1\n4\n"
    assert (any_phone.folder / "log").read_text() == "standin: serving\n" * 2
    any_phone.do("down")
    any_phone.do("up")
    assert ask(any_phone, read) == "same 0\n\n0"
    any_phone.do("down")
    result = any_phone.launcher("restart-service", any_phone.folder)
    assert (result.returncode, result.stderr) == (1, f"phone: {any_phone.folder} is not up\n")


@pytest.mark.parametrize("script, outcome", [("exit 3", "3"), ("kill -9 $$", "137")])
def test_a_service_that_ends_is_reported(any_launcher, place, script, outcome):
    service = place / "service"
    service.write_text(f"#!/system/bin/sh\necho no radio >&2\n{script}\n")
    service.chmod(0o755)
    phone = Phone.create(any_launcher, place / "phone", "--install", f"{service}={SERVICE}")
    result = any_launcher("up", phone.folder)
    assert result.returncode == 1
    assert result.stderr == (f"phone: the service ended with {outcome} before it registered; "
                             f"see {phone.folder}/log\n")
    assert (phone.folder / "log").read_text().startswith("no radio\n")
    assert not phone.borrowed_folder().exists()
    assert any_launcher("down", phone.folder).stderr == f"phone: {phone.folder} is not up\n"
    assert phone.processes() == []


def test_killing_the_keeper_ends_the_phone(any_phone):
    any_phone.do("up")
    os.kill(int((any_phone.folder / "pid").read_text()), signal.SIGKILL)
    wait_for(lambda: any_phone.processes() == [])
    any_phone.do("up")
    assert ask(any_phone, "echo again") == "same again\n"
    os.kill(int((any_phone.folder / "pid").read_text()), signal.SIGKILL)
    wait_for(lambda: any_phone.processes() == [])
    any_phone.launcher("down", any_phone.folder)
    assert not any_phone.borrowed_folder().exists()


@pytest.mark.parametrize("victim, number", [
    ("launcher", signal.SIGTERM), ("launcher", signal.SIGKILL), ("holder", signal.SIGKILL),
    ("sandbox", signal.SIGKILL)])
def test_killing_a_run_takes_everything_inside_with_it(any_new_phone, victim, number):
    call = any_new_phone.start(f"busybox setsid sleep {ENDLESS} & sleep {ENDLESS} & "
                               f"exec sleep {ENDLESS}")
    wait_for(lambda: len(any_new_phone.sleepers()) == 3)
    pid = call.pid
    for _ in range(("launcher", "holder", "sandbox").index(victim)):
        pid = children(pid)[0]
    os.kill(pid, number)
    call.wait(60)
    wait_for(lambda: any_new_phone.processes() == [])
    if victim == "sandbox":
        assert not list(pathlib.Path("/tmp").glob(f"prooted-{pid}-*"))


@pytest.mark.parametrize("line, code", [("exit 0", 0), ("exit 255", 255), ("kill -9 $$", 137)])
def test_run_passes_the_exit_code_on(any_new_phone, line, code):
    assert any_new_phone.shell(line).returncode == code


def test_run_passes_streams_and_arguments_as_they_are(any_new_phone):
    script = 'printf "%s|" "$@"; cat; echo error >&2'
    result = any_new_phone.run("sh", "-c", script, "sh", "a  b", "", "$HOME;'\"*",
                               input="from outside\n")
    assert result.stdout == "a  b||$HOME;'\"*|from outside\n"
    assert result.stderr == "error\n"


def test_run_of_what_cannot_be_run(any_new_phone):
    assert any_new_phone.run("nonesuch").returncode == 127
    assert any_new_phone.run("/vendor/build.prop").returncode == 126


def test_commands_have_the_phone_s_environment_and_no_descriptors(any_new_phone, place):
    launcher = Launcher("", any_new_phone.launcher.kind, "self")
    launcher.line = ["sh", "-c", 'exec 5>leak; exec "$@"', "sh", *any_new_phone.launcher.line]
    result = launcher("run", any_new_phone.folder, "sh", "-c", "env; echo leaked >&5", cwd=place)
    assert result.returncode != 0
    assert (place / "leak").read_text() == ""
    assert "PATH=/vendor/bin:/vendor/xbin:/odm/bin:/system/bin:/system/xbin\n" in result.stdout
    assert "SECRET_OF_THE_HOST" not in result.stdout


def test_proot_has_one_processor(any_new_phone):
    """On several it would be many times slower."""
    count = 1 if any_new_phone.launcher.kind == "proot" else len(os.sched_getaffinity(0))
    assert any_new_phone.run("busybox", "nproc").stdout == f"{count}\n"


def test_the_devices_work(any_new_phone):
    assert any_new_phone.output("cat /dev/null; echo x > /dev/null; "
                            "echo x 2>/dev/null >/dev/full || echo full; "
                            "head -c 3 /dev/zero | wc -c; head -c 3 /dev/urandom | wc -c; "
                            "cat /dev/null") == "full\n3\n3"


def test_an_unknown_sandbox_is_refused(phone):
    launcher = Launcher(phone.launcher.line[-1], "jail", phone.launcher.user)
    result = launcher("run", phone.folder, "true")
    assert (result.returncode, result.stderr) \
        == (125, "phone: BEX_PHONE_SANDBOX is 'jail', not bwrap or proot\n")


@pytest.mark.parametrize("words", [b"jail\n", b"", b"\xff"])
def test_a_spoilt_record_of_the_sandbox_is_one_clear_line(phone, words):
    (phone.folder / "sandbox").unlink()  # the pattern's, too
    (phone.folder / "sandbox").write_bytes(words)
    launcher = Launcher(phone.launcher.line[-1], "", phone.launcher.user)
    result = launcher("run", phone.folder, "true")
    assert result.returncode == 125
    assert result.stderr.startswith(f"phone: {phone.folder}/sandbox names '")


def test_the_phone_of_another_user_is_refused(any_new_phone, program):
    if any_new_phone.launcher.user == "self":
        return  # only root can be two users
    other = {"root": "nobody", "nobody": "root"}[any_new_phone.launcher.user]
    launcher = Launcher(program, any_new_phone.launcher.kind, other)
    result = launcher("run", any_new_phone.folder, "true")
    assert (result.returncode, result.stderr) \
        == (125, f"phone: {any_new_phone.folder} belongs to another user\n")
