// Copyright 2026 The BEX Wi-Fi Authors
// SPDX-License-Identifier: Apache-2.0

#pragma once

#include <string>

#include "sniffer/SnifferTool.h"
#include "suites/VendorTestSuit.h"

namespace vendor::korvan::bex::wifi::V1_0::implementation {

/** What drives a chip. Each function makes a new object, which the caller deletes. */
struct ChipChoice {
    VendorTestSuit* (*makeSuit)();
    SnifferTool* (*makeSniffer)();
};

/**
 * Chooses what drives a phone's chip, by its family (chips/ChipFamily.h).
 *
 * @return Null when the vendor is unknown.
 */
const ChipChoice* chooseChip(const std::string& vendor, const std::string& chip);

} // namespace vendor::korvan::bex::wifi::V1_0::implementation
