// Copyright 2026 The BEX Wi-Fi Authors
// SPDX-License-Identifier: Apache-2.0

#pragma once

#include <string>

#include "shell/CommandTable.h"

namespace vendor::korvan::bex::wifi::V1_0::implementation {

/**
 * The command that sets the channel of monitor mode by the driver's private commands (`iwpriv`), as
 * newer Qualcomm drivers expect it.
 *
 * @param channel The IEEE 802.11 channel number in decimal.
 * @param bandwidth The channel width in MHz: exactly "20", "40" or "80"; any other counts as 160.
 */
Command setMonitorChannel(const std::string& channel, const std::string& bandwidth);

} // namespace vendor::korvan::bex::wifi::V1_0::implementation
