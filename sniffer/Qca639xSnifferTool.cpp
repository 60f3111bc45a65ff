// Copyright 2026 The BEX Wi-Fi Authors
// SPDX-License-Identifier: Apache-2.0

#include "sniffer/Qca639xSnifferTool.h"

#include "sniffer/MonitorChannel.h"

namespace vendor::korvan::bex::wifi::V1_0::implementation {

int Qca639xSnifferTool::snifferStart(const std::string& channel, const std::string& bandwidth) {
    return enterMonitorMode(kByProperties, setMonitorChannel(channel, bandwidth));
}

} // namespace vendor::korvan::bex::wifi::V1_0::implementation
