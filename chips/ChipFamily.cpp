// Copyright 2026 The BEX Wi-Fi Authors
// SPDX-License-Identifier: Apache-2.0

#include "chips/ChipFamily.h"

#include "chips/ModuleFiles.h"

namespace vendor::korvan::bex::wifi {

namespace {

// clang-format off
constexpr DriverFile kConMode      = {"/sys/module/wlan/parameters/con_mode",        "wlan",   true};
constexpr DriverFile kFirmwarePath = {"/sys/module/bcmdhd/parameters/firmware_path", "bcmdhd", false};
constexpr DriverFile kMfgFirmware  = {kMfgFirmwarePath,                              "",       false};
constexpr DriverFile kFirmware     = {"/etc/firmware/fw_bcmdhd.bin",                 "",       false};
// clang-format on

} // namespace

// A name that holds WCN or QCA in upper case fits before the rows with digits are tried. A unit
// test compares the tools and files with the command lines of every operation.
// clang-format off
const std::vector<ChipFamily>& chipFamilies() {
    static const std::vector<ChipFamily> kFamilies = {
        {"broadcom", "broadcom", "", DriverModules::none,
         /* /vendor/bin */ {"cat", "ifconfig", "iw"},
         /* by name     */ {"busybox", "ifconfig", "setprop", "wl"},
         {kFirmware, kMfgFirmware, kFirmwarePath, kConMode}},

        {"wcn", "qcom", "WCN", DriverModules::oneOfSeveral,
         /* /vendor/bin */ {"cat", "ifconfig", "iw"},
         /* by name     */ {"ifconfig", "insmod", "iwconfig", "iwlist", "iwpriv", "ping", "rmmod",
                            "setprop"},
         {kConMode}},

        {"qca", "qcom", "QCA", DriverModules::oneOfSeveral,
         /* /vendor/bin */ {"cat", "ifconfig", "insmod", "iw"},
         /* by name     */ {"ifconfig", "insmod", "iwconfig", "iwlist", "myftm", "ping", "rmmod",
                            "setprop", "sleep"},
         {kConMode}},

        {"qca639x", "qcom", "639x", DriverModules::allOfAFolder,
         /* /vendor/bin */ {"cat", "ifconfig", "insmod", "iwpriv"},
         /* by name     */ {"ifconfig", "insmod", "iwconfig", "iwlist", "myftm", "ping", "rmmod",
                            "setprop", "sleep"},
         {kConMode}},

        {"wcn685x", "qcom", "685x", DriverModules::allOfAFolder,
         /* /vendor/bin */ {"cat", "ifconfig", "insmod", "iwpriv", "start", "stop"},
         /* by name     */ {"ifconfig", "insmod", "iwconfig", "iwlist", "myftm", "ping", "rmmod",
                            "sleep"},
         {kConMode}},

        {"wcn6750", "qcom", "6750", DriverModules::allOfAFolder,
         /* /vendor/bin */ {"cat", "ifconfig", "insmod", "iwpriv", "start", "stop"},
         /* by name     */ {"ifconfig", "insmod", "iwconfig", "iwlist", "myftm", "ping", "rmmod",
                            "sleep"},
         {kConMode}},

        {"wcn39xx", "qcom", "", DriverModules::oneOfSeveral,
         /* /vendor/bin */ {"cat", "ifconfig", "insmod", "iw", "iwconfig", "iwlist", "myftm", "ping",
                            "rmmod", "sleep"},
         /* by name     */ {"setprop"},
         {kConMode}},
    };
    return kFamilies;
}
// clang-format on

const ChipFamily* findChipFamily(const std::string& vendor, const std::string& chip) {
    for (const ChipFamily& family : chipFamilies()) {
        const bool fits = chip.find(family.partOfName) != std::string::npos;
        if (vendor == family.vendor && fits) return &family;
    }
    return nullptr;
}

} // namespace vendor::korvan::bex::wifi
