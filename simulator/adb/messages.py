# Copyright 2026 The BEX Wi-Fi Authors
# SPDX-License-Identifier: Apache-2.0
"""adb's messages: 24 bytes of six little-endian words, then the data.

    command, two arguments, length of the data, sum of its bytes, command with all bits inverted
"""

import collections
import struct

VERSION = 0x01000001  # from this version on nobody checks the sum
LONGEST_DATA = 1 << 18
SHORTEST_LIMIT = 4096  # every peer accepts this many

CNXN, OPEN, OKAY, WRTE, CLSE = (int.from_bytes(name, "little")
                                for name in (b"CNXN", b"OPEN", b"OKAY", b"WRTE", b"CLSE"))
_HEAD = struct.Struct("<6I")

Message = collections.namedtuple("Message", "command first second data")


class ProtocolError(Exception):
    """The peer does not speak adb: its connection ends."""


def pack(command, first, second, data=b""):
    return _HEAD.pack(command, first, second, len(data), sum(data) if command == CNXN else 0,
                      command ^ 0xffffffff) + data


async def read(reader):
    """The next message. Raises ProtocolError or, at the end of the connection, EOFError."""
    command, first, second, length, _sum, magic = _HEAD.unpack(await reader.readexactly(_HEAD.size))
    if magic != command ^ 0xffffffff:
        raise ProtocolError("a message without its magic")
    if length > LONGEST_DATA:
        raise ProtocolError(f"a message of {length} bytes")
    return Message(command, first, second, await reader.readexactly(length))
