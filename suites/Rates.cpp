// Copyright 2026 The BEX Wi-Fi Authors
// SPDX-License-Identifier: Apache-2.0

#include "suites/Rates.h"

#include <stdint.h>
#include <stdlib.h>

namespace vendor::korvan::bex::wifi::V1_0::implementation {

namespace {

struct BgRate {
    const char* rate;
    const char* index;
    const char* protocol;
    const char* name;
};

// The tool's indices have gaps: 9 and 11 are no rates.
// clang-format off
constexpr BgRate kBgRates[] = {
//   Mbit/s  index  protocol  the driver's name
    {"1",    "1",   "4",      "11B_LONG_1_MBPS"},
    {"2",    "2",   "4",      "11B_LONG_2_MBPS"},
    {"5.5",  "3",   "4",      "11B_LONG_5_5_MBPS"},
    {"6",    "4",   "0",      "11A_6_MBPS"},
    {"9",    "5",   "0",      "11A_9_MBPS"},
    {"11",   "6",   "4",      "11B_LONG_11_MBPS"},
    {"12",   "7",   "0",      "11A_12_MBPS"},
    {"18",   "8",   "0",      "11A_18_MBPS"},
    {"24",   "10",  "0",      "11A_24_MBPS"},
    {"36",   "12",  "0",      "11A_36_MBPS"},
    {"48",   "13",  "0",      "11A_48_MBPS"},
    {"54",   "14",  "0",      "11A_54_MBPS"},
};
constexpr BgRate kUnknownRate =
    {"",     "1",   "0",      "11B_LONG_1_MBPS"};
// clang-format on

// The tool's index of MCS 0.
constexpr int64_t kFirstMcsIndex = 15;

const BgRate& findBgRate(const std::string& rate) {
    for (const BgRate& row : kBgRates) {
        if (row.rate == rate) return row;
    }
    return kUnknownRate;
}

} // namespace

// clang-format off
constexpr RateNames kHt20RateNames = {
    "MCS_6_5_MBPS",  "MCS_13_MBPS",   "MCS_19_5_MBPS", "MCS_26_MBPS", "MCS_39_MBPS",
    "MCS_52_MBPS",   "MCS_58_5_MBPS", "MCS_65_MBPS",   "MCS_72_2_MBPS",
};
constexpr RateNames kHt40RateNames = {
    "MCS_CB_13_5_MBPS", "MCS_CB_27_MBPS",  "MCS_CB_40_5_MBPS",  "MCS_CB_54_MBPS",
    "MCS_CB_81_MBPS",   "MCS_CB_108_MBPS", "MCS_CB_121_5_MBPS", "MCS_CB_135_MBPS",
};
constexpr RateNames kVht20RateNames = {
    "MCS_VHT20_NGI_6_5_MBPS",  "MCS_VHT20_NGI_13_MBPS", "MCS_VHT20_NGI_19_5_MBPS",
    "MCS_VHT20_NGI_26_MBPS",   "MCS_VHT20_NGI_39_MBPS", "MCS_VHT20_NGI_52_MBPS",
    "MCS_VHT20_NGI_58_5_MBPS", "MCS_VHT20_NGI_65_MBPS", "MCS_VHT20_NGI_78_MBPS",
};
constexpr RateNames kVht40RateNames = {
    "MCS_VHT40_NGI_CB_13_5_MBPS",  "MCS_VHT40_NGI_CB_27_MBPS",  "MCS_VHT40_NGI_CB_40_5_MBPS",
    "MCS_VHT40_NGI_CB_54_MBPS",    "MCS_VHT40_NGI_CB_81_MBPS",  "MCS_VHT40_NGI_CB_108_MBPS",
    "MCS_VHT40_NGI_CB_121_5_MBPS", "MCS_VHT40_NGI_CB_135_MBPS", "MCS_VHT40_NGI_CB_162_MBPS",
    "MCS_VHT40_NGI_CB_180_MBPS",
};
constexpr RateNames kVht80RateNames = {
    "MCS_VHT80_NGI_CB_29_3_MBPS",  "MCS_VHT80_NGI_CB_58_5_MBPS",  "MCS_VHT80_NGI_CB_87_8_MBPS",
    "MCS_VHT80_NGI_CB_117_MBPS",   "MCS_VHT80_NGI_CB_175_5_MBPS", "MCS_VHT80_NGI_CB_234_MBPS",
    "MCS_VHT80_NGI_CB_263_3_MBPS", "MCS_VHT80_NGI_CB_292_5_MBPS", "MCS_VHT80_NGI_CB_351_MBPS",
    "MCS_VHT80_NGI_CB_390_MBPS",
};
// clang-format on

std::string bgRateIndex(const std::string& rate) {
    return findBgRate(rate).index;
}

std::string abgProtocolIndex(const std::string& rate) {
    return findBgRate(rate).protocol;
}

std::string bgRateName(const std::string& rate) {
    return findBgRate(rate).name;
}

std::string mcsRateIndex(const std::string& mcs) {
    return std::to_string(atoi(mcs.c_str()) + kFirstMcsIndex);
}

std::string mcsRateName(const RateNames& names, const std::string& mcs) {
    const int number = atoi(mcs.c_str());
    if (number < 0 || number >= static_cast<int>(names.size())) return "";
    return std::string(names[number]);
}

} // namespace vendor::korvan::bex::wifi::V1_0::implementation
