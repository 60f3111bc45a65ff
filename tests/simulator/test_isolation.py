# Copyright 2026 The BEX Wi-Fi Authors
# SPDX-License-Identifier: Apache-2.0
"""Nothing inside a phone reaches the machine around it: in both sandboxes, as root and not.

What is tried asks for the state that the machine is in already, so that a leak shows without doing
harm: an interface that is up is asked to be up.
"""

import ctypes
import os
import pathlib
import platform
import stat
import subprocess

import pytest

from conftest import ENDLESS, SOURCE, Launcher, Phone
from support.waiting import wait_for

# The version of Landlock that the kernel has.
LANDLOCK = ctypes.CDLL(None).syscall(444, None, 0, 1)
IFF_UP = 1  # from <linux/if.h>
INTERFACES = pathlib.Path("/sys/class/net")


def machine():
    """What must stay as it is: interfaces, modules, the host's name, devices."""
    flags = {path.name: [(path / name).read_text() for name in ("flags", "mtu", "tx_queue_len")]
             for path in INTERFACES.iterdir() if (path / "flags").exists()}
    modules = pathlib.Path("/proc/modules")
    return {
        "interfaces": flags,
        "modules": modules.read_text().split("\n") if modules.exists() else [],
        "sys": sorted(path.name for path in pathlib.Path("/sys/module").iterdir()),
        "name": platform.node(),
        "mounts": pathlib.Path("/proc/self/mounts").read_text(),
        "devices": [os.stat(f"/dev/{name}").st_ctime_ns for name in ("null", "zero", "urandom")],
    }


@pytest.fixture(autouse=True)
def unchanged_machine():
    """Every test here ends on the machine that it began on."""
    before = machine()
    yield
    assert machine() == before


def as_they_are():
    """A busybox line for each interface of the machine that sets it to what it is."""
    for path in sorted(INTERFACES.iterdir()):
        if (path / "flags").exists():
            word = "up" if int((path / "flags").read_text(), 16) & IFF_UP else "down"
            mtu = (path / "mtu").read_text().strip()
            yield f"busybox ifconfig {path.name} {word}"
            yield f"busybox ip link set dev {path.name} {word} mtu {mtu}"


def test_no_interface_of_the_machine_can_be_changed(any_new_phone):
    lines = list(as_they_are())
    assert lines
    outcomes = any_new_phone.output("".join(f"{line} 2>/dev/null; echo $?; " for line in lines))
    for line, outcome in zip(lines, outcomes.split(), strict=True):
        # lo exists inside, too: the phone's own, or the machine's out of reach.
        assert outcome != "0", line


@pytest.mark.skipif(os.geteuid() != 0, reason="shows what root may do outside")
def test_the_same_lines_work_outside():
    """So the refusal is the sandbox's doing."""
    for line in as_they_are():
        assert subprocess.run(line.split(), check=False).returncode == 0, line


def test_no_interface_of_the_machine_can_be_seen(any_new_phone):
    if any_new_phone.launcher.kind == "proot":
        # The machine's network is shared, but all that lists it is out of reach.
        assert any_new_phone.shell("ls /proc /sys/class/net").stdout == "/proc:\n"
        return
    listing = any_new_phone.output("busybox ip -o link")
    assert [line.split(": ")[1] for line in listing.splitlines()] == ["lo"]
    assert any_new_phone.output("busybox tail -n +3 /proc/net/dev").split(":")[0].strip() == "lo"


def test_no_module_can_be_loaded_or_removed(any_phone):
    result = any_phone.shell("echo junk > /tmp/wlan.ko; busybox insmod /tmp/wlan.ko con_mode=5")
    assert result.returncode != 0
    # Refused before the kernel looks into the file; the second on kernels without modules.
    assert ("Operation not permitted" in result.stderr
            or "kernel does not support requested operation" in result.stderr)
    assert any_phone.shell("busybox rmmod nonesuch").returncode != 0


