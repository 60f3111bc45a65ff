# Copyright 2026 The BEX Wi-Fi Authors
# SPDX-License-Identifier: Apache-2.0
"""Files in and out of the phone, for `adb push` and `adb pull`.

A request is four letters and the length of the path, then the path. Files travel in pieces of up to
64 KiB, each with DATA and its length ahead, and DONE after the last.
"""

import contextlib
import itertools
import os
import stat
import struct

from adb.paths import Located

LONGEST_PATH = 1024
LONGEST_DATA = 1 << 16
_HEAD = struct.Struct("<4sI")
_STAT = struct.Struct("<4s3I")
_STAT2 = struct.Struct("<4sI2Q4IQ3q")
_ENTRY = struct.Struct("<4s4I")

_unfinished = itertools.count()


class SyncError(Exception):
    """A request after which the connection is useless."""


async def serve(root, stream):
    """Serves requests until QUIT. `root` is the phone's root on this machine."""
    requests = {b"STAT": _stat, b"STA2": _stat2, b"LST2": _stat2, b"LIST": _list, b"SEND": _send,
                b"RECV": _receive}
    try:
        while True:
            name, length = _HEAD.unpack(await stream.read_exactly(_HEAD.size))
            if name == b"QUIT":
                return
            if name not in requests or length > LONGEST_PATH:
                raise SyncError(f"'{name.decode(errors='replace')}' of {length} bytes is no request")
            path = await stream.read_exactly(length)
            await requests[name](root, path, stream, name)
    except SyncError as error:
        await _fail(stream, str(error))


async def _fail(stream, text):
    data = text.encode()
    await stream.write(_HEAD.pack(b"FAIL", len(data)) + data)


async def _stat(root, path, stream, name):
    """Of a link itself; zeros when there is no file."""
    try:
        with Located(root, path, follow=False) as located:
            found = located.stat()
        fields = (found.st_mode, found.st_size & 0xffffffff, int(found.st_mtime))
    except OSError:
        fields = (0, 0, 0)
    await stream.write(_STAT.pack(name, *fields))


async def _stat2(root, path, stream, name):
    """LST2 is of a link itself. The owner is the phone's root."""
    try:
        with Located(root, path, follow=name == b"STA2") as located:
            found = located.stat()
        fields = (0, found.st_dev, found.st_ino, found.st_mode, found.st_nlink, 0, 0, found.st_size,
                  int(found.st_atime), int(found.st_mtime), int(found.st_ctime))
    except OSError as error:
        fields = (error.errno, *[0] * 10)
    await stream.write(_STAT2.pack(name, *fields))


async def _list(root, path, stream, _name):
    """What lies in a folder; nothing when it is none."""
    answer = b""
    with contextlib.suppress(OSError), Located(root, path) as located:
        located.stat()  # raises when there is nothing
        folder = os.open(b".", os.O_RDONLY | os.O_DIRECTORY, dir_fd=located.file)
        try:
            for name in map(os.fsencode, os.listdir(folder)):
                with contextlib.suppress(FileNotFoundError):  # gone by now
                    found = os.stat(name, dir_fd=folder, follow_symlinks=False)
                    answer += _ENTRY.pack(b"DENT", found.st_mode, found.st_size & 0xffffffff,
                                          int(found.st_mtime), len(name)) + name
        finally:
            os.close(folder)
    await stream.write(answer + _ENTRY.pack(b"DONE", 0, 0, 0, 0))


async def _receive(root, path, stream, _name):
    """Sends a regular file: no device or pipe, which may never end."""
    try:
        file = _open_regular(root, path)
    except OSError as error:
        await _fail(stream, f"open failed: {error.strerror}")
        return
    try:
        while data := os.read(file, LONGEST_DATA):
            await stream.write(_HEAD.pack(b"DATA", len(data)) + data)
    finally:
        os.close(file)
    await stream.write(_HEAD.pack(b"DONE", 0))


def _open_regular(root, path):
    with Located(root, path) as located:
        if not stat.S_ISREG(located.stat().st_mode):
            raise OSError(0, "not a regular file")
        file = os.open(located.name, os.O_RDONLY | os.O_NOFOLLOW | os.O_NONBLOCK,
                       dir_fd=located.folder)
    if not stat.S_ISREG(os.fstat(file).st_mode):  # another one by now
        os.close(file)
        raise OSError(0, "not a regular file")
    return file


async def _send(root, request, stream, _name):
    """Takes a file, which appears whole or not at all, or a link."""
    path, _, mode = request.rpartition(b",")
    if not path or not mode.isdigit():
        raise SyncError("SEND without a mode")
    pieces = _Pieces(stream)
    try:
        with Located(root, path, follow=not stat.S_ISLNK(int(mode)), make=True) as located:
            await _take(located, int(mode), pieces)
    except OSError as error:
        await _fail(stream, f"couldn't create file: {error.strerror}")
        while await pieces.next():  # adb reads the answer only after its last piece
            pass
        return
    await stream.write(_HEAD.pack(b"OKAY", 0))


class _Pieces:
    """The pieces of one file, and the time of its last change once they have all come."""

    def __init__(self, stream):
        self._stream = stream
        self.time = None

    async def next(self):
        """Empty at the end."""
        data = b""
        while not data and self.time is None:
            name, number = _HEAD.unpack(await self._stream.read_exactly(_HEAD.size))
            if name == b"DONE":
                self.time = number
            elif name != b"DATA" or number > LONGEST_DATA:
                raise SyncError("what should be a piece of a file is none")
            else:
                data = await self._stream.read_exactly(number)
        return data


async def _take(located, mode, pieces):
    if located.file is not None and stat.S_IFMT(located.stat().st_mode) not in (
            stat.S_IFREG, stat.S_IFLNK):
        raise OSError(0, "not a regular file")
    unfinished = b".adb-push-%d-%d" % (os.getpid(), next(_unfinished))
    try:
        if stat.S_ISLNK(mode):
            target = await pieces.next()
            await pieces.next()
            os.symlink(target.rstrip(b"\0"), unfinished, dir_fd=located.folder)
        else:
            await _write(os.open(unfinished, os.O_WRONLY | os.O_CREAT | os.O_EXCL, 0o600,
                                 dir_fd=located.folder), mode, pieces)
        os.rename(unfinished, located.name, src_dir_fd=located.folder, dst_dir_fd=located.folder)
    except BaseException:
        with contextlib.suppress(OSError):
            os.unlink(unfinished, dir_fd=located.folder)
        raise


async def _write(file, mode, pieces):
    try:
        while data := await pieces.next():
            while data:
                data = data[os.write(file, data):]
        os.fchmod(file, mode & 0o777)
        os.utime(file, (pieces.time, pieces.time))
    finally:
        os.close(file)
