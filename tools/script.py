# Copyright 2026 The BEX Wi-Fi Authors
# SPDX-License-Identifier: Apache-2.0
"""How the programs in this folder begin and end."""

import sys


def run(main, *arguments):
    """Ends the program with what `main` returns; Ctrl-C ends it with 130 and no message."""
    try:
        sys.exit(main(*arguments))
    except KeyboardInterrupt:
        sys.exit(130)
