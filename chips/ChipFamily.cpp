// Copyright 2026 The BEX Wi-Fi Authors
// SPDX-License-Identifier: Apache-2.0

#include "chips/ChipFamily.h"

#include <string_view>

namespace vendor::korvan::bex::wifi {
namespace {

struct Recognition {
    std::string_view vendor;
    std::string_view partOfName;
    ChipFamily family;
};

// The first row that fits wins: a name with WCN or QCA in upper case never gets to the digits. The
// empty part of a name is in every name.
// clang-format off
constexpr Recognition kRecognitions[] = {
    {"broadcom", "",     ChipFamily::brcm},
    {"qcom",     "WCN",  ChipFamily::wcn},
    {"qcom",     "QCA",  ChipFamily::qca},
    {"qcom",     "639x", ChipFamily::qca639x},
    {"qcom",     "685x", ChipFamily::wcn685x},
    {"qcom",     "6750", ChipFamily::wcn6750},
    {"qcom",     "",     ChipFamily::wcn39xx},
};
// clang-format on

} // namespace

std::optional<ChipFamily> chipFamily(const std::string& vendor, const std::string& chip) {
    for (const Recognition& row : kRecognitions) {
        const bool fits = chip.find(row.partOfName) != std::string::npos;
        if (row.vendor == vendor && fits) return row.family;
    }
    return std::nullopt;
}

} // namespace vendor::korvan::bex::wifi
