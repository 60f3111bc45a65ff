# Copyright 2026 The BEX Wi-Fi Authors
# SPDX-License-Identifier: Apache-2.0
"""Switches a phone on and off.

A phone that is on is one process of this machine, the keeper: it holds the sandbox in which init
and the service run, and ends when they do. It keeps the file DIR/pid locked, so a phone is on
exactly as long as that lock is held, however the keeper ended. A byte in the fifo DIR/stop ends it;
no process is killed by its number, which another process may have by now. Commands that switch a phone wait
for each other: they lock DIR itself.
"""

import errno
import fcntl
import os
import shutil
import stat
import sys
import time

from launcher.errors import PhoneError
from launcher.inside import Folder
from launcher.process import Sandbox, block_signals, unblock_signals
from launcher.sandbox import chosen_kind, socket_folder

SERVICE = "/vendor/bin/hw/vendor.korvan.bex.wifi@1.0-service"
UP_SECONDS = 30
DOWN_SECONDS = 30
QUEUE_SECONDS = 2 * (UP_SECONDS + DOWN_SECONDS)
POLL_SECONDS = 0.005


def up(folder):
    """Boots the phone: puts the driver, the properties and the log back to their state at power-on,
    starts the service and returns when it is registered."""
    if not os.access(f"{folder}/root{SERVICE}", os.X_OK):
        raise PhoneError(f"{folder} has no service: create it with --install SRC={SERVICE}")
    _queue(folder)
    lock = _open_pid(folder)
    if not _until(UP_SECONDS, lambda: _locks(lock) or _keeper_listens(folder)):
        raise PhoneError(f"{folder}/pid is locked by another program")
    if _locks(lock):
        _start(folder, lock, boot=True)
    else:
        print(f"phone: {folder} is up already", file=sys.stderr)


def down(folder):
    """Ends every process of the phone and returns when they are gone."""
    was_up = _ask_to_stop(folder)  # so that an `up` in progress gives up
    _queue(folder)
    if not _end_keeper(folder, _open_pid(folder)) and not was_up:
        print(f"phone: {folder} is not up", file=sys.stderr)
    # The keeper removes it, unless it was killed.
    _remove_borrowed(chosen_kind(folder), folder)


def restart_service(folder):
    """Kills the service and starts it again; the state of driver and properties stays."""
    _queue(folder)
    lock = _open_pid(folder)
    if not _end_keeper(folder, lock):
        raise PhoneError(f"{folder} is not up")
    _start(folder, lock, boot=False)


def _queue(folder):
    """Waits until no other command switches the phone. The next one waits for this one's end."""
    turn = os.open(folder, os.O_RDONLY)
    if not _until(QUEUE_SECONDS, lambda: _locks(turn)):
        raise PhoneError(f"{folder} has been locked for {QUEUE_SECONDS} s")


def _open_pid(folder):
    return os.open(f"{folder}/pid", os.O_RDWR | os.O_CREAT, 0o644)


def _locks(file):
    """Locks an open file, until it is closed in every process. False when another has locked it."""
    try:
        fcntl.flock(file, fcntl.LOCK_EX | fcntl.LOCK_NB)
        return True
    except BlockingIOError:
        return False


def _until(seconds, condition):
    """Waits for a condition; returns whether it became true in that time."""
    deadline = time.monotonic() + seconds
    while not condition():
        if time.monotonic() > deadline:
            return False
        time.sleep(POLL_SECONDS)
    return True


def _start(folder, lock, boot):
    """Starts the keeper, which inherits the lock. Without `boot` the state stays as it is."""
    kind = chosen_kind(folder)
    place, path = socket_folder(kind, folder)
    sockets = Folder(place, f"{path}/hidl", make=True)
    command = ["/system/bin/sh", "/phone/lib/init", "boot" if boot else "again", SERVICE]
    sandbox = Sandbox(kind, folder, command)  # a refusal shows here, not in the log
    for name in _registered(sockets):
        sockets.remove(name)
    log = os.open(f"{folder}/log",
                  os.O_WRONLY | os.O_CREAT | os.O_APPEND | (os.O_TRUNC if boot else 0), 0o644)
    stop = _make_stop(folder)
    os.ftruncate(lock, 0)
    block_signals()
    keeper = os.fork()
    if keeper == 0:
        _keep(folder, kind, sandbox, lock, stop, log)
    try:
        unblock_signals()
        os.close(stop)
        _write_pid(folder, lock, keeper)
        _await_service(folder, sockets, keeper)
    except BaseException:
        _ask_to_stop(folder)
        os.waitpid(keeper, 0)
        raise


