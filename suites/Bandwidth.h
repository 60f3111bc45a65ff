// Copyright 2026 The BEX Wi-Fi Authors
// SPDX-License-Identifier: Apache-2.0

#pragma once

#include <string>

namespace vendor::korvan::bex::wifi::V1_0::implementation {

// The channel width, which comes in MHz ("40"), in the form that myftm expects. A width that the
// tool does not know becomes 20 MHz.

/**
 * The number after -M for an 802.11n (vht false) or 802.11ac (vht true) test, as the tool of the
 * firmware-path suites expects it. 80 MHz has one number for both.
 */
std::string bandwidthMode(const std::string& bandwidth, bool vht);

/**
 * The option for an 802.11n or ac test, as the tool of the driver-path suites expects it; may be
 * several words. The 20 MHz option is logged as an error under `tag`, for 20 MHz as well.
 */
std::string bandwidthOption(const std::string& bandwidth, bool vht, const char* tag);

/**
 * The options for an 802.11ax test; several words. Only the exact texts "20", "40", "80" and "160"
 * are known: any other gives an empty text.
 */
std::string axBandwidthOptions(const std::string& bandwidth);

} // namespace vendor::korvan::bex::wifi::V1_0::implementation
