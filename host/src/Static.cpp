// Copyright 2026 The BEX Wi-Fi Authors
// SPDX-License-Identifier: Apache-2.0

#include <hidl/Static.h>

namespace android::hardware::details {

// Never destroyed: generated destructors and pool threads use these until the process ends.

BnConstructorMap& getBnConstructorMap() {
    static auto& map = *new BnConstructorMap;
    return map;
}

BsConstructorMap& getBsConstructorMap() {
    static auto& map = *new BsConstructorMap;
    return map;
}

BnMap* const gBnMap = new BnMap;
ServicePrioMap* const gServicePrioMap = new ServicePrioMap;
ServiceSidMap* const gServiceSidMap = new ServiceSidMap;

} // namespace android::hardware::details
