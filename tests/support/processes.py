# Copyright 2026 The BEX Wi-Fi Authors
# SPDX-License-Identifier: Apache-2.0
"""What /proc tells of the processes that a test has started."""

import contextlib
import os
import pathlib


def children(pid):
    """The numbers of the children that a process of one thread has."""
    return [int(child) for child in pathlib.Path(f"/proc/{pid}/task/{pid}/children").read_text().split()]


def open_files(pid):
    """What the descriptors of a process lead to; without those that it closes meanwhile."""
    found = []
    for entry in pathlib.Path(f"/proc/{pid}/fd").iterdir():
        with contextlib.suppress(FileNotFoundError):
            found.append(os.readlink(entry))
    return found
