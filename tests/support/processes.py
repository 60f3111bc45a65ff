# Copyright 2026 The BEX Wi-Fi Authors
# SPDX-License-Identifier: Apache-2.0
"""What /proc tells of the processes that a test has started."""

import pathlib


def children(pid):
    """The numbers of the children that a process of one thread has."""
    return [int(child) for child in pathlib.Path(f"/proc/{pid}/task/{pid}/children").read_text().split()]
