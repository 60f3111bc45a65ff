# Copyright 2026 The BEX Wi-Fi Authors
# SPDX-License-Identifier: Apache-2.0
#
# For BoardConfig.mk, wherever the checkout is:
#
#     include vendor/korvan/bex/wifi/service/board.mk
#
# User builds have no such service (see product.mk), so nothing of it is allowed there.

ifneq ($(TARGET_BUILD_VARIANT),user)
# This file's folder. Expanded at once: later the last makefile is another one.
BEX_WIFI_SERVICE := $(patsubst %/,%,$(dir $(lastword $(MAKEFILE_LIST))))
BOARD_SEPOLICY_DIRS += $(BEX_WIFI_SERVICE)/sepolicy
DEVICE_FRAMEWORK_COMPATIBILITY_MATRIX_FILE += $(BEX_WIFI_SERVICE)/compatibility_matrix.xml
endif
