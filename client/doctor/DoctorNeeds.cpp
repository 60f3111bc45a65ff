// Copyright 2026 The BEX Wi-Fi Authors
// SPDX-License-Identifier: Apache-2.0

#include "client/doctor/DoctorNeeds.h"

#include <cstdlib>

namespace vendor::korvan::bex::wifi::client {

const std::vector<std::string> kCommandTags = {"wifi@1.0-VendorTestSuit", "wifi@1.0-SnifferTool"};

namespace {

// clang-format off
constexpr DriverFile kConMode       = {"/sys/module/wlan/parameters/con_mode",        "wlan",   true};
constexpr DriverFile kFirmwarePath  = {"/sys/module/bcmdhd/parameters/firmware_path", "bcmdhd", false};
constexpr DriverFile kMfgFirmware   = {"/etc/firmware/fw_bcmdhd_mfg.bin",             "",       false};
constexpr DriverFile kFirmware      = {"/etc/firmware/fw_bcmdhd.bin",                 "",       false};

// A unit test holds this against the command lines of every operation.
const std::vector<FamilyNeeds> kNeeds = {
    {ChipFamily::brcm, "broadcom", Modules::none,
     /* /vendor/bin */ {"cat", "ifconfig", "iw"},
     /* by name     */ {"busybox", "ifconfig", "setprop", "wl"},
     {kFirmware, kMfgFirmware, kFirmwarePath, kConMode}},

    {ChipFamily::wcn, "wcn", Modules::oneOfSeveral,
     /* /vendor/bin */ {"cat", "ifconfig", "iw"},
     /* by name     */ {"ifconfig", "insmod", "iwconfig", "iwlist", "iwpriv", "ping", "rmmod",
                        "setprop"},
     {kConMode}},

    {ChipFamily::qca, "qca", Modules::oneOfSeveral,
     /* /vendor/bin */ {"cat", "ifconfig", "insmod", "iw"},
     /* by name     */ {"ifconfig", "insmod", "iwconfig", "iwlist", "myftm", "ping", "rmmod",
                        "setprop", "sleep"},
     {kConMode}},

    {ChipFamily::qca639x, "qca639x", Modules::allOfAFolder,
     /* /vendor/bin */ {"cat", "ifconfig", "insmod", "iwpriv"},
     /* by name     */ {"ifconfig", "insmod", "iwconfig", "iwlist", "myftm", "ping", "rmmod",
                        "setprop", "sleep"},
     {kConMode}},

    {ChipFamily::wcn685x, "wcn685x", Modules::allOfAFolder,
     /* /vendor/bin */ {"cat", "ifconfig", "insmod", "iwpriv", "start", "stop"},
     /* by name     */ {"ifconfig", "insmod", "iwconfig", "iwlist", "myftm", "ping", "rmmod",
                        "sleep"},
     {kConMode}},

    {ChipFamily::wcn6750, "wcn6750", Modules::allOfAFolder,
     /* /vendor/bin */ {"cat", "ifconfig", "insmod", "iwpriv", "start", "stop"},
     /* by name     */ {"ifconfig", "insmod", "iwconfig", "iwlist", "myftm", "ping", "rmmod",
                        "sleep"},
     {kConMode}},

    {ChipFamily::wcn39xx, "wcn39xx", Modules::oneOfSeveral,
     /* /vendor/bin */ {"cat", "ifconfig", "insmod", "iw", "iwconfig", "iwlist", "myftm", "ping",
                        "rmmod", "sleep"},
     /* by name     */ {"setprop"},
     {kConMode}},
};
// clang-format on

} // namespace

const FamilyNeeds& needsOf(ChipFamily family) {
    for (const FamilyNeeds& needs : kNeeds) {
        if (needs.family == family) return needs;
    }
    abort(); // A family without a row.
}

} // namespace vendor::korvan::bex::wifi::client
