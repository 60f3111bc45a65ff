// Copyright 2026 The BEX Wi-Fi Authors
// SPDX-License-Identifier: Apache-2.0

#include "suites/Channel.h"

#include <stdint.h>
#include <stdlib.h>

namespace vendor::korvan::bex::wifi::V1_0::implementation {

namespace {
// The highest channel of the 2.4 GHz band (IEEE 802.11, 2484 MHz, used in Japan).
constexpr int kLast24GHzChannel = 14;
} // namespace

bool is5GHz(const std::string& channel) {
    return atoi(channel.c_str()) > kLast24GHzChannel;
}

std::string centreFrequency(const std::string& channel) {
    // Wide enough for five times any channel that atoi can give.
    const int64_t number = atoi(channel.c_str());
    if (is5GHz(channel)) return std::to_string(5000 + 5 * number);
    if (number == kLast24GHzChannel) return "2484";
    if (number < 1) return "2412";
    return std::to_string(2407 + 5 * number);
}

} // namespace vendor::korvan::bex::wifi::V1_0::implementation
