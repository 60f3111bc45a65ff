# Copyright 2026 The BEX Wi-Fi Authors
# SPDX-License-Identifier: Apache-2.0
"""What a phone answers to adb: connections, a shell, files, a log, root and reboot."""
