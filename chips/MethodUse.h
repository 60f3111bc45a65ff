// Copyright 2026 The BEX Wi-Fi Authors
// SPDX-License-Identifier: Apache-2.0

#pragma once

#include <string_view>
#include <vector>

namespace vendor::korvan::bex::wifi {

/**
 * How some chip families use a method's arguments in a way that a caller would not expect.
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
    /** What else a caller would not expect, one sentence each. */
    std::vector<std::string_view> remarks;
};

/** All entries. A family that uses all of a method's arguments has none for it. */
const std::vector<MethodUse>& methodUses();

/** The entry for a method of a family; null when there is none. */
const MethodUse* findMethodUse(std::string_view family, std::string_view method);

} // namespace vendor::korvan::bex::wifi
