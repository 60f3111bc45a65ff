// Copyright 2026 The BEX Wi-Fi Authors
// SPDX-License-Identifier: Apache-2.0

#pragma once

#include <string>
#include <vector>

#include "chips/ChipFamily.h"
#include "client/doctor/Check.h"

// What the service's command lines need: each function makes the checks of one kind. A family is
// null when the phone names no known vendor.

namespace vendor::korvan::bex::wifi::client {

/** The tags under which the service logs its command lines, at the priority DEBUG. */
extern const std::vector<std::string> kCommandTags;

/** The family that the phone's properties name. */
const ChipFamily* phoneFamily();

Checks checkProperties(const ChipFamily* family);

/**
 * The shell and the tools.
 *
 * @param root As in PhoneView.
 */
Checks checkTools(const std::string& root, const ChipFamily* family);

/** Module files, firmware images and the driver's parameters. */
Checks checkDriver(const std::string& root, const ChipFamily* family);

/** Whether the log shows which commands the service runs. */
Check checkCommandLog();

} // namespace vendor::korvan::bex::wifi::client
