# Copyright 2026 The BEX Wi-Fi Authors
# SPDX-License-Identifier: Apache-2.0
"""Speaks adb's protocol to a phone without adb, to send messages that adb never would."""

import contextlib
import socket
import struct

from support.adb import TIMEOUT

GREETING = (b"CNXN", 0x01000001, 1 << 20, b"host::\0")


def message(name, first, second, data=b"", length=None, magic=None):
    command = int.from_bytes(name, "little")
    return struct.pack("<6I", command, first, second, len(data) if length is None else length,
                       0, command ^ 0xffffffff if magic is None else magic) + data


class Peer(socket.socket):
    """A connection to the phone."""

    def __init__(self, phone):
        super().__init__()
        self.settimeout(TIMEOUT)
        host, port = phone.serial.split(":")
        self.connect((host, int(port)))

    def greet(self):
        self.sendall(message(*GREETING))
        assert self.answer()[:2] == (b"CNXN", 0x01000001)
        return self

    def exactly(self, count):
        data = b""
        while len(data) < count:
            piece = self.recv(count - len(data))
            if not piece:
                raise EOFError
            data += piece
        return data

    def answer(self):
        """(command, first argument, second argument, data). Raises EOFError at the end."""
        name, first, second, length = struct.unpack("<4s3I8x", self.exactly(24))
        return name, first, second, self.exactly(length)

    def open(self, service, number=1):
        """The phone's number for the new stream."""
        self.sendall(message(b"OPEN", number, 0, service))
        name, local, remote, _ = self.answer()
        assert (name, remote) == (b"OKAY", number)
        return local

    def is_cut(self):
        with contextlib.suppress(EOFError, ConnectionResetError):
            while True:
                self.answer()
        return True
