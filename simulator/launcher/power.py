# Copyright 2026 The BEX Wi-Fi Authors
# SPDX-License-Identifier: Apache-2.0
"""Switches a phone on and off.

A phone that is on is one process of this machine, the keeper: it holds the sandbox in which init
and the service run, and ends when they do. It keeps the file DIR/pid locked, so a phone is on
exactly as long as that lock is held, however the keeper ended.
"""

import fcntl
import os
import shutil
import signal
import stat
import sys
import time

from launcher.errors import PhoneError
from launcher.inside import Folder
from launcher.process import Sandbox
from launcher.sandbox import chosen_kind, socket_folder

SERVICE = "/vendor/bin/hw/vendor.korvan.bex.wifi@1.0-service"
UP_SECONDS = 30
DOWN_SECONDS = 10
POLL_SECONDS = 0.005


def up(folder, boot):
    """Starts the service and returns when it is registered. `boot` puts the driver, the properties
    and the log back to their state at power-on first."""
    if not os.access(f"{folder}/root{SERVICE}", os.X_OK):
        raise PhoneError(f"{folder} has no service: create it with --install SRC={SERVICE}")
    lock = _lock(folder)
    if lock is None:
        print(f"phone: {folder} is up already", file=sys.stderr)
        return
    kind = chosen_kind(folder)
    place, path = socket_folder(kind, folder)
    sockets = Folder(place, f"{path}/hidl", make=True)
    command = ["/system/bin/sh", "/phone/lib/init", "boot" if boot else "again", SERVICE]
    sandbox = Sandbox(kind, folder, command)  # a refusal shows here, not in the log
    for name in _registered(sockets):
        sockets.remove(name)
    keeper = os.fork()
    if keeper == 0:
        _keep(folder, boot, kind, sandbox)
    os.ftruncate(lock, 0)
    os.write(lock, f"{keeper}\n".encode())
    _await_service(folder, sockets, keeper)


def _keep(folder, boot, kind, sandbox):
    """The keeper: never returns."""
    status = 125
    try:
        log = os.open(f"{folder}/log",
                      os.O_WRONLY | os.O_CREAT | os.O_APPEND | (os.O_TRUNC if boot else 0), 0o644)
        nothing = os.open(os.devnull, os.O_RDWR)
        for number in range(3):
            os.dup2(nothing, number)
        sandbox.streams = [nothing, log, log]
        status = sandbox.hold()
    finally:
        _remove_borrowed(kind, folder)
        os._exit(status)


def _await_service(folder, sockets, keeper):
    deadline = time.monotonic() + UP_SECONDS
    ended = 0
    try:
        while not _registered(sockets):
            ended, status = os.waitpid(keeper, os.WNOHANG)
            if ended:
                raise PhoneError(f"the service ended with {os.waitstatus_to_exitcode(status)} "
                                 f"before it registered; see {folder}/log")
            if time.monotonic() > deadline:
                raise PhoneError(f"the service has not registered in {UP_SECONDS} s; "
                                 f"see {folder}/log")
            time.sleep(POLL_SECONDS)
    except BaseException:
        if not ended:
            _end(keeper)
            os.waitpid(keeper, 0)
        raise


def _registered(sockets):
    """The sockets of what is registered. A hidden one is not ready yet."""
    return [name for name in sockets.names()
            if not name.startswith(".") and sockets.kind(name) == stat.S_IFSOCK]


def _remove_borrowed(kind, folder):
    """Removes a folder for sockets that is not the phone's own."""
    place, path = socket_folder(kind, folder)
    if place == "/tmp":
        shutil.rmtree(f"{place}/{path}", ignore_errors=True)  # follows no link


def down(folder):
    """Ends every process of the phone and returns when they are gone."""
    if not _end_keeper(folder):
        print(f"phone: {folder} is not up", file=sys.stderr)
    # The keeper removes it, unless it was killed.
    _remove_borrowed(chosen_kind(folder), folder)


def restart_service(folder):
    """Kills the service and starts it again; the state of driver and properties stays."""
    if not _end_keeper(folder):
        raise PhoneError(f"{folder} is not up")
    up(folder, boot=False)


def _end_keeper(folder):
    """False when there is none."""
    deadline = time.monotonic() + DOWN_SECONDS
    lock = _lock(folder)
    if lock is not None:
        os.close(lock)
        return False
    with open(f"{folder}/pid", encoding="ascii") as record:
        keeper = int(record.read() or 0)
    if not keeper:
        raise PhoneError(f"{folder} is just being switched on")
    _end(keeper)
    while lock is None:
        if time.monotonic() > deadline:
            raise PhoneError(f"{folder}: process {keeper} has not ended in {DOWN_SECONDS} s")
        time.sleep(POLL_SECONDS)
        lock = _lock(folder)
    os.ftruncate(lock, 0)
    os.close(lock)
    return True


def _end(keeper):
    try:
        os.kill(keeper, signal.SIGTERM)
    except ProcessLookupError:
        pass


def _lock(folder):
    """Locks DIR/pid until the descriptor is closed in every process; None when another holds it."""
    lock = os.open(f"{folder}/pid", os.O_RDWR | os.O_CREAT, 0o644)
    try:
        fcntl.flock(lock, fcntl.LOCK_EX | fcntl.LOCK_NB)
        return lock
    except BlockingIOError:
        os.close(lock)
        return None