def test_writes_below_sys_land_in_the_phone(any_phone):
    name = sorted(path.name for path in INTERFACES.iterdir())[0]
    target = f"/sys/class/net/{name}/mtu"
    before = pathlib.Path(target).read_text()
    assert any_phone.shell(f"echo {before.strip()} > {target}").returncode != 0
    any_phone.output(f"mkdir -p /sys/class/net/{name}; echo 1 > {target}")
    assert (any_phone.root / target[1:]).read_text() == "1\n"
    assert pathlib.Path(target).read_text() == before


def test_privileged_and_outside_things_fail(any_new_phone):
    name = platform.node()
    lines = [
        "mount -t tmpfs none /tmp", "mount -t sysfs none /sys", "mount -t proc none /tmp",
        "mount -o bind /data /tmp", "busybox chroot / true", "busybox mknod /tmp/disk b 254 0",
        f"busybox hostname {name}", f"echo {name} > /proc/sys/kernel/hostname",
        "busybox unshare -n true", "busybox nsenter -t 1 -n true", "cat /etc/passwd",
        "cat ../../../../../../etc/passwd"]
    result = any_new_phone.shell("".join(f"{line}; echo $?; " for line in lines))
    for line, code in zip(lines, result.stdout.split(), strict=True):
        assert code != "0", line


def test_no_file_of_the_machine_is_there(any_phone, place):
    secret = place / "secret"
    secret.write_text("outside")
    ups = "/.." * 40
    result = any_phone.shell(f"cat {secret}; cat {ups}{secret}; ln -s {secret} /tmp/link; "
                             f"cat /tmp/link; cat /proc/1/root{secret}; cd {ups}; cat .{secret}")
    assert result.stdout == ""
    assert any_phone.output("ls /").split() == [
        "bin", "data", "dev", "etc", *[name for name in ("lib", "lib32", "lib64", "usr")
                                       if (any_phone.root / name).exists()],
        "phone", "proc", "sys", "system", "tmp", "vendor"]


def test_the_machine_s_devices_stay(any_phone):
    mode = stat.S_IMODE(os.stat("/dev/null").st_mode)
    if any_phone.launcher.user == "root" and not (any_phone.root / "dev/null").is_char_device():
        return  # root may not make devices here; README.md tells what follows
    any_phone.shell(f"chmod {mode:o} /dev/null")


def test_nothing_inside_holds_a_capability(any_new_phone):
    any_new_phone.start(f"exec sleep {ENDLESS}")
    wait_for(any_new_phone.sleepers)
    for number in any_new_phone.sleepers():
        lines = pathlib.Path(f"/proc/{number}/status").read_text().splitlines()
        status = dict(line.split(":\t", 1) for line in lines if ":\t" in line)
        assert {name: int(status[name], 16) for name in ("CapInh", "CapPrm", "CapEff", "CapAmb")} \
            == {"CapInh": 0, "CapPrm": 0, "CapEff": 0, "CapAmb": 0}
        assert status["NoNewPrivs"] == "1"
        if os.geteuid() == 0 and any_new_phone.launcher.user == "root":
            assert int(status["CapBnd"], 16) == 0


def test_no_process_of_the_machine_can_be_seen(any_new_phone):
    if any_new_phone.launcher.kind == "proot":
        assert any_new_phone.output("ls /proc") == ""
        return
    assert any_new_phone.output("echo /proc/[0-9]*").split() in (["/proc/1", "/proc/2"],
                                                             ["/proc/1", "/proc/2", "/proc/3"])
    assert any_new_phone.shell(f"kill -0 {os.getpid()}").returncode != 0


def test_no_process_of_the_machine_can_be_signalled(any_new_phone):
    user = any_new_phone.root.stat().st_uid
    with subprocess.Popen(["sleep", "1000"], user=user if os.geteuid() == 0 else None) as stranger:
        try:
            result = any_new_phone.shell(f"kill -0 {stranger.pid}; echo $?; kill -0 $$; echo $?")
            inside = any_new_phone.launcher.kind == "bwrap" or LANDLOCK >= 6
            assert result.stdout == ("1\n0\n" if inside else "0\n0\n")
        finally:
            stranger.kill()


