// Copyright 2026 The BEX Wi-Fi Authors
// SPDX-License-Identifier: Apache-2.0

#pragma once

#include <optional>
#include <string>

#include "chips/ChipFamily.h"
#include "client/doctor/Check.h"

// What the service's command lines need: each function makes the checks of one kind. A family is
// missing when the phone names no known vendor.

namespace vendor::korvan::bex::wifi::client {

/** The family that the phone's properties name. */
std::optional<ChipFamily> phoneFamily();

Checks checkProperties(std::optional<ChipFamily> family);

/**
 * The shell and the tools.
 *
 * @param root As in PhoneView.
 */
Checks checkTools(const std::string& root, std::optional<ChipFamily> family);

/** Module files, firmware images and the driver's parameters. */
Checks checkDriver(const std::string& root, std::optional<ChipFamily> family);

/** Whether the log shows which commands the service runs. */
Check checkCommandLog();

} // namespace vendor::korvan::bex::wifi::client
