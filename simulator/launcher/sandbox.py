# Copyright 2026 The BEX Wi-Fi Authors
# SPDX-License-Identifier: Apache-2.0
"""Enters a phone: its root becomes /, and nothing inside can reach the machine around it.

Two ways in, tried in this order when the phone is created and remembered in its folder:

bwrap  Namespaces of its own for users, processes, network, IPC, host name and cgroup; no capability
       left; /proc mounted afresh and read-only. Inside, the phone's owner is user 0.
proot  Paths are translated with ptrace. Shares the machine's network and process numbers, so every
       capability is dropped, for good, before anything runs; root cannot use proot otherwise.

Both die with the process that started them; process.py does the rest.
"""

import os
import stat

from launcher.errors import PhoneError
from launcher.inside import Folder

ENVIRONMENT = {
    # As the service's init script sets it.
    "PATH": "/vendor/bin:/vendor/xbin:/odm/bin:/system/bin:/system/xbin",
    "HOME": "/",
    "TMPDIR": "/data/local/tmp",
    "ANDROID_ROOT": "/system",
    "ANDROID_DATA": "/data",
}

KINDS = ("bwrap", "proot")
CAP_SETPCAP = 8  # from <linux/capability.h>
LONGEST_SOCKET_FOLDER = 36  # leaves 71 bytes for /hidl/ and the name of a socket
DEVICES = {"null": (1, 3), "zero": (1, 5), "full": (1, 7), "random": (1, 8), "urandom": (1, 9),
           "tty": (5, 0)}


def find_program(name):
    """The path of a program of this machine, or None."""
    for folder in os.environ.get("PATH", os.defpath).split(":") + ["/usr/bin", "/usr/sbin"]:
        path = os.path.join(folder, name)
        if os.access(path, os.X_OK) and os.path.isfile(path):
            return path
    return None


def chosen_kind(folder):
    """The sandbox of this phone: BEX_PHONE_SANDBOX, else what was found when it was created."""
    asked = os.environ.get("BEX_PHONE_SANDBOX", "")
    if asked:
        if asked not in KINDS:
            raise PhoneError(f"BEX_PHONE_SANDBOX is '{asked}', not bwrap or proot")
        return asked
    with open(os.path.join(folder, "sandbox"), encoding="ascii", errors="replace") as record:
        kind = record.read().strip()
    if kind not in KINDS:
        raise PhoneError(f"{folder}/sandbox names '{kind}', not bwrap or proot")
    return kind


def command_line(kind, folder):
    """The host command that enters the phone; the command to run there is appended."""
    return (_bwrap if kind == "bwrap" else _proot)(folder, os.path.join(folder, "root"))


def writable(folder):
    """The files of this machine that proot and what runs in it may change: proot keeps files of its
    own in /tmp, and the sockets may be there."""
    root = os.path.join(folder, "root")
    return [root, "/tmp", *_borrowed_devices(root)]


def socket_folder(kind, folder):
    """Where the phone's /dev/socket lies on this machine: a folder, and the path below it, on which
    no link is to be followed.

    proot hands the machine's path of a socket to the kernel, which takes 107 bytes of it. Where the
    phone's folder is too deep for that, the sockets lie in a folder in /tmp while the phone is up.
    """
    root = os.path.join(folder, "root")
    if kind == "bwrap" or len(root) + len("/dev/socket") <= LONGEST_SOCKET_FOLDER:
        return root, "dev/socket"
    identity = os.stat(folder)
    return "/tmp", f"bex-phone-{identity.st_dev:x}-{identity.st_ino:x}"


def _program(name):
    path = find_program(name)
    if path is None:
        package = {"bwrap": "bubblewrap", "setpriv": "util-linux"}.get(name, name)
        raise PhoneError(f"{name} is not installed (package {package})")
    return path


def _borrowed_devices(root):
    """The devices for which the phone has no node of its own: it gets the machine's."""
    folder = Folder(root, "dev")
    return [f"/dev/{name}" for name in DEVICES if folder.kind(name) == stat.S_IFREG]


def _bwrap(_folder, root):
    line = [_program("bwrap"), "--unshare-all", "--unshare-user", "--uid", "0", "--gid", "0",
            "--cap-drop", "ALL", "--hostname", "localhost", "--die-with-parent",
            "--new-session", "--dev-bind", root, "/"]
    # bwrap follows links to where it mounts. What is mounted on cannot be replaced inside.
    Folder(root, "proc")
    line += ["--dev-bind", f"{root}/dev", "/dev"]
    for device in _borrowed_devices(root):
        line += ["--dev-bind", device, device]
    return line + ["--proc", "/proc", "--remount-ro", "/proc", "--chdir", "/"]


def _proot(folder, root):
    # SIGQUIT is what makes proot end the processes that it traces.
    line = [_program("setpriv"), "--pdeathsig", "QUIT", "--inh-caps", "-all",
            "--ambient-caps", "-all", "--no-new-privs"]
    bounding, effective = _capabilities()
    if bounding and os.geteuid() == 0:
        if not effective >> CAP_SETPCAP & 1:
            raise PhoneError("proot would not protect this machine: root's capabilities "
                             "cannot be dropped here (CAP_SETPCAP is missing)")
        line += ["--bounding-set", "-all"]
    line += [_program("proot"), "-v", "-1", "-r", root, "-w", "/"]
    place, sockets = socket_folder("proot", folder)
    if place != root and os.path.isdir(f"{place}/{sockets}"):
        borrowed = Folder(place, sockets)
        if os.fstat(borrowed.fd).st_uid != os.geteuid():
            raise PhoneError(f"{place}/{sockets} belongs to another user")
        line += ["-b", f"{place}/{sockets}:/dev/socket"]
    for device in _borrowed_devices(root):
        line += ["-b", device]
    return line


def _capabilities():
    """This process's bounding and effective capabilities, as bit masks."""
    with open("/proc/self/status", encoding="ascii") as status:
        fields = dict(row.split(":", 1) for row in status)
    return int(fields["CapBnd"], 16), int(fields["CapEff"], 16)
