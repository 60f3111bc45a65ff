# Copyright 2026 The BEX Wi-Fi Authors
# SPDX-License-Identifier: Apache-2.0
"""`bex-wifi-client doctor` on whole phones, healthy and broken: it names what was broken, that alone,
and what to do about it."""

import json
import os
import pathlib
import shutil
import signal

import pytest

from support.phone import CHIPS, SERVICE
from support.waiting import wait_for

FRAGMENT = f"vendor/etc/vintf/manifest/{SERVICE}.xml"


def doctor(phone, *options):
    """The checks by name, and the exit code; both forms of the report agree with each other."""
    client = phone.client("doctor", "--json", *options)
    report = json.loads(client.stdout)
    checks = {check["name"]: check for check in report["checks"]}
    assert len(checks) == len(report["checks"])
    assert (report["exit_code"], report["ok"]) == (client.returncode, client.returncode == 0)
    assert client.stderr.decode().count("\n") == client.returncode
    return checks, client.returncode


def named(checks, status):
    return {name for name, check in checks.items() if check["status"] == status}


def expect_problems(phone, remedies, *options):
    """Expects exactly these problems; `remedies` holds a part of the remedy of each."""
    checks, code = doctor(phone, *options)
    assert named(checks, "problem") == set(remedies)
    assert code == (1 if remedies else 0)
    for name, remedy in remedies.items():
        assert remedy in checks[name]["remedy"]
    return checks


def write_property(phone, name, value):
    """Sets a property in build.prop; None takes it out."""
    file = phone.root / "vendor/build.prop"
    lines = [line for line in file.read_text().splitlines() if not line.startswith(f"{name}=")]
    lines += [] if value is None else [f"{name}={value}"]
    file.write_text("\n".join(lines) + "\n")


def processes(phone):
    """Those of the phone that is up, as this machine numbers them, with the name of each program."""
    found = {}
    waiting = (phone.folder / "pid").read_text().split()
    while waiting:
        for task in pathlib.Path("/proc", waiting.pop(), "task").iterdir():
            children = (task / "children").read_text().split()
            for child in children:
                line = pathlib.Path("/proc", child, "cmdline").read_bytes()
                found[int(child)] = line.split(b"\0")[0].decode().split("/")[-1]
            waiting += children
    return found


@pytest.fixture(name="up")
def phone_that_is_up(make_phone):
    def make(chip="broadcom"):
        phone = make_phone(chip)
        phone.up()
        return phone

    return make


@pytest.mark.parametrize("chip", CHIPS)
def test_a_healthy_phone(up, chip):
    checks = expect_problems(up(chip), {})
    # A simulated phone has no init and no framework, and its service hides its process.
    assert named(checks, "unknown") == {"init", "matrix", "program"}
    assert chip in checks["chip"]["found"]


def test_text_is_for_people(up):
    client = up().client("doctor")
    assert (client.returncode, client.stderr) == (0, b"")
    assert b"\nok       shell: /vendor/bin/sh\n" in client.stdout


def test_not_declared(up):
    phone = up()
    (phone.root / FRAGMENT).unlink()
    expect_problems(phone, {"declared": f"/{FRAGMENT}", "manifest": f"/{FRAGMENT}"})


def test_declared_for_another_interface(up):
    phone = up()
    fragment = phone.root / FRAGMENT
    fragment.write_text(fragment.read_text().replace("IWifiService", "IWifi"))
    expect_problems(phone, {"declared": f"interface and instance in /{FRAGMENT}"})


def test_declared_twice(up):
    phone = up()
    shutil.copy(phone.root / FRAGMENT, phone.root / "vendor/etc/vintf/manifest.xml")
    checks = expect_problems(phone, {"manifest": "remove all but one"})
    assert f"/vendor/etc/vintf/manifest.xml, /{FRAGMENT}" in checks["manifest"]["found"]


def test_not_in_the_compatibility_matrix(up):
    phone = up()
    matrix = phone.root / "system/etc/vintf/compatibility_matrix.device.xml"
    matrix.parent.mkdir()
    matrix.write_text("<compatibility-matrix/>")
    expect_problems(phone, {"matrix": "DEVICE_FRAMEWORK_COMPATIBILITY_MATRIX_FILE"})
    shutil.copy(phone.root / FRAGMENT, matrix)  # what is looked for stands there in the same way
    expect_problems(phone, {})


def test_a_service_that_was_never_started(make_phone):
    expect_problems(make_phone("broadcom"), {"registered": "start vendor.bex_wifi"})


def test_a_service_that_was_killed(up):
    phone = up()
    for pid, program in processes(phone).items():
        if program == SERVICE:
            os.kill(pid, signal.SIGKILL)
    wait_for(lambda: phone.client("isMimoSupport").returncode == 3)
    expect_problems(phone, {"registered": "avc.*hwservice_manager"})


