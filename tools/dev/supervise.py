#!/usr/bin/python3 -B
# Copyright 2026 The BEX Wi-Fi Authors
# SPDX-License-Identifier: Apache-2.0
"""Runs a command, and when it ends, ends everything that it has started.

usage: tools/dev/supervise.py [--clean-up SECONDS] COMMAND [ARGUMENT]...

Ctrl-C and the other signals that end a program reach the command's process group as one SIGINT, and
the group may clean up for a while, 20 seconds unless told otherwise. What still runs after that, in any
session or group, is killed; after a second Ctrl-C at once. The exit code is the command's own, or 130
after a signal.
"""

import contextlib
import ctypes
import os
import pathlib
import signal
import subprocess
import sys
import time

PR_SET_CHILD_SUBREAPER = 36
SIGNALS = (signal.SIGINT, signal.SIGTERM, signal.SIGHUP, signal.SIGQUIT)
SECONDS_TO_CLEAN_UP = 20
USAGE = "usage: supervise.py [--clean-up SECONDS] COMMAND [ARGUMENT]..."


def descendants(parent):
    """Every process below a parent. None can leave: orphans become children of this process."""
    children = {}
    for entry in pathlib.Path("/proc").glob("[0-9]*/stat"):
        try:
            fields = entry.read_text(errors="replace").rpartition(")")[2].split()
        except OSError:
            continue  # it has ended
        children.setdefault(int(fields[1]), []).append(int(entry.parent.name))
    found = []
    unseen = [parent]
    while unseen:
        below = children.get(unseen.pop(), [])
        found += below
        unseen += below
    return found


def reap():
    """Takes note of the children that have ended; false when there is no child left at all."""
    try:
        while os.waitpid(-1, os.WNOHANG) != (0, 0):
            pass
    except ChildProcessError:
        return False
    return True


def end_the_rest(may_clean_up):
    while reap():
        if not may_clean_up():
            for process in descendants(os.getpid()):
                with contextlib.suppress(ProcessLookupError):
                    os.kill(process, signal.SIGKILL)
        time.sleep(0.05)


def exists(group):
    try:
        os.killpg(group, 0)
    except ProcessLookupError:
        return False
    return True


def main(command, seconds_to_clean_up):
    ctypes.CDLL(None).prctl(PR_SET_CHILD_SUBREAPER, 1, 0, 0, 0)
    received = []

    def receive(number, _frame):
        received.append(number)

    for number in SIGNALS:
        signal.signal(number, receive)
    # A group of its own: the terminal's signals come here alone, so that there is one order of events.
    started = subprocess.Popen(command, stdin=subprocess.DEVNULL, preexec_fn=lambda: os.setpgid(0, 0))
    code = None
    while code is None and not received:
        # Orphans, too: who waits for the end of one looks whether its number is still there.
        ended, status = os.waitpid(-1, os.WNOHANG)
        if ended == started.pid:
            code = started.returncode = os.waitstatus_to_exitcode(status)
        elif ended == 0:
            time.sleep(0.05)
    if code is not None:
        end_the_rest(lambda: False)
        return code if code >= 0 else 128 - code
    with contextlib.suppress(ProcessLookupError):
        os.killpg(started.pid, signal.SIGINT)
    deadline = time.monotonic() + seconds_to_clean_up
    end_the_rest(lambda: len(received) == 1 and time.monotonic() < deadline and exists(started.pid))
    return 130


def seconds_and_command(words):
    if words[:1] == ["--clean-up"] and len(words) > 1 and words[1].isdigit():
        return int(words[1]), words[2:]
    return SECONDS_TO_CLEAN_UP, words


if __name__ == "__main__":
    seconds, words = seconds_and_command(sys.argv[1:])
    if not words:
        sys.exit(USAGE)
    sys.exit(main(words, seconds))
