# Copyright 2026 The BEX Wi-Fi Authors
# SPDX-License-Identifier: Apache-2.0
"""One lock per phone, which all programs of this machine share."""

import contextlib
import fcntl
import logging
import os
import sys
import threading
import time

from bexwifi import signals
from bexwifi.errors import NoLock

LOG = logging.getLogger("bexwifi")
# The same file as in the README of bex-wifi-client, so that shell scripts with `flock` take turns too.
PATH = "/tmp/bex-{}.lock"
# The seconds between two looks at a lock that another program has.
PAUSE = 0.1


@signals.interruptible
def _wait_for(descriptor):
    """Looks again and again: a signal that comes just before a wait in the kernel would not end it."""
    while True:
        signals.checkpoint()
        with contextlib.suppress(BlockingIOError):
            return fcntl.flock(descriptor, fcntl.LOCK_EX | fcntl.LOCK_NB)
        time.sleep(PAUSE)


class PhoneLock:
    """Held in a `with` statement; who holds it may take it again. There is no deadline for the wait.

    The kernel releases it however a process ends. The file also keeps the name of the method that may
    have switched the radio on, for the next program, should this one be killed.

    user: what uses the radio at the moment in this process, or None
    """

    _of_serial = {}
    _registry = threading.Lock()

    def __init__(self, serial):
        self.user = None
        self._serial = serial
        self._path = PATH.format(serial.replace("/", "_"))
        self._thread = threading.RLock()
        self._depth = 0
        self._descriptor = None
        self._started = ""

    @classmethod
    def of(cls, serial):
        """The process's one lock of a phone."""
        with cls._registry:
            return cls._of_serial.setdefault(serial, cls(serial))

    @signals.holds
    def __enter__(self):
        signals.watch()
        try:
            while not self._thread.acquire(timeout=0.2):
                signals.checkpoint()
            try:
                if self._depth == 0:
                    self._take()
                self._depth += 1
            except BaseException:
                self._thread.release()
                raise
        except BaseException:
            signals.unwatch()
            raise
        return self

    @signals.undisturbed
    def __exit__(self, *_):
        self._depth -= 1
        if self._depth == 0:
            os.close(self._descriptor)
        self._thread.release()
        signals.unwatch()
        signals.leave(sys._getframe(1))  # pylint: disable=protected-access

    def _take(self):
        descriptor = self._open()
        try:
            try:
                fcntl.flock(descriptor, fcntl.LOCK_EX | fcntl.LOCK_NB)
            except BlockingIOError:
                LOG.warning("phone %s: another program uses it; waiting", self._serial)
                _wait_for(descriptor)
            self._descriptor = descriptor
        except BaseException:
            os.close(descriptor)
            raise

    def _open(self):
        """The file's descriptor. Another user's file can be locked, but perhaps not written."""
        try:
            for flags in (os.O_RDWR, os.O_RDONLY):
                with contextlib.suppress(FileNotFoundError, PermissionError):
                    return os.open(self._path, flags | os.O_NOFOLLOW)
            return os.open(self._path, os.O_RDWR | os.O_CREAT | os.O_NOFOLLOW, 0o666)
        except OSError as error:
            raise NoLock(self._serial, f"no lock: {self._path}: {error.strerror}") from error

    @property
    def started(self):
        """The method that may have switched the radio on, or may still run; empty when there is none, as
        far as anybody here knows. Only for who holds the lock."""
        return self._started or os.pread(self._descriptor, 100, 0).decode(errors="replace")

    @started.setter
    def started(self, method):
        self._started = method
        with contextlib.suppress(OSError):
            os.ftruncate(self._descriptor, 0)
            os.pwrite(self._descriptor, method.encode(), 0)
