# Copyright 2026 The BEX Wi-Fi Authors
# SPDX-License-Identifier: Apache-2.0
"""Every test here has the real adb and a phone on it: see support/adb.py."""

from support.adb import adb_fixture, phone_fixture  # noqa: F401  (pytest finds the fixtures here)
