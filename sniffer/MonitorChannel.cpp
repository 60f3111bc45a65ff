// Copyright 2026 The BEX Wi-Fi Authors
// SPDX-License-Identifier: Apache-2.0

#include "sniffer/MonitorChannel.h"

namespace vendor::korvan::bex::wifi::V1_0::implementation {

namespace {

const char* bandwidthCode(const std::string& bandwidth) {
    if (bandwidth == "20") return "0";
    if (bandwidth == "40") return "1";
    if (bandwidth == "80") return "2";
    return "3";
}

} // namespace

Command setMonitorChannel(const std::string& channel, const std::string& bandwidth) {
    return {"/vendor/bin/iwpriv wlan0 setMonChan", channel, bandwidthCode(bandwidth)};
}

} // namespace vendor::korvan::bex::wifi::V1_0::implementation
