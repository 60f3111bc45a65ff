# Copyright 2026 The BEX Wi-Fi Authors
# SPDX-License-Identifier: Apache-2.0
"""phone create: what a phone holds, and that a failure leaves nothing."""

import pytest

from conftest import SERVICE, Phone

GOOD = "driver bcmdhd\ntool ifconfig\n"


def refused(launcher, *arguments):
    """The one line on stderr of a create that fails."""
    result = launcher("create", *arguments)
    assert result.returncode == 1
    assert result.stdout == ""
    line = result.stderr
    assert line.startswith("phone: ") and line.count("\n") == 1, line
    return line


def test_holds_what_a_phone_holds(phone):
    assert phone.output("echo $KSH_VERSION").startswith("@(#)MIRBSD KSH")
    for path in ("/vendor/bin/cat", "/vendor/bin/ifconfig", "/vendor/bin/iw", "/vendor/bin/sh",
                 "/vendor/etc/vintf/manifest", "/etc/firmware/fw_bcmdhd.bin",
                 "/system/etc/firmware/fw_bcmdhd_mfg.bin", "/dev/socket", "/data/local/tmp"):
        assert phone.shell(f"ls -d {path}").returncode == 0, path
    assert phone.output("cat /sys/module/wlan/parameters/con_mode") == "0"
    assert phone.output("cat /sys/module/bcmdhd/parameters/firmware_path") \
        == "/etc/firmware/fw_bcmdhd.bin"
    assert "ro.hardware.wlan.vendor=broadcom\n" in phone.output("cat /vendor/build.prop")
    assert phone.output("getprop log.tag") == "D"


def test_tools_are_found_by_name(phone):
    for tool in ("busybox", "cat", "getprop", "ifconfig", "iw", "setprop", "sleep", "wl"):
        assert phone.output(f"whence {tool}") == f"/vendor/bin/{tool}"


def test_installs_a_binary_with_its_libraries(launcher, place, standin):
    phone = Phone.create(launcher, place / "phone", f"--install={standin}=/data/deep/er/tool")
    assert list(phone.root.rglob("libstdc++.so.6"))
    result = phone.run("/data/deep/er/tool", "line")
    assert result.stderr == "standin: No such file or directory\n"  # it ran; nobody listens


def test_its_devices_are_its_own_or_none_is(launcher, place):
    """/dev/tty, too, which cannot be opened without a controlling terminal."""
    made = launcher("create", "broadcom", place / "phone", start_new_session=True)
    assert made.returncode == 0, made.stderr
    devices = [path for path in (place / "phone/root/dev").iterdir() if path.name != "socket"]
    assert len({path.is_char_device() for path in devices}) == 1


def test_installs_any_other_file_as_it_is(launcher, place):
    text = place / "text"
    text.write_text("manifest\n")
    phone = Phone.create(launcher, place / "phone",
                         "--install", f"{text}=/vendor/etc/vintf/manifest/x")
    assert phone.output("cat /vendor/etc/vintf/manifest/x") == "manifest"


def test_an_empty_folder_may_be_there(launcher, place):
    (place / "phone").mkdir()
    assert Phone.create(launcher, place / "phone").output("echo works") == "works"


def test_a_phone_is_not_overwritten(phone, place):
    assert "is a phone already" in refused(phone.launcher, "broadcom", phone.folder)
    assert phone.output("echo works") == "works"
    (place / "other").mkdir()
    (place / "other/file").touch()
    assert "not an empty folder" in refused(phone.launcher, "broadcom", place / "other")


@pytest.mark.parametrize("install, complaint", [
    ("nonesuch=/data/x", "no file nonesuch"),
    ("/etc/passwd", "not SRC=DEST"),
    ("/etc/passwd=data/x", "not an absolute path"),
    ("/etc/passwd=/data/../../x", "not an absolute path"),
    ("/etc/passwd=/vendor", "is a folder in the phone"),
    ("/etc/passwd=/system/bin/sh/x", "cannot copy /etc/passwd to /system/bin/sh/x"),
])
def test_a_bad_install_leaves_nothing(launcher, place, install, complaint):
    assert complaint in refused(launcher, "broadcom", place / "phone", "--install", install)
    assert not list(place.iterdir())


@pytest.mark.parametrize("text, complaint", [
    ("tool ifconfig\n", "no driver"),
    (GOOD + "gadget x\n", "3: unknown statement 'gadget'"),
    (GOOD + "property ro.x\n", "3: too few words"),
    (GOOD + "property ro..x 1\n", "3: bad property name"),
    (GOOD + "property a 1\nproperty a 2\n", "4: 'a' is given twice"),
    (GOOD + "driver bcmdhd\n", "3: a second driver"),
    (GOOD + "tool nonesuch\n", "3: no 'nonesuch' in simulator/tools"),
    (GOOD + "tool\n", "3: too few words"),
    (GOOD + "tool ../phone\n", "3: bad name"),
    (GOOD + "parameter wlan ../../x 1\n", "3: bad name"),
    (GOOD + "parameter wlan\n", "3: too few words"),
    (GOOD + "file etc/x text\n", "3: 'etc/x' is not an absolute path"),
    (GOOD + "capture a b c\n", "3: bad name 'b c'"),
    ("\0\xff", "not a text file"),
    (GOOD + "property a x\0y\n", "not a text file"),
    (GOOD + "file /data/x\0y text\n", "not a text file"),
])
def test_a_bad_description_is_one_clear_line(launcher, place, text, complaint):
    description = place / "description"
    description.write_bytes(text.encode("latin-1"))
    line = refused(launcher, description, place / "phone")
    assert complaint in line and str(description) in line
    assert list(place.iterdir()) == [description]


def test_an_unknown_chip_names_the_known_ones(launcher, place):
    assert "no phone 'nonesuch'; known: broadcom" in refused(launcher, "nonesuch", place / "phone")
    assert "No such file" in refused(launcher, place / "none", place / "phone")


def test_a_phone_of_an_own_description(launcher, place):
    description = place / "description"
    description.write_text(GOOD + "property ro.hardware.wlan.vendor acme  # none of ours\n")
    phone = Phone.create(launcher, place / "phone", chip=description)
    assert phone.output("getprop ro.hardware.wlan.vendor") == "acme"
    assert phone.run("wl", "up").returncode == 127


@pytest.mark.parametrize("arguments", [
    (), ("nonesuch",), ("create",), ("create", "a", "b", "c"), ("create", "--force", "a", "b"),
    ("up",), ("run", "x"), ("fault", "x", "wl")])
def test_wrong_usage(launcher, arguments):
    result = launcher(*arguments)
    assert result.returncode == 2
    assert result.stderr.startswith("usage: phone create")


def test_what_is_no_phone_is_refused(launcher, place):
    for command in (("up",), ("down",), ("fault", "wl", "clear"), ("restart-service",)):
        result = launcher(command[0], place, *command[1:])
        assert result.returncode == 1
        assert result.stderr == f"phone: {place} is not a phone (phone create makes one)\n"


def test_up_needs_a_service(phone):
    result = phone.launcher("up", phone.folder)
    assert result.returncode == 1
    assert f"create it with --install SRC={SERVICE}" in result.stderr
