# Copyright 2026 The BEX Wi-Fi Authors
# SPDX-License-Identifier: Apache-2.0
"""The process that answers adb for one phone, from `phone up --adb` to `phone down`.

Like a phone's adbd it does not depend on the service: it goes on when the service ends or is started
again. It holds a lock on the file DIR/adb, which has the serial number.
"""

import fcntl
import os
import select
import signal
import socket
import struct
import sys

from launcher.errors import PhoneError

HOST = "127.0.0.1"
DOWN_SECONDS = 60
_FLOCK = struct.Struct("hhqqi4x")  # struct flock of fcntl(2)


def listen(port):
    """The socket that adb connects to; 0 asks for any free port."""
    listener = socket.socket(socket.AF_INET, socket.SOCK_STREAM | socket.SOCK_NONBLOCK)
    listener.setsockopt(socket.SOL_SOCKET, socket.SO_REUSEADDR, 1)
    try:
        listener.bind((HOST, port))
        listener.listen()
    except OSError as error:
        listener.close()
        raise PhoneError(f"adb cannot have port {port}: {error.strerror}") from None
    return listener


def start(folder, listener):
    """Starts the process and returns when it has the phone."""
    read_end, write_end = os.pipe()
    pid = os.fork()
    if pid == 0:
        _become(folder, listener, write_end)
    os.close(write_end)
    listener.close()
    with open(read_end, "rb") as ready:
        if not ready.read():
            os.waitpid(pid, 0)
            raise PhoneError(f"adb was not started; see {folder}/adb.log")


def serial(folder):
    """The serial number of the phone, or None when it is not on adb."""
    if not _holder(folder):
        return None
    with open(f"{folder}/adb", encoding="ascii") as record:
        return record.read().strip()


def end(folder):
    """Ends the process, and with it what adb's clients run; False when there is none."""
    pid = _holder(folder)
    if not pid:
        return False
    process = os.pidfd_open(pid)
    try:
        if _holder(folder) != pid:
            return False  # it has ended by itself, and another process may have its number
        signal.pidfd_send_signal(process, signal.SIGTERM)
        if not select.select([process], [], [], DOWN_SECONDS)[0]:
            signal.pidfd_send_signal(process, signal.SIGKILL)
            select.select([process], [], [])
    except ProcessLookupError:
        pass
    finally:
        os.close(process)
    return True


def _holder(folder):
    """The process that has DIR/adb locked, or 0."""
    try:
        with open(f"{folder}/adb", "rb") as record:
            lock = fcntl.fcntl(record, fcntl.F_GETLK, _FLOCK.pack(fcntl.F_WRLCK, 0, 0, 0, 0))
    except FileNotFoundError:
        return 0
    kind, *_, pid = _FLOCK.unpack(lock)
    return 0 if kind == fcntl.F_UNLCK else pid


def _become(folder, listener, ready):
    """In the forked child: never returns."""
    status = 1
    try:
        from adb.device import Device  # slow to load, and only this process needs it

        os.setsid()
        os.chdir("/")
        log = os.open(f"{folder}/adb.log", os.O_WRONLY | os.O_CREAT | os.O_TRUNC, 0o644)
        nothing = os.open(os.devnull, os.O_RDWR)
        for number, descriptor in enumerate((nothing, nothing, log)):
            os.dup2(descriptor, number)
        with open(f"{folder}/adb", "a+b", buffering=0) as record:
            fcntl.lockf(record, fcntl.LOCK_EX | fcntl.LOCK_NB)
            record.truncate(0)
            record.write(b"%s:%d\n" % (HOST.encode(), listener.getsockname()[1]))
            device = Device(folder, listener)
            os.write(ready, b"!")
            os.close(ready)
            device.run()
        status = 0
    except BaseException as error:  # pylint: disable=broad-except
        sys.excepthook(type(error), error, error.__traceback__)
    finally:
        os._exit(status)
