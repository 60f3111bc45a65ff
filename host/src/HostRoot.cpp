// Copyright 2026 The BEX Wi-Fi Authors
// SPDX-License-Identifier: Apache-2.0

#include "host/src/HostRoot.h"

#include <cstdlib>

namespace android::hardware::host {

std::string hostRoot() {
    const char* root = getenv("HIDL_HOST_ROOT");
    return root != nullptr ? root : "";
}

} // namespace android::hardware::host
