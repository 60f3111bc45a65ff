# Copyright 2026 The BEX Wi-Fi Authors
# SPDX-License-Identifier: Apache-2.0
"""The one exception that the launcher turns into a line on stderr."""


class PhoneError(Exception):
    """What went wrong, in one line that names the file, phone or tool."""
