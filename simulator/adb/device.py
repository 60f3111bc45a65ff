# Copyright 2026 The BEX Wi-Fi Authors
# SPDX-License-Identifier: Apache-2.0
"""One phone as adb's clients see it: accepts their connections and finds the services they ask for."""

import asyncio
import re
import signal
import socket

from adb import shell
from adb.connection import Connection

MOST_CONNECTIONS = 16


class Device:
    """Serves what connects to `listener`."""

    def __init__(self, folder, listener):
        self._folder = folder
        self._listener = listener
        self._connections = set()
        self._end = asyncio.Event()

    def run(self):
        """Returns on SIGTERM, once everything that was started has ended."""
        asyncio.run(self._serve())

    async def _serve(self):
        loop = asyncio.get_running_loop()
        for number in (signal.SIGINT, signal.SIGTERM):
            loop.add_signal_handler(number, self._end.set)
        accepting = asyncio.create_task(self._accept())
        await self._end.wait()
        accepting.cancel()
        for connection in self._connections:
            connection.cancel()
        await asyncio.gather(accepting, *self._connections, return_exceptions=True)

    async def _accept(self):
        loop = asyncio.get_running_loop()
        while True:
            peer, _ = await loop.sock_accept(self._listener)
            if len(self._connections) == MOST_CONNECTIONS:
                peer.close()
                continue
            connection = asyncio.create_task(self._connect(peer))
            self._connections.add(connection)
            connection.add_done_callback(self._connections.discard)

    async def _connect(self, peer):
        peer.setsockopt(socket.IPPROTO_TCP, socket.TCP_NODELAY, 1)
        reader, writer = await asyncio.open_connection(sock=peer)
        await Connection(reader, writer, self._banner(), self._service).serve()

    def _banner(self):
        with open(f"{self._folder}/chip", encoding="utf-8") as record:
            chip = re.sub(r"[^\w.-]", "_", record.read().strip(), flags=re.ASCII)
        return (f"device::ro.product.name=simulated;ro.product.model={chip};"
                f"ro.product.device={chip};features=shell_v2").encode()

    def _service(self, name):
        """The coroutine function that serves the service of this name, or None."""
        kind, _, argument = name.partition(b":")
        words = kind.split(b",")
        if words[0] in (b"shell", b"exec"):
            if words[0] == b"exec":
                words.append(b"raw")
            command = shell.Command(words[1:], argument)
            return lambda stream: shell.run(self._folder, command, stream)
        return None
