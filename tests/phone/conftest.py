# Copyright 2026 The BEX Wi-Fi Authors
# SPDX-License-Identifier: Apache-2.0
"""Every test here has simulated phones at hand: see support/phone.py."""

from support.phone import make_phone_fixture  # noqa: F401  (pytest finds the fixture here)
