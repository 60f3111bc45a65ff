// Copyright 2026 The BEX Wi-Fi Authors
// SPDX-License-Identifier: Apache-2.0

#pragma once

#include <string_view>
#include <vector>

namespace vendor::korvan::bex::wifi {

/**
 * What some chip families make of a method's arguments where a caller would not expect it.
 *
 *     if (const MethodUse* use = findMethodUse("qca", "RunTxBGStart")) {
 *         for (std::string_view name : use->ignored) std::cout << name << " is ignored\n";
 *     }
 */
struct MethodUse {
    /** The interface's method. */
    std::string_view method;
    /** The families that share the entry, by ChipFamily::name. */
    std::vector<std::string_view> families;
    /** The arguments whose values change nothing, by the interface's names and in its order. */
    std::vector<std::string_view> ignored;
    /** What else surprises, a sentence each. */
    std::vector<std::string_view> remarks;
};

/** All there is to tell. A family that uses all that it is given has no entry for the method. */
const std::vector<MethodUse>& methodUses();

/** What there is to tell of one family's method; null when there is nothing. */
const MethodUse* findMethodUse(std::string_view family, std::string_view method);

} // namespace vendor::korvan::bex::wifi
