// Copyright 2026 The BEX Wi-Fi Authors
// SPDX-License-Identifier: Apache-2.0

#pragma once

#include <string>

namespace vendor::korvan::bex::wifi::V1_0::implementation {

/**
 * Tells whether a channel lies in the 5 GHz band: its number is 15 or more. Text that is no number
 * counts as 0 and so as 2.4 GHz.
 */
bool is5GHz(const std::string& channel);

/**
 * The centre frequency of a channel in MHz, in decimal: "2437" for channel "6". Numbers below 1,
 * and text that is no number, give channel 1's.
 */
std::string centreFrequency(const std::string& channel);

} // namespace vendor::korvan::bex::wifi::V1_0::implementation
