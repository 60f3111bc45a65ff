# Copyright 2026 The BEX Wi-Fi Authors
# SPDX-License-Identifier: Apache-2.0
#
# For the device makefile:
#
#     $(call inherit-product, vendor/korvan/bex/wifi/service/product.mk)
#
# PRODUCT_PACKAGES_DEBUG leaves user builds without the service: whoever may call it may run any
# command line. A property that keeps it from starting is not enough, as init starts a service whose
# interface a client asks for, disabled or not.

PRODUCT_PACKAGES_DEBUG += \
    bex-wifi-client \
    vendor.korvan.bex.wifi@1.0-disruptive-target-test \
    vendor.korvan.bex.wifi@1.0-service
