# Copyright 2026 The BEX Wi-Fi Authors
# SPDX-License-Identifier: Apache-2.0
#
# For BoardConfig.mk:
#
#     include vendor/korvan/bex/wifi/service/board.mk
#
# User builds have no such service (see product.mk), so nothing of it is allowed there.

ifneq ($(TARGET_BUILD_VARIANT),user)
BOARD_SEPOLICY_DIRS += vendor/korvan/bex/wifi/service/sepolicy
DEVICE_FRAMEWORK_COMPATIBILITY_MATRIX_FILE += \
    vendor/korvan/bex/wifi/service/compatibility_matrix.xml
endif