@pytest.mark.skipif(LANDLOCK < 3, reason="this kernel does not limit files")
def test_what_gets_past_proot_changes_no_file_outside(place):
    """What proot is given up to by the launcher, before it starts."""
    (place / "inside").mkdir()
    (place / "outside").mkdir()
    (place / "outside/file").write_text("as it was")
    attempts = ["open('{}/new', 'w')", "open('{}/file', 'a')", "os.truncate('{}/file', 0)",
                "os.remove('{}/file')", "os.mkdir('{}/folder')", "os.symlink('x', '{}/link')",
                "os.rename('{}/file', 'inside/moved')"]
    script = "import os, sys; sys.path.insert(0, sys.argv[1]); from launcher import landlock\n" \
             "landlock.confine(['inside'])\n" \
             "def attempt(line):\n try: eval(line)\n except PermissionError: print(line)\n"
    script += "".join(f'attempt("{line.format("outside")}")\n' for line in attempts)
    script += "open('inside/file', 'w').close(); os.mkdir('inside/folder'); " \
              "os.rename('inside/file', 'inside/folder/file')"
    result = subprocess.run(["/usr/bin/python3", "-B", "-c", script, SOURCE / "simulator"], cwd=place,
                            capture_output=True, text=True, check=True)
    assert result.stdout.splitlines() == [line.format("outside") for line in attempts]
    assert (place / "outside/file").read_text() == "as it was"


@pytest.mark.skipif(os.geteuid() != 0, reason="root's capabilities")
def test_proot_is_refused_when_root_cannot_drop_its_capabilities(program, phone):
    launcher = Launcher(program, "proot", "root")
    launcher.line = ["setpriv", "--bounding-set", "-setpcap", *launcher.line]
    result = launcher("run", phone.folder, "true")
    assert result.returncode == 125
    assert result.stderr == ("phone: proot would not protect this machine: root's capabilities "
                             "cannot be dropped here (CAP_SETPCAP is missing)\n")


def test_without_namespaces_proot_is_chosen(program, place):
    """A bwrap that fails as it does on a machine that refuses them hides the real one."""
    folder = place / "programs"
    folder.mkdir()
    (folder / "bwrap").write_text("#!/bin/sh\necho bwrap: No permissions >&2\nexit 1\n")
    (folder / "bwrap").chmod(0o755)
    launcher = Launcher(program, "", "root" if os.geteuid() == 0 else "self")
    launcher.environment["PATH"] = f"{folder}:{os.environ['PATH']}"
    phone = Phone.create(launcher, place / "phone")
    assert (phone.folder / "sandbox").read_text() == "proot\n"
    assert phone.output("getprop ro.hardware.wlan.vendor") == "broadcom"
    (folder / "proot").write_text("#!/bin/sh\nexit 1\n")
    (folder / "proot").chmod(0o755)
    result = launcher("create", "broadcom", place / "other")
    assert (result.returncode, result.stderr) \
        == (1, "phone: no sandbox: bwrap is refused here; proot is refused here\n")
    assert sorted(path.name for path in place.iterdir()) == ["phone", "programs"]


def test_an_interrupted_create_chooses_nothing(program, place):
    """A bwrap that interrupts the launcher, as Ctrl-C would while it is starting."""
    folder = place / "programs"
    folder.mkdir()
    (folder / "bwrap").write_text("#!/bin/sh\nread -r _ _ _ launcher _ </proc/$PPID/stat\n"
                                  "kill -INT $launcher\nexec /bin/sleep 1000\n")
    (folder / "bwrap").chmod(0o755)
    launcher = Launcher(program, "", "root" if os.geteuid() == 0 else "self")
    launcher.environment["PATH"] = f"{folder}:{os.environ['PATH']}"
    result = launcher("create", "broadcom", place / "phone")
    assert (result.returncode, result.stderr) == (130, "")
    assert [path.name for path in place.iterdir()] == ["programs"]
