// Copyright 2026 The BEX Wi-Fi Authors
// SPDX-License-Identifier: Apache-2.0

#pragma once

#include "sniffer/SnifferTool.h"

namespace vendor::korvan::bex::wifi::V1_0::implementation {

/**
 * Monitor mode on chips of the WCN685x family and the WCN6750, whose driver sets the channel
 * itself. On their phones the capture services are started and stopped directly.
 */
class Wcn685xSnifferTool : public SnifferTool {
  public:
    /** See setMonitorChannel for the forms of `channel` and `bandwidth`. */
    int snifferStart(const std::string& channel, const std::string& bandwidth) override;
    int snifferStop() override;
};

} // namespace vendor::korvan::bex::wifi::V1_0::implementation
