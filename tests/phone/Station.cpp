// Copyright 2026 The BEX Wi-Fi Authors
// SPDX-License-Identifier: Apache-2.0

// A client that lives longer than a call. It reads one word a line: "get" finds the service, "call"
// calls it through the proxy that was found last. It prints what came of each, and "died" when it
// is told of the service's death.

#include <vendor/korvan/bex/wifi/1.0/IWifiService.h>

#include <iostream>
#include <string>

using ::android::sp;
using ::android::wp;
using ::android::hardware::hidl_death_recipient;
using ::android::hardware::Return;
using ::android::hidl::base::V1_0::IBase;
using ::vendor::korvan::bex::wifi::V1_0::IWifiService;

namespace {

struct Mourner : hidl_death_recipient {
    void serviceDied(uint64_t /*cookie*/, const wp<IBase>& /*who*/) override {
        std::cout << "died" << std::endl;
    }
};

std::string call(IWifiService& service) {
    const Return<bool> answer = service.isMimoSupport();
    if (answer.isOk()) return "answered";
    return answer.isDeadObject() ? "dead object" : "failed";
}

} // namespace

int main() {
    const sp<Mourner> mourner = new Mourner;
    sp<IWifiService> service;
    for (std::string word; std::getline(std::cin, word);) {
        if (word == "get") {
            service = IWifiService::getService();
            const bool found = service != nullptr && service->linkToDeath(mourner, 0).isOk();
            std::cout << (found ? "found" : "none") << std::endl;
        } else if (service != nullptr) {
            std::cout << call(*service) << std::endl;
        }
    }
}
