// Copyright 2026 The BEX Wi-Fi Authors
// SPDX-License-Identifier: Apache-2.0

#include "suites/Channel.h"

#include <stdlib.h>

namespace vendor::korvan::bex::wifi::V1_0::implementation {

namespace {
// The highest channel of the 2.4 GHz band (IEEE 802.11, 2484 MHz, used in Japan).
constexpr int kLast24GHzChannel = 14;
} // namespace

bool is5GHz(const std::string& channel) {
    return atoi(channel.c_str()) > kLast24GHzChannel;
}

} // namespace vendor::korvan::bex::wifi::V1_0::implementation
