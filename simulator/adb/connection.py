# Copyright 2026 The BEX Wi-Fi Authors
# SPDX-License-Identifier: Apache-2.0
"""One peer, which is an adb server as a rule, and the streams that it opens.

What the peer sends or leaves out affects only its own connection. On every stream there is one
message on its way in each direction, until its OKAY; so the peer decides how fast it is served, and
what the phone keeps for it is limited.
"""

import asyncio
import contextlib

from adb import messages
from adb.messages import CLSE, CNXN, OKAY, OPEN, WRTE, ProtocolError

GREETING_SECONDS = 30
MOST_STREAMS = 32


class HungUp(Exception):
    """The peer has closed the stream or its connection."""


class Connection:
    """`banner` describes the phone; `find_service` has the coroutine function for a service's name,
    which is given the stream, or None."""

    def __init__(self, reader, writer, banner, find_service):
        self._reader = reader
        self._writer = writer
        self._banner = banner
        self._find_service = find_service
        self._drain = asyncio.Lock()
        self._streams = {}
        self._tasks = set()
        self._last = 0
        self.longest_data = messages.SHORTEST_LIMIT

    async def serve(self):
        """Returns when the connection has ended, and with it all that ran in its streams."""
        try:
            await asyncio.wait_for(self._greet(), GREETING_SECONDS)
            while True:
                await self._handle(await messages.read(self._reader))
        except (ProtocolError, EOFError, OSError, asyncio.TimeoutError):
            pass  # nobody is left to notify
        finally:
            self._writer.transport.abort()  # a peer that reads nothing could not be told goodbye
            for stream in list(self._streams.values()):
                stream.hang_up()
            if self._tasks:
                await asyncio.wait(self._tasks)

    async def _greet(self):
        greeting = await messages.read(self._reader)
        if greeting.command != CNXN or greeting.first < messages.VERSION:
            raise ProtocolError("no greeting, or a peer that wants sums")
        self.longest_data = max(messages.SHORTEST_LIMIT,
                                min(greeting.second, messages.LONGEST_DATA))
        await self.send(CNXN, messages.VERSION, messages.LONGEST_DATA, self._banner)

    async def _handle(self, message):
        if message.command == OPEN:
            await self._open(message)
            return
        stream = self._streams.get(message.second)
        if stream is None or stream.remote != message.first:
            return  # it has ended, and the peer did not know
        if message.command == WRTE:
            stream.receive(message.data)
        elif message.command == OKAY:
            stream.acknowledged.set()
        elif message.command == CLSE:
            stream.hang_up()

    async def _open(self, message):
        service = self._find_service(message.data.rstrip(b"\0"))
        if service is None or len(self._streams) == MOST_STREAMS or message.first == 0:
            await self.send(CLSE, 0, message.first)
            return
        self._last = self._last % 0xffffffff + 1
        stream = Stream(self, self._last, message.first)
        self._streams[stream.local] = stream
        await self.send(OKAY, stream.local, stream.remote)
        task = asyncio.create_task(self._run(service, stream))
        self._tasks.add(task)
        task.add_done_callback(self._tasks.discard)

    async def _run(self, service, stream):
        try:
            await service(stream)
        except (HungUp, OSError):
            pass
        except ProtocolError:
            self._writer.transport.abort()
        finally:
            del self._streams[stream.local]
            if stream.open:
                with contextlib.suppress(OSError):
                    await self.send(CLSE, stream.local, stream.remote)

    async def send(self, command, first, second, data=b""):
        self._writer.write(messages.pack(command, first, second, data))
        async with self._drain:
            await self._writer.drain()


class Stream:
    """The two directions of one service."""

    def __init__(self, connection, local, remote):
        self._connection = connection
        self._inbox = asyncio.Queue()
        self._received = b""
        self._writing = asyncio.Lock()
        self.open = True
        self.local = local
        self.remote = remote
        self.acknowledged = asyncio.Event()
        self.acknowledged.set()

    def receive(self, data):
        if not self._inbox.empty():
            raise ProtocolError("data before the OKAY for the last")
        self._inbox.put_nowait(data)

    def hang_up(self):
        self.open = False
        self._inbox.put_nowait(None)
        self.acknowledged.set()

    async def read(self, most):
        """Up to that many bytes, at least one. Raises HungUp."""
        while not self._received:
            data = await self._inbox.get()
            if data is None or not self.open:
                self._inbox.put_nowait(None)
                raise HungUp
            await self._connection.send(OKAY, self.local, self.remote)
            self._received = data
        data, self._received = self._received[:most], self._received[most:]
        return data

    async def read_exactly(self, count):
        data = b""
        while len(data) < count:
            data += await self.read(count - len(data))
        return data

    async def write(self, data):
        """Returns when the peer has taken it. Raises HungUp."""
        longest = self._connection.longest_data
        async with self._writing:
            for begin in range(0, len(data), longest):
                self.acknowledged.clear()
                if self.open:
                    await self._connection.send(
                        WRTE, self.local, self.remote, data[begin:begin + longest])
                    await self.acknowledged.wait()
                if not self.open:
                    raise HungUp
