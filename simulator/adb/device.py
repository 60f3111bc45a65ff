# Copyright 2026 The BEX Wi-Fi Authors
# SPDX-License-Identifier: Apache-2.0
"""One phone as adb's clients see it: accepts their connections and finds the services they ask for."""

import asyncio
import os
import re
import signal
import socket
import sys

from adb import shell, sync
from adb.connection import Connection
from adb.descriptors import readable
from launcher import power
from launcher.errors import PhoneError
from launcher.inside import Folder

MOST_CONNECTIONS = 16


class Device:
    """Serves what connects to `listener`."""

    def __init__(self, folder, listener):
        self._folder = folder
        self._listener = listener
        self._connections = set()
        self._interrupted = asyncio.Event()
        self._ends = False
        self._banner = _banner(folder)

    def run(self):
        """Returns on SIGTERM, once everything that was started has ended."""
        _show_log(self._folder)
        asyncio.run(self._serve())

    async def _serve(self):
        loop = asyncio.get_running_loop()
        for number in (signal.SIGINT, signal.SIGTERM):
            loop.add_signal_handler(number, self._end)
        while True:
            await self._serve_while_on()
            if self._ends:
                return
            # A client that connects meanwhile waits in the listener's queue until the phone is on.
            for switch in (power.down, power.up):
                await _in_child(switch, self._folder)

    async def _serve_while_on(self):
        """Returns when the phone is to end or to reboot, and nobody is connected any more."""
        accepting = asyncio.create_task(self._accept())
        await self._interrupted.wait()
        accepting.cancel()
        for connection in self._connections:
            connection.cancel()
        await asyncio.gather(accepting, *self._connections, return_exceptions=True)
        if not self._ends:
            self._interrupted.clear()

    def _end(self):
        self._ends = True
        self._interrupted.set()

    async def _reboot(self, _stream):
        self._interrupted.set()

    async def _accept(self):
        loop = asyncio.get_running_loop()
        while True:
            try:
                peer, _ = await loop.sock_accept(self._listener)
            except OSError:  # no descriptor is free, or the peer has gone already
                await asyncio.sleep(0.1)
                continue
            if len(self._connections) == MOST_CONNECTIONS:
                peer.close()
                continue
            connection = asyncio.create_task(self._connect(peer))
            self._connections.add(connection)
            connection.add_done_callback(self._connections.discard)

    async def _connect(self, peer):
        peer.setsockopt(socket.IPPROTO_TCP, socket.TCP_NODELAY, 1)
        reader, writer = await asyncio.open_connection(sock=peer)
        await Connection(reader, writer, self._banner, self._service).serve()

    def _service(self, name):
        """The coroutine function that serves the service of this name, or None."""
        kind, _, argument = name.partition(b":")
        kind, *words = kind.split(b",")
        if kind in (b"shell", b"exec"):
            command = shell.Command(words if kind == b"shell" else [b"raw"], argument)
            return lambda stream: shell.run(self._folder, command, stream)
        return {b"root:": _root, b"reboot:": self._reboot, b"sync:": self._sync}.get(name)

    async def _sync(self, stream):
        await sync.serve(f"{self._folder}/root", stream)


def _banner(folder):
    with open(f"{folder}/chip", encoding="utf-8") as record:
        chip = re.sub(r"[^\w.-]", "_", record.read().strip(), flags=re.ASCII)
    return (f"device::ro.product.name=simulated;ro.product.model={chip};"
            f"ro.product.device={chip};features=shell_v2,stat_v2,fixed_push_mkdir").encode()


def _show_log(folder):
    """Gives the phone's log a name inside, for logcat. Every boot appends to the same file."""
    os.close(os.open(f"{folder}/log", os.O_WRONLY | os.O_CREAT | os.O_APPEND, 0o644))
    inside = Folder(folder, "root/phone")
    inside.remove("log")
    os.link(f"{folder}/log", "log", dst_dir_fd=inside.fd)


async def _root(stream):
    await stream.write(b"adbd is already running as root\n")


async def _in_child(switch, folder):
    """Switches the phone in a process of its own, which passes nothing of this one on to the phone."""
    pid = os.fork()
    if pid == 0:
        try:
            signal.set_wakeup_fd(-1)
            for number in (signal.SIGINT, signal.SIGTERM):
                signal.signal(number, signal.SIG_DFL)
            os.closerange(3, os.sysconf("SC_OPEN_MAX"))
            switch(folder)
        except (PhoneError, OSError) as error:
            print(f"phone: {error}", file=sys.stderr, flush=True)
        finally:
            os._exit(0)
    ended = os.pidfd_open(pid)
    await readable(ended)
    os.close(ended)
    os.waitpid(pid, 0)
