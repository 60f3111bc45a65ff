// Copyright 2026 The BEX Wi-Fi Authors
// SPDX-License-Identifier: Apache-2.0

#pragma once

#include <string>

namespace vendor::korvan::bex::wifi::V1_0::implementation {

// How myftm is told the channel width, which comes in MHz ("40"). What the tool does not know, it
// is given as 20 MHz.

/**
 * The number behind -M for an 802.11n (vht false) or 802.11ac (vht true) test, as the tool of the
 * firmware-path suites takes it. 80 MHz has one number for both.
 */
std::string bandwidthMode(const std::string& bandwidth, bool vht);

/**
 * The option for an 802.11n or ac test, as the tool of the driver-path suites takes it; may be
 * several words. Widths without a row of their own, 20 MHz among them, are logged as an error under
 * `tag`.
 */
std::string bandwidthOption(const std::string& bandwidth, bool vht, const char* tag);

/**
 * The options for an 802.11ax test; several words. Only the exact texts "20", "40", "80" and "160"
 * are known: all else gives an empty text.
 */
std::string axBandwidthOptions(const std::string& bandwidth);

} // namespace vendor::korvan::bex::wifi::V1_0::implementation
