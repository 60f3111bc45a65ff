// Copyright 2026 The BEX Wi-Fi Authors
// SPDX-License-Identifier: Apache-2.0

#include <hidl/HidlTransportSupport.h>

#include "service/WifiService.h"

using ::android::OK;
using ::android::sp;
using ::android::hardware::configureRpcThreadpool;
using ::android::hardware::joinRpcThreadpool;
using ::vendor::korvan::bex::wifi::V1_0::IWifiService;
using ::vendor::korvan::bex::wifi::V1_0::implementation::WifiService;

int main() {
    sp<IWifiService> service = new WifiService();
    configureRpcThreadpool(2, true /* callerWillJoin */);
    if (service->registerAsService("default") == OK) joinRpcThreadpool();
    return 1;
}
