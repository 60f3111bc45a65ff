// Copyright 2026 The BEX Wi-Fi Authors
// SPDX-License-Identifier: Apache-2.0

#pragma once

#include <string>

namespace vendor::korvan::bex::wifi::client {

/** For the messages that send people to the service's log. */
constexpr char kWhichCommandFailed[] =
        "which command failed is in the service's log, tags that begin with \"wifi@1.0-\"";

/** How to see the phone's log; `rest` follows the command's name, such as " -b crash". */
inline std::string logcat(const std::string& rest = "") {
    return "logcat" + rest + " (a simulated phone: ./dev log)";
}

} // namespace vendor::korvan::bex::wifi::client