@pytest.mark.parametrize("options", [[], ["--timeout", "2"]], ids=["default", "timeout"])
def test_a_service_that_hangs(up, options):
    """The doctor ends all the same."""
    phone = up()
    stopped = processes(phone)
    assert SERVICE in stopped.values()
    try:
        # All, since proot does not pass the signal on to what it traces.
        for pid in stopped:
            os.kill(pid, signal.SIGSTOP)
        checks = expect_problems(phone, {"answering": "--timeout"}, *options)
        assert {"hash", "program"} <= named(checks, "unknown")
    finally:
        for pid in stopped:
            os.kill(pid, signal.SIGCONT)
    expect_problems(phone, {})


def test_a_state_of_init(up):
    phone = up()
    write_property(phone, "init.svc.vendor.bex_wifi", "restarting")
    expect_problems(phone, {"init": "start vendor.bex_wifi"})


@pytest.mark.parametrize("vendor", [None, "acme", "Qcom"])
def test_an_unknown_vendor(up, vendor):
    phone = up("qca")
    write_property(phone, "ro.hardware.wlan.vendor", vendor)
    checks = expect_problems(phone, {"vendor": "broadcom or qcom"})
    assert "the first call ends the service" in checks["vendor"]["found"]
    assert {"chip", "tools", "driver"} <= named(checks, "unknown")


def test_an_unknown_chip(up):
    """It counts as another family, whose tools may not be there."""
    phone = up("wcn39xx")
    write_property(phone, "ro.hardware.wlan.chip", None)
    checks = expect_problems(phone, {"chip": "vendor/build.prop"})
    assert "family wcn39xx" in checks["chip"]["found"]


def test_without_the_shell(up):
    phone = up()
    shell = phone.root / "vendor/bin/sh"
    shell.chmod(0o644)
    expect_problems(phone, {"shell": "chmod 755 /vendor/bin/sh"})
    shell.unlink()
    expect_problems(phone, {"shell": "sh_vendor"})


@pytest.mark.parametrize("chip", ["broadcom", "wcn", "qca", "wcn685x"])
def test_each_tool(up, chip):
    """Whether it is called by its path, by its name, or both."""
    phone = up(chip)
    callers = {}
    for name in doctor(phone)[0]:
        if name.startswith("tool "):
            callers.setdefault(name.split("/")[-1].removeprefix("tool "), []).append(name)
    assert len(callers) > 5
    for tool, names in callers.items():
        program = phone.root / "vendor/bin" / tool
        program.chmod(0o644)
        expect_problems(phone, dict.fromkeys(names, f"chmod 755 /vendor/bin/{tool}"))
        program.rename(phone.folder / "away")
        expect_problems(phone, dict.fromkeys(names, "install it in /vendor/bin with mode 755"))
        (phone.folder / "away").rename(program)
        program.chmod(0o755)
    expect_problems(phone, {})


def test_a_tool_of_the_system_alone(up):
    phone = up()
    (phone.root / "vendor/bin/wl").rename(phone.root / "system/bin/wl")
    checks = expect_problems(phone, {})
    assert checks["tool wl"]["status"] == "unknown"
    assert "logcat | grep avc" in checks["tool wl"]["remedy"]


@pytest.mark.parametrize("chip", [chip for chip in CHIPS if chip != "broadcom"])
def test_without_module_files(up, chip):
    phone = up(chip)
    shutil.rmtree(phone.root / "vendor/lib/modules")
    expect_problems(phone, {"module": "restart the service"})


@pytest.mark.parametrize("path, remedy", [
    ("/etc/firmware/fw_bcmdhd.bin", "install the chip's firmware image"),
    ("/etc/firmware/fw_bcmdhd_mfg.bin", "install the chip's firmware image"),
    ("/sys/module/bcmdhd/parameters/firmware_path", "with this parameter"),
    ("/sys/module/wlan/parameters/con_mode", "with this parameter"),
])
def test_without_a_file_of_the_driver(up, path, remedy):
    phone = up()
    (phone.root / ("system" + path if path.startswith("/etc") else path[1:])).unlink()
    expect_problems(phone, {f"file {path}": remedy})


def test_an_unloaded_driver(up):
    """Its parameter comes back with it, so nothing is known to be wrong."""
    phone = up("wcn6750")
    assert phone.run("rmmod", "wlan.ko").returncode == 0
    checks = expect_problems(phone, {})
    mode = checks["file /sys/module/wlan/parameters/con_mode"]
    assert mode["status"] == "unknown"
    assert "module_load" in mode["remedy"]


def test_a_log_without_the_commands(up):
    phone = up()
    write_property(phone, "log.tag", "I")
    expect_problems(phone, {"command-log": "setprop log.tag.wifi@1.0-VendorTestSuit D"})
