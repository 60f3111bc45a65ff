// Copyright 2026 The BEX Wi-Fi Authors
// SPDX-License-Identifier: Apache-2.0

// FakeService as a process: prints "ready" once it is registered and answers 0; a call on channel
// 13 kills it, one on channel 14 prints "called" and never ends.

#include <hidl/HidlTransportSupport.h>
#include <unistd.h>

#include <iostream>

#include "FakeService.h"

int main() {
    const ::android::sp<vendor::korvan::bex::wifi::client::FakeService> service =
            new vendor::korvan::bex::wifi::client::FakeService;
    service->onCall = [&calls = service->calls] {
        if (calls.back().back() == "13") _exit(0);
        if (calls.back().back() != "14") return;
        std::cout << "called" << std::endl;
        pause();
    };
    ::android::hardware::configureRpcThreadpool(1, true);
    if (service->registerAsService() != ::android::OK) return 1;
    std::cout << "ready" << std::endl;
    ::android::hardware::joinRpcThreadpool();
}
