// Copyright 2026 The BEX Wi-Fi Authors
// SPDX-License-Identifier: Apache-2.0

#pragma once

namespace vendor::korvan::bex::wifi {

// Where a phone keeps the files of its WLAN driver.

/** The image that the Broadcom driver loads for tests. */
inline constexpr const char* kMfgFirmwarePath = "/etc/firmware/fw_bcmdhd_mfg.bin";

/** The places of a driver that is one file, in the order of the search. */
inline constexpr const char* kModuleCandidates[] = {
        "/system/lib/modules/wlan.ko",
        "/vendor/lib/modules/wlan.ko",
        "/system/lib/modules/qca_cld3_wlan.ko",
        "/vendor/lib/modules/qca_cld3_wlan.ko",
        "/vendor/lib/modules/qca_cld3/qca_cld3_wlan.ko",
};

/** The folder of a driver that is several files, and how their names begin. */
inline constexpr const char* kModuleFolder = "/vendor/lib/modules";
inline constexpr const char* kModulePrefix = "qca_cld3_";

} // namespace vendor::korvan::bex::wifi
