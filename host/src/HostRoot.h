// Copyright 2026 The BEX Wi-Fi Authors
// SPDX-License-Identifier: Apache-2.0

#pragma once

#include <string>

namespace android::hardware::host {

/**
 * The folder that takes the place of the phone's "/": the environment's HIDL_HOST_ROOT, usually
 * empty.
 */
std::string hostRoot();

/** The folder of the registered instances' sockets. */
inline std::string socketFolder() {
    return hostRoot() + "/dev/socket/hidl";
}

} // namespace android::hardware::host
