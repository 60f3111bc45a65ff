// Copyright 2026 The BEX Wi-Fi Authors
// SPDX-License-Identifier: Apache-2.0

#include <gtest/gtest.h>

#include "suites/Channel.h"

namespace vendor::korvan::bex::wifi::V1_0::implementation {
namespace {

TEST(ChannelTest, FifteenAndAboveAre5GHz) {
    for (const char* channel : {"15", "36", "165", "15x", " 36", "+36"}) {
        EXPECT_TRUE(is5GHz(channel)) << channel;
    }
    for (const char* channel : {"14", "1", "0", "-36", "", "x", "x36", "14.9"}) {
        EXPECT_FALSE(is5GHz(channel)) << channel;
    }
}

TEST(ChannelTest, CentreFrequencies) {
    const std::pair<const char*, const char*> cases[] = {
            {"1", "2412"},   {"2", "2417"},   {"6", "2437"},    {"11", "2462"},
            {"13", "2472"},  {"14", "2484"},  {"15", "5075"},   {"36", "5180"},
            {"149", "5745"}, {"165", "5825"}, {"0", "2412"},    {"-1", "2412"},
            {"-36", "2412"}, {"", "2412"},    {"abc", "2412"},  {"6x", "2437"},
            {" 36", "5180"}, {"014", "2484"}, {"13.9", "2472"}, {"2147483647", "10737423235"},
    };
    for (const auto& [channel, frequency] : cases) {
        EXPECT_EQ(frequency, centreFrequency(channel)) << channel;
    }
}

} // namespace
} // namespace vendor::korvan::bex::wifi::V1_0::implementation
