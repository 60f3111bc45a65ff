# Copyright 2026 The BEX Wi-Fi Authors
# SPDX-License-Identifier: Apache-2.0
"""Builds a phone's root file system: complete, or not at all.

Links inside the root are relative, so that following one from outside stays inside. The simulation's
own files are below /phone, a folder that no real phone has.
"""

import errno
import os
import shutil
import stat
import subprocess
import tempfile

from launcher import process, sandbox
from launcher.description import SIMULATOR, Description, checked_path
from launcher.errors import PhoneError

FOLDERS = [
    "data/local/tmp", "dev/socket/hidl", "phone/bin", "phone/boot", "phone/faults", "phone/lib",
    "phone/missing", "phone/state/properties", "proc", "sys", "system/bin", "system/etc", "tmp",
    "vendor/bin/hw", "vendor/etc/vintf/manifest", "vendor/lib"]
LINKS = {"bin": "system/bin", "etc": "system/etc"}

# name: its package. mksh is Android's shell; the tools are scripts for the one without shared libraries,
# which starts in a fourth of the time. Android has no flock, the tools' state needs one.
PROGRAMS = {"mksh": "mksh", "mksh-static": "mksh", "busybox": "busybox", "flock": "util-linux"}
BUSYBOX_WRAPPED = ["busybox", "cat", "sleep"]
BUSYBOX_PLAIN = [
    "chmod", "cp", "date", "dd", "env", "false", "find", "grep", "head", "id", "kill", "ln", "ls",
    "mkdir", "mkfifo", "mount", "mv", "printf", "ps", "readlink", "rm", "sed", "sort", "stat",
    "tail", "tee", "touch", "tr", "true", "uname", "wc"]


def create(chip, folder, installs):
    """Builds the phone described by `chip` in the new folder `folder`; `installs` holds SRC=DEST
    texts."""
    folder = os.path.abspath(folder)
    if os.path.isdir(os.path.join(folder, "root", "phone")):
        raise PhoneError(f"{folder} is a phone already")
    taken = PhoneError(f"{folder} exists and is not an empty folder")
    if os.path.lexists(folder) and not (os.path.isdir(folder) and not os.listdir(folder)):
        raise taken
    description = Description(chip)
    pairs = [_source_and_destination(text) for text in installs]
    outer, name = os.path.split(folder)
    os.makedirs(outer, exist_ok=True)
    unfinished = tempfile.mkdtemp(prefix=f".{name}.", dir=outer)
    try:
        os.chmod(unfinished, 0o755)
        os.mkdir(f"{unfinished}/root")
        Builder(f"{unfinished}/root").build(description, pairs)
        kind = process.choose(unfinished)
        with open(f"{unfinished}/sandbox", "w", encoding="ascii") as record:
            record.write(kind + "\n")
        with open(f"{unfinished}/chip", "w", encoding="utf-8") as record:
            record.write(os.path.basename(chip) + "\n")
        try:
            os.rename(unfinished, folder)
        except OSError:  # another create was faster
            raise taken from None
    except BaseException:
        shutil.rmtree(unfinished, ignore_errors=True)
        raise


def _source_and_destination(text):
    source, equals, destination = text.rpartition("=")
    if not equals or not source:
        raise PhoneError(f"--install {text}: not SRC=DEST")
    if not os.path.isfile(source):
        raise PhoneError(f"--install {text}: no file {source}")
    try:
        return source, checked_path(destination)
    except ValueError as error:
        raise PhoneError(f"--install {text}: {error}") from None


class Builder:
    """Fills one root."""

    def __init__(self, root):
        self.root = root

    def build(self, description, installs):
        for path in FOLDERS:
            os.makedirs(f"{self.root}/{path}")
        for path, target in LINKS.items():
            os.symlink(target, f"{self.root}/{path}")
        self._devices()
        self._programs()
        for name in description.tools:
            self._tool(name, name)
        for name in BUSYBOX_WRAPPED + description.applets:
            self._tool(name, "applet")
        for name in sorted(os.listdir(f"{SIMULATOR}/inside")):
            self._copy(f"{SIMULATOR}/inside/{name}", f"/phone/lib/{name}")
        self._copy(f"{SIMULATOR}/drivers/{description.driver}", "/phone/lib/driver")
        self._write("/vendor/build.prop", description.properties, "{}={}\n")
        self._write("/phone/captures", description.captures, "{} {}\n")
        for path, value in description.parameters.items():
            self._text(path, value)
        shutil.copytree(f"{self.root}/sys", f"{self.root}/phone/boot/sys")
        for path, text in description.files.items():
            self._text(path, text)
        for source, destination in installs:
            self._install(source, destination)

    def _devices(self):
        """Nodes of the phone's own where this user and file system allow them."""
        for name, (major, minor) in sandbox.DEVICES.items():
            path = f"{self.root}/dev/{name}"
            try:
                os.mknod(path, stat.S_IFCHR | 0o666, os.makedev(major, minor))
                os.chmod(path, 0o666)
                os.close(os.open(path, os.O_RDWR | os.O_NOCTTY))
            except OSError as error:
                if error.errno == errno.ENXIO:  # /dev/tty, when this process has no terminal
                    continue
                if os.path.lexists(path):
                    os.remove(path)
                self._text(f"/dev/{name}", "")

    def _programs(self):
        found = {}
        for name, package in PROGRAMS.items():
            found[name] = sandbox.find_program(name)
            if found[name] is None:
                raise PhoneError(f"{name} is not installed (package {package})")
        self._install(found["mksh"], "/system/bin/sh")
        self._copy(found["mksh"], "/vendor/bin/sh")
        self._install(found["mksh-static"], "/phone/bin/mksh")
        self._install(found["busybox"], "/phone/bin/busybox")
        self._install(found["flock"], "/phone/bin/flock")
        for name in BUSYBOX_PLAIN:
            os.symlink("../../phone/bin/busybox", f"{self.root}/system/bin/{name}")

    def _tool(self, name, script):
        self._copy(f"{SIMULATOR}/tools/{script}", f"/vendor/bin/{name}")
        os.chmod(f"{self.root}/vendor/bin/{name}", 0o755)

    def _install(self, source, destination):
        self._copy(source, destination)
        for library in _libraries(source):
            if not os.path.lexists(self.root + library):
                self._copy(library, library)

    def _copy(self, source, destination):
        if os.path.isdir(self.root + destination):
            raise PhoneError(f"{destination} is a folder in the phone")
        try:
            self._parent(destination)
            shutil.copy(source, self.root + destination)
        except OSError as error:
            raise PhoneError(f"cannot copy {source} to {destination}: {error.strerror}") from None

    def _text(self, path, text):
        self._parent(path)
        with open(self.root + path, "w", encoding="utf-8") as file:
            file.write(text)

    def _write(self, path, table, form):
        self._text(path, "".join(form.format(*row) for row in table.items()))

    def _parent(self, path):
        os.makedirs(os.path.dirname(self.root + path), exist_ok=True)


def _libraries(binary):
    """The shared libraries of an ELF file and its loader, by the paths at which it finds them."""
    with open(binary, "rb") as file:
        if file.read(4) != b"\x7fELF":
            return []
    listing = subprocess.run(["ldd", binary], capture_output=True, text=True, check=False)
    paths = []
    for line in listing.stdout.splitlines():
        words = line.split()
        if "not found" in line:
            raise PhoneError(f"{binary} needs {words[0]}, which is not found")
        paths += [word for word in words[:3:2] if word.startswith("/")]
    return paths
