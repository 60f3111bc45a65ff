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

} // namespace
} // namespace vendor::korvan::bex::wifi::V1_0::implementation
