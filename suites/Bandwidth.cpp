// Copyright 2026 The BEX Wi-Fi Authors
// SPDX-License-Identifier: Apache-2.0

#include "suites/Bandwidth.h"

#include <android/log.h>
#include <stdlib.h>

#include <string_view>

namespace vendor::korvan::bex::wifi::V1_0::implementation {

namespace {

/** The option for a width, by the standard. */
struct Width {
    int mhz;
    const char* n;
    const char* ac;
};

struct AxWidth {
    std::string_view mhz;
    const char* options;
};

// clang-format off
constexpr Width kModes[] = {
//  MHz  n    ac
    {40, "2", "6"},
    {80, "8", "8"},
};
constexpr Width kModeOf20MHz =
    {20, "1", "5"};

// The tool accepts 80 and 160 MHz only with 802.11ac.
constexpr Width kOptions[] = {
//  MHz   n       ac
    {40,  "-M 2", "-M 6"},
    {80,  "",     "-M 8"},
    {160, "",     "--nss 1 --rateBw 20 -M 29"},
};
constexpr Width kOptionOf20MHz =
    {20,  "-M 1", "-M 5"};

constexpr AxWidth kAxOptions[] = {
//  MHz
    {"20",  "--rateBw 8 -M 2"},
    {"40",  "--rateBw 9 -M 3"},
    {"80",  "--rateBw 10 -M 4"},
    {"160", "--rateBw 16 -M 29"},
};
// clang-format on

const char* byStandard(const Width& width, bool vht) {
    return vht ? width.ac : width.n;
}

/** The entry of a width in a table; empty when there is none. */
template <size_t size>
std::string find(const Width (&widths)[size], int mhz, bool vht) {
    for (const Width& width : widths) {
        if (width.mhz == mhz) return byStandard(width, vht);
    }
    return "";
}

} // namespace

std::string bandwidthMode(const std::string& bandwidth, bool vht) {
    const std::string mode = find(kModes, atoi(bandwidth.c_str()), vht);
    return mode.empty() ? byStandard(kModeOf20MHz, vht) : mode;
}

std::string bandwidthOption(const std::string& bandwidth, bool vht, const char* tag) {
    const int mhz = atoi(bandwidth.c_str());
    std::string option = find(kOptions, mhz, vht);
    if (!option.empty()) return option;
    __android_log_print(ANDROID_LOG_ERROR, tag, "bandwidth error : %d, use default 20MHz", mhz);
    return byStandard(kOptionOf20MHz, vht);
}

std::string axBandwidthOptions(const std::string& bandwidth) {
    for (const AxWidth& width : kAxOptions) {
        if (width.mhz == bandwidth) return width.options;
    }
    return "";
}

} // namespace vendor::korvan::bex::wifi::V1_0::implementation
