# Copyright 2026 The BEX Wi-Fi Authors
# SPDX-License-Identifier: Apache-2.0
"""Waiting for descriptors of pipes, terminals and processes."""

import asyncio


async def readable(descriptor):
    """Returns when it can be read, or the process behind it has ended."""
    loop = asyncio.get_running_loop()
    await _once(descriptor, loop.add_reader, loop.remove_reader)


async def writable(descriptor):
    """Returns when it can be written to."""
    loop = asyncio.get_running_loop()
    await _once(descriptor, loop.add_writer, loop.remove_writer)


async def _once(descriptor, add, remove):
    ready = asyncio.get_running_loop().create_future()
    add(descriptor, lambda: ready.done() or ready.set_result(None))
    try:
        await ready
    finally:
        remove(descriptor)
