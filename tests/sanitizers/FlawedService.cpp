// Copyright 2026 The BEX Wi-Fi Authors
// SPDX-License-Identifier: Apache-2.0

// The service with a method that commits the flaw that its argument names: RunTxStop.

#include <hidl/HidlTransportSupport.h>

#include "service/WifiService.h"
#include "tests/sanitizers/Flaws.h"

namespace {

using ::android::sp;
using ::android::hardware::hidl_string;
using ::android::hardware::Return;
using ::vendor::korvan::bex::wifi::V1_0::implementation::WifiService;

struct FlawedService : WifiService {
    Return<int32_t> RunTxStop(const hidl_string& flaw) override {
        commitFlaw(flaw);
        return 0;
    }
};

} // namespace

int main() {
    const sp<FlawedService> service = new FlawedService;
    ::android::hardware::configureRpcThreadpool(2, true /* callerWillJoin */);
    if (service->registerAsService("default") != ::android::OK) return 1;
    ::android::hardware::joinRpcThreadpool();
}
