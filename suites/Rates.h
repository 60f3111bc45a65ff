// Copyright 2026 The BEX Wi-Fi Authors
// SPDX-License-Identifier: Apache-2.0

#pragma once

#include <array>
#include <string>
#include <string_view>

namespace vendor::korvan::bex::wifi::V1_0::implementation {

// How the test tools name a data rate. 802.11b/g/a rates come in Mbit/s, as exact texts: "5.5".

/** myftm's rate index of an 802.11b/g/a rate, in decimal; unknown rates give that of 1 Mbit/s. */
std::string bgRateIndex(const std::string& rate);

/** myftm's protocol index of an 802.11b/g/a rate: "4" for the 802.11b ones, "0" for all others. */
std::string abgProtocolIndex(const std::string& rate);

/** The driver's name of an 802.11b/g/a rate; unknown rates give that of 1 Mbit/s. */
std::string bgRateName(const std::string& rate);

/** myftm's rate index of an 802.11n, ac or ax rate, in decimal: MCS 0 is 15, MCS 1 is 16. */
std::string mcsRateIndex(const std::string& mcs);

/** The driver's names of 802.11n or ac rates, from MCS 0 on; empty where there is no rate. */
using RateNames = std::array<std::string_view, 10>;

extern const RateNames kHt20RateNames;
extern const RateNames kHt40RateNames;
extern const RateNames kVht20RateNames;
extern const RateNames kVht40RateNames;
extern const RateNames kVht80RateNames;

/** The name of the rate with the number `mcs`; empty when the list has no such rate. */
std::string mcsRateName(const RateNames& names, const std::string& mcs);

} // namespace vendor::korvan::bex::wifi::V1_0::implementation
