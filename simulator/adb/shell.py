# Copyright 2026 The BEX Wi-Fi Authors
# SPDX-License-Identifier: Apache-2.0
"""Runs commands in the phone, as `phone run` does, for `adb shell` and `adb exec-out`.

In the second version of the shell's protocol a stream carries packets: a byte that says what it is,
four bytes of length, the content. In the first one it carries the bytes as they are.
"""

import asyncio
import ctypes
import errno
import fcntl
import os
import pty
import re
import signal
import struct
import subprocess
import termios

from adb.descriptors import readable, writable
from adb.messages import ProtocolError
from launcher.description import SIMULATOR

STDIN, STDOUT, STDERR, EXIT, CLOSE_STDIN, WINDOW_SIZE = range(6)
_PACKET_HEAD = struct.Struct("<BI")
_SIZE = re.compile(rb"(\d{1,4})x(\d{1,4}),(\d{1,4})x(\d{1,4})")
LONGEST_READ = 1 << 16
PR_SET_PDEATHSIG = 1  # from <linux/prctl.h>
HANG_UP_SECONDS = 20

SHELL = ["/system/bin/sh"]
BUSYBOX = "/phone/bin/busybox"
_libc = ctypes.CDLL(None)

# In a session of its own with the terminal in control, so that there are jobs and Ctrl-C as on a
# phone. What leads a process group cannot begin a session; a child of the shell does not.
AT_TERMINAL = [*SHELL, "-c", f'{BUSYBOX} setsid -c "$@"; exit $?', "sh"]


class Command:
    """What a shell service asks for: `words` between "shell," and the colon, and the line."""

    def __init__(self, words, line):
        self.line = line
        self.with_packets = b"v2" in words
        self.at_terminal = b"pty" in words or (not line and b"raw" not in words)
        terms = [word for word in words if word.startswith(b"TERM=")]
        self.term = (terms or [b"TERM=dumb"])[-1]

    def inside(self):
        """The command that runs in the phone. Without a line the shell reads its standard input."""
        shell = [*SHELL, "-c", self.line] if self.line else [*SHELL, "-"]
        return [*(AT_TERMINAL if self.at_terminal else []), BUSYBOX, "env", self.term, *shell]


async def run(folder, command, stream):
    """Serves one command; whatever ends this ends the command."""
    try:
        process = Process(folder, command)
    except OSError as error:  # a line that is too long, above all
        await _refuse(command, stream, error.strerror)
        return
    try:
        await process.serve(stream)
    finally:
        await process.end()


async def _refuse(command, stream, reason):
    text = f"{SHELL[0]}: {reason}\n".encode()
    if command.with_packets:
        await stream.write(_packet(STDERR, text))
        await stream.write(_packet(EXIT, bytes([126])))
    else:
        await stream.write(text)


def _packet(kind, content):
    return _PACKET_HEAD.pack(kind, len(content)) + content


class Process:
    """A `phone run` with pipes or a terminal."""

    def __init__(self, folder, command):
        self._command = command
        self._stdin, self._outputs, inner = _streams(command)
        try:
            self._process = subprocess.Popen(
                [f"{SIMULATOR}/phone", "run", folder, *command.inside()], stdin=inner[0],
                stdout=inner[1], stderr=inner[2], start_new_session=True,
                preexec_fn=_end_with_device)
            self._ended = os.pidfd_open(self._process.pid)
        except BaseException:
            self._close()
            raise
        finally:
            for descriptor in set(inner):
                os.close(descriptor)

    async def serve(self, stream):
        """Returns when the command has ended and the peer knows."""
        outputs = [asyncio.create_task(task) for task in (
            *(self._pass_on(descriptor, kind, stream) for descriptor, kind in self._outputs),
            readable(self._ended))]
        tasks = running = {*outputs, asyncio.create_task(self._feed(stream))}
        try:
            while not all(task.done() for task in outputs):
                done, running = await asyncio.wait(running, return_when=asyncio.FIRST_COMPLETED)
                for task in done:
                    task.result()  # raises what ended it, as the input always does
            if self._command.with_packets:
                code = self._process.wait()
                await stream.write(_packet(EXIT, bytes([code if code >= 0 else 128 - code])))
        finally:
            # No task may go on waiting for this descriptor: another one will get its number.
            for task in tasks:
                task.cancel()
            await asyncio.gather(*tasks, return_exceptions=True)

    async def end(self):
        """Hangs up what has not ended."""
        self._close()
        if self._process.poll() is None:
            self._process.send_signal(signal.SIGHUP)
            try:
                await asyncio.wait_for(readable(self._ended), HANG_UP_SECONDS)
            except asyncio.TimeoutError:
                self._process.kill()
        self._process.wait()
        os.close(self._ended)

    def _close(self):
        for descriptor in {self._stdin, *(descriptor for descriptor, _ in self._outputs)} - {None}:
            os.close(descriptor)
        self._stdin, self._outputs = None, []

    async def _pass_on(self, descriptor, kind, stream):
        """Copies what the command prints, until its end."""
        while True:
            await readable(descriptor)
            try:
                data = os.read(descriptor, LONGEST_READ)
            except OSError as error:  # a terminal that nobody has open any more
                if error.errno != errno.EIO:
                    raise
                data = b""
            if not data:
                return
            await stream.write(_packet(kind, data) if self._command.with_packets else data)

    async def _feed(self, stream):
        """Gives the command what the peer sends, until the peer hangs up."""
        while not self._command.with_packets:
            await self._write(await stream.read(LONGEST_READ))
        while True:
            kind, length = _PACKET_HEAD.unpack(await stream.read_exactly(_PACKET_HEAD.size))
            if kind == STDIN:
                while length:
                    data = await stream.read(min(length, LONGEST_READ))
                    length -= len(data)
                    await self._write(data)
            elif kind in (CLOSE_STDIN, WINDOW_SIZE) and length < 32:
                content = await stream.read_exactly(length)
                if kind == WINDOW_SIZE:
                    self._resize(_SIZE.match(content))
                elif not self._command.at_terminal:  # a terminal has no input of its own to close
                    self._close_stdin()
            else:
                raise ProtocolError("a packet of the shell that is no input")

    async def _write(self, data):
        while data and self._stdin is not None:
            await writable(self._stdin)
            try:
                data = data[os.write(self._stdin, data):]
            except BlockingIOError:
                continue
            except OSError:  # the command reads no more
                self._close_stdin()

    def _close_stdin(self):
        if self._stdin is not None and not self._command.at_terminal:
            os.close(self._stdin)
        self._stdin = None

    def _resize(self, size):
        if size and self._command.at_terminal and self._outputs:
            fcntl.ioctl(self._outputs[0][0], termios.TIOCSWINSZ,
                        struct.pack("4H", *map(int, size.groups())))


def _end_with_device():
    _libc.prctl(PR_SET_PDEATHSIG, signal.SIGHUP, 0, 0, 0)


def _streams(command):
    """Our end of standard input, our ends of the outputs with their kinds, the command's three."""
    if command.at_terminal:
        master, slave = pty.openpty()
        os.set_blocking(master, False)
        return master, [(master, STDOUT)], (slave, slave, slave)
    pipes = []
    try:
        for _ in range(3 if command.with_packets else 2):
            pipes.append(os.pipe())
    except OSError:
        for descriptor in sum(pipes, ()):
            os.close(descriptor)
        raise
    (read_in, write_in), *outputs = pipes
    os.set_blocking(write_in, False)
    ours = [(output, kind) for (output, _), kind in zip(outputs, (STDOUT, STDERR))]
    return write_in, ours, (read_in, outputs[0][1], outputs[-1][1])
