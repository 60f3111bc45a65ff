// Copyright 2026 The BEX Wi-Fi Authors
// SPDX-License-Identifier: Apache-2.0

#pragma once

#include <string>

#include "chips/ChipFamily.h"
#include "chips/MethodUse.h"
#include "client/Commands.h"

namespace vendor::korvan::bex::wifi::client {

/**
 * What the help of a method adds on a phone: the chip family, the arguments that it ignores, and
 * what else a caller would not expect (chips/MethodUse.h). Ends in a newline.
 *
 * @param family Null for a phone that names no known vendor; then the text is empty.
 */
std::string familyHelp(const ChipFamily* family, const Command& command);

/** The lines on what a family makes of a method, at most 80 columns each. */
std::string useHelp(const MethodUse& use);

} // namespace vendor::korvan::bex::wifi::client