def _keep(folder, kind, sandbox, lock, stop, log):
    """The keeper: never returns. Signals are blocked until it can act on them."""
    status = 125
    try:
        nothing = os.open(os.devnull, os.O_RDWR)
        for number in range(3):
            os.dup2(nothing, number)
        begin = 3
        for kept in (*sorted((lock, stop, log)), os.sysconf("SC_OPEN_MAX")):
            os.closerange(begin, kept)
            begin = kept + 1
        os.chdir("/")
        sandbox.streams = [0, log, log]
        status = sandbox.hold(stop)
    except OSError as error:
        os.write(log, f"phone: {error}\n".encode())
    finally:
        os.ftruncate(lock, 0)
        _remove_borrowed(kind, folder)
        os._exit(status)


def _write_pid(folder, lock, keeper):
    try:
        os.write(lock, f"{keeper}\n".encode())
    except OSError as error:
        error.filename = f"{folder}/pid"
        raise


def _await_service(folder, sockets, keeper):
    ended = None

    def decided():
        nonlocal ended
        ended = os.waitid(os.P_PID, keeper, os.WEXITED | os.WNOHANG | os.WNOWAIT)
        return ended or _registered(sockets)

    if not _until(UP_SECONDS, decided):
        raise PhoneError(f"the service has not registered in {UP_SECONDS} s; see {folder}/log")
    if ended:
        raise PhoneError(f"the service ended with {ended.si_status} before it registered; "
                         f"see {folder}/log")


def _registered(sockets):
    """The sockets of the registered services. A hidden one is not ready yet."""
    return [name for name in sockets.names()
            if not name.startswith(".") and sockets.kind(name) == stat.S_IFSOCK]


def _remove_borrowed(kind, folder):
    """Removes a folder for sockets that is not the phone's own."""
    place, path = socket_folder(kind, folder)
    if place == "/tmp":
        shutil.rmtree(f"{place}/{path}", ignore_errors=True)  # follows no link


def _end_keeper(folder, lock):
    """Locks DIR/pid once the keeper has ended; returns whether there was one."""
    asked = False

    def ended():
        nonlocal asked
        if _locks(lock):
            return True
        asked = asked or _ask_to_stop(folder)
        return False

    if not _until(DOWN_SECONDS, ended):
        raise PhoneError(f"{folder}/pid has been locked for {DOWN_SECONDS} s")
    return asked


def _make_stop(folder):
    """A new fifo, open for the keeper, so that nothing written from now on is lost."""
    path = f"{folder}/stop"
    if os.path.lexists(path):
        os.remove(path)
    os.mkfifo(path, 0o600)
    return os.open(path, os.O_RDWR | os.O_NONBLOCK)


def _open_stop(folder):
    """The fifo's end to write to, None when no keeper has the other end."""
    try:
        return os.open(f"{folder}/stop", os.O_WRONLY | os.O_NONBLOCK)
    except OSError as error:
        if error.errno in (errno.ENXIO, errno.ENOENT):
            return None
        raise


def _keeper_listens(folder):
    stop = _open_stop(folder)
    if stop is None:
        return False
    os.close(stop)
    return True


def _ask_to_stop(folder):
    """Ends the keeper, but does not wait for it; returns whether there is one."""
    stop = _open_stop(folder)
    if stop is None:
        return False
    try:
        os.write(stop, b"\n")
        return True
    except (BlockingIOError, BrokenPipeError):  # asked often enough; it has ended
        return False
    finally:
        os.close(stop)
