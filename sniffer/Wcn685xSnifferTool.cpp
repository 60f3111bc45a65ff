// Copyright 2026 The BEX Wi-Fi Authors
// SPDX-License-Identifier: Apache-2.0

#include "sniffer/Wcn685xSnifferTool.h"

#include "sniffer/MonitorChannel.h"

namespace vendor::korvan::bex::wifi::V1_0::implementation {

namespace {

constexpr CaptureServices kDirectly = {
        /* stopTcpdump  */ "/vendor/bin/stop vendor.tcpdump",
        /* startSniffer */ "/vendor/bin/start vendor.sniffer",
        /* stopSniffer  */ "/vendor/bin/stop vendor.sniffer",
        /* startTcpdump */ "/vendor/bin/start vendor.tcpdump",
};

} // namespace

int Wcn685xSnifferTool::snifferStart(const std::string& channel, const std::string& bandwidth) {
    return enterMonitorMode(kDirectly, setMonitorChannel(channel, bandwidth));
}

int Wcn685xSnifferTool::snifferStop() {
    return leaveMonitorMode(kDirectly);
}

} // namespace vendor::korvan::bex::wifi::V1_0::implementation
