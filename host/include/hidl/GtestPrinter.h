// Copyright 2026 The BEX Wi-Fi Authors
// SPDX-License-Identifier: Apache-2.0

#pragma once

#include <gtest/gtest.h>

#include <cctype>
#include <string>

namespace android::hardware {

/**
 * Names a test that is run for each instance of an interface. GoogleTest needs such names unique
 * and of letters, digits and underscores: "0_default" for the first instance, "default".
 *
 *     INSTANTIATE_TEST_SUITE_P(PerInstance, WifiTest,
 *                              testing::ValuesIn(getAllHalInstanceNames(IWifiService::descriptor)),
 *                              PrintInstanceNameToString);
 */
static inline std::string PrintInstanceNameToString(
        const testing::TestParamInfo<std::string>& info) {
    std::string name = std::to_string(info.index) + "_" + info.param;
    for (char& letter : name) {
        if (isalnum(static_cast<unsigned char>(letter)) == 0) letter = '_';
    }
    return name;
}

} // namespace android::hardware
