// Copyright 2026 The BEX Wi-Fi Authors
// SPDX-License-Identifier: Apache-2.0

#include "suites/Rates.h"
#include "tests/unit/Expect.h"

namespace vendor::korvan::bex::wifi::V1_0::implementation {
namespace {

// clang-format off

TEST(RatesTest, BgRates) {
    const struct { const char *rate, *index, *protocol, *name; } cases[] = {
        {"1",    "1",  "4", "11B_LONG_1_MBPS"},
        {"2",    "2",  "4", "11B_LONG_2_MBPS"},
        {"5.5",  "3",  "4", "11B_LONG_5_5_MBPS"},
        {"6",    "4",  "0", "11A_6_MBPS"},
        {"9",    "5",  "0", "11A_9_MBPS"},
        {"11",   "6",  "4", "11B_LONG_11_MBPS"},
        {"12",   "7",  "0", "11A_12_MBPS"},
        {"18",   "8",  "0", "11A_18_MBPS"},
        {"24",   "10", "0", "11A_24_MBPS"},
        {"36",   "12", "0", "11A_36_MBPS"},
        {"48",   "13", "0", "11A_48_MBPS"},
        {"54",   "14", "0", "11A_54_MBPS"},
        // Only the exact text counts, also where the number is right.
        {"",     "1",  "0", "11B_LONG_1_MBPS"},
        {"7",    "1",  "0", "11B_LONG_1_MBPS"},
        {" 54",  "1",  "0", "11B_LONG_1_MBPS"},
        {"54.0", "1",  "0", "11B_LONG_1_MBPS"},
        {"1.0",  "1",  "0", "11B_LONG_1_MBPS"},
        {"11 ",  "1",  "0", "11B_LONG_1_MBPS"},
        {"5",    "1",  "0", "11B_LONG_1_MBPS"},
    };
    for (const auto& [rate, index, protocol, name] : cases) {
        EXPECT_EQ(index, bgRateIndex(rate)) << rate;
        EXPECT_EQ(protocol, abgProtocolIndex(rate)) << rate;
        EXPECT_EQ(name, bgRateName(rate)) << rate;
    }
}

TEST(RatesTest, McsRateIndicesBeginAt15) {
    const std::pair<const char*, const char*> cases[] = {
        {"0", "15"}, {"7", "22"}, {"11", "26"}, {"", "15"}, {"abc", "15"}, {"7x", "22"},
        {"-20", "-5"}, {"100", "115"}, {"2147483647", "2147483662"},
    };
    for (const auto& [mcs, index] : cases) EXPECT_EQ(index, mcsRateIndex(mcs)) << mcs;
}

TEST(RatesTest, McsRateNames) {
    EXPECT_THAT(kHt20RateNames, ElementsAre(
        "MCS_6_5_MBPS", "MCS_13_MBPS", "MCS_19_5_MBPS", "MCS_26_MBPS", "MCS_39_MBPS",
        "MCS_52_MBPS", "MCS_58_5_MBPS", "MCS_65_MBPS", "MCS_72_2_MBPS", ""));
    EXPECT_THAT(kHt40RateNames, ElementsAre(
        "MCS_CB_13_5_MBPS", "MCS_CB_27_MBPS", "MCS_CB_40_5_MBPS", "MCS_CB_54_MBPS",
        "MCS_CB_81_MBPS", "MCS_CB_108_MBPS", "MCS_CB_121_5_MBPS", "MCS_CB_135_MBPS", "", ""));
    EXPECT_THAT(kVht20RateNames, ElementsAre(
        "MCS_VHT20_NGI_6_5_MBPS", "MCS_VHT20_NGI_13_MBPS", "MCS_VHT20_NGI_19_5_MBPS",
        "MCS_VHT20_NGI_26_MBPS", "MCS_VHT20_NGI_39_MBPS", "MCS_VHT20_NGI_52_MBPS",
        "MCS_VHT20_NGI_58_5_MBPS", "MCS_VHT20_NGI_65_MBPS", "MCS_VHT20_NGI_78_MBPS", ""));
    EXPECT_THAT(kVht40RateNames, ElementsAre(
        "MCS_VHT40_NGI_CB_13_5_MBPS", "MCS_VHT40_NGI_CB_27_MBPS", "MCS_VHT40_NGI_CB_40_5_MBPS",
        "MCS_VHT40_NGI_CB_54_MBPS", "MCS_VHT40_NGI_CB_81_MBPS", "MCS_VHT40_NGI_CB_108_MBPS",
        "MCS_VHT40_NGI_CB_121_5_MBPS", "MCS_VHT40_NGI_CB_135_MBPS", "MCS_VHT40_NGI_CB_162_MBPS",
        "MCS_VHT40_NGI_CB_180_MBPS"));
    EXPECT_THAT(kVht80RateNames, ElementsAre(
        "MCS_VHT80_NGI_CB_29_3_MBPS", "MCS_VHT80_NGI_CB_58_5_MBPS", "MCS_VHT80_NGI_CB_87_8_MBPS",
        "MCS_VHT80_NGI_CB_117_MBPS", "MCS_VHT80_NGI_CB_175_5_MBPS", "MCS_VHT80_NGI_CB_234_MBPS",
        "MCS_VHT80_NGI_CB_263_3_MBPS", "MCS_VHT80_NGI_CB_292_5_MBPS", "MCS_VHT80_NGI_CB_351_MBPS",
        "MCS_VHT80_NGI_CB_390_MBPS"));
}

// clang-format on

TEST(RatesTest, McsNumbersOutsideAListHaveNoName) {
    EXPECT_EQ("MCS_6_5_MBPS", mcsRateName(kHt20RateNames, "0"));
    EXPECT_EQ("MCS_6_5_MBPS", mcsRateName(kHt20RateNames, "x"));
    EXPECT_EQ("MCS_72_2_MBPS", mcsRateName(kHt20RateNames, "8"));
    EXPECT_EQ("MCS_VHT80_NGI_CB_390_MBPS", mcsRateName(kVht80RateNames, "9"));
    for (const char* mcs : {"-1", "10", "11", "1000000", "-2147483648", "2147483647"}) {
        EXPECT_EQ("", mcsRateName(kVht80RateNames, mcs)) << mcs;
    }
    EXPECT_EQ("", mcsRateName(kHt40RateNames, "8"));
}

} // namespace
} // namespace vendor::korvan::bex::wifi::V1_0::implementation
