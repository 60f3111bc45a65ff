# Copyright 2026 The BEX Wi-Fi Authors
# SPDX-License-Identifier: Apache-2.0
"""What SIGINT, SIGTERM and SIGHUP do while the radio is in use.

A signal keeps its effect: Ctrl-C raises KeyboardInterrupt, SIGTERM ends the process, a program's own
handler is called. It only waits until the radio is off, and does not come in the middle of switching it
on or off. Functions are marked with what a signal does while they run:

    holds          waits until they call checkpoint() ...
    interruptible  ... except in these, which they call
    undisturbed    waits, whatever they call, until they call leave()

The marks of the functions on the stack decide, not a counter, so there is no moment between a function's
call and its first statement in which a signal gets through. Python gives signals to its main thread
only: in other threads none of this does anything, and none is needed.
"""

import contextlib
import os
import signal
import sys
import threading

NUMBERS = (signal.SIGINT, signal.SIGTERM, signal.SIGHUP)

_marks = {}
_before = {}  # the handlers that the kit's own replaces, while `_watchers` is not 0
_watchers = 0
_waiting = []


class Ended(SystemExit):
    """Leaves a `with` block after a signal that ends the process; the signal follows."""


def _mark(name):
    def mark(function):
        _marks[function.__code__] = name
        return function
    return mark


holds = _mark("holds")
interruptible = _mark("interruptible")
undisturbed = _mark("undisturbed")


def _must_wait(frame):
    nearest = None
    while frame is not None:
        mark = _marks.get(frame.f_code)
        if mark == "undisturbed":
            return True
        nearest = nearest or mark
        frame = frame.f_back
    return nearest == "holds"


def _came(number, frame):
    if not _must_wait(frame):
        _act(number, frame)
    elif number not in _waiting:
        _waiting.append(number)
        name = signal.Signals(number).name
        with contextlib.suppress(OSError):
            os.write(2, f"bexwifi: {name} waits until the radio is off\n".encode())


def _act(number, frame):
    before = _before[number]
    if callable(before):
        before(number, frame)
    else:
        _waiting.append(number)
        raise Ended(128 + number)


def watch():
    """From here on signals follow the marks, until unwatch() was called as often."""
    global _watchers  # pylint: disable=global-statement
    if threading.current_thread() is not threading.main_thread():
        return
    for number in NUMBERS:
        before = signal.getsignal(number)
        if before is not _came and (callable(before) or before == signal.SIG_DFL):
            _before[number] = before
            signal.signal(number, _came)
    _watchers += 1


def unwatch():
    """The last one puts the handlers back, and lets the signals that waited take effect."""
    global _watchers  # pylint: disable=global-statement
    if threading.current_thread() is not threading.main_thread():
        return
    _watchers -= 1
    if _watchers == 0:
        while _before:
            number, before = _before.popitem()
            if signal.getsignal(number) is _came:
                signal.signal(number, before)
        waiting = _waiting[:]
        _waiting.clear()
        for number in waiting:
            signal.raise_signal(number)


@interruptible
def checkpoint():
    """Lets the signals that waited take effect, unless something undisturbed runs. May raise what their
    handlers raise."""
    leave(sys._getframe())  # pylint: disable=protected-access


def leave(frame):
    """The same, for a function that has done its work and is about to return to this frame."""
    if threading.current_thread() is threading.main_thread() and not _must_wait(frame):
        while _waiting and _before:
            _act(_waiting.pop(0), frame)
