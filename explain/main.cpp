// Copyright 2026 The BEX Wi-Fi Authors
// SPDX-License-Identifier: Apache-2.0

// Prints the command lines that a call would run, one a line, without running any. The chip is the
// one that the properties name: on a host, <HIDL_HOST_ROOT>/vendor/build.prop.

#include <iostream>

#include "client/Commands.h"
#include "recorder/RecordedShell.h"
#include "service/WifiService.h"

namespace implementation = vendor::korvan::bex::wifi::V1_0::implementation;
using ::android::sp;
using ::vendor::korvan::bex::wifi::client::Answer;
using ::vendor::korvan::bex::wifi::client::readRequest;
using ::vendor::korvan::bex::wifi::client::Request;
using ::vendor::korvan::bex::wifi::V1_0::IWifiService;

int main(int argc, char** argv) {
    Request request;
    std::string problem = "usage: explain METHOD [ARGUMENT]...";
    if (argc < 2 || !readRequest({argv + 1, argv + argc}, &request, &problem)) {
        std::cerr << "explain: " << problem << '\n';
        return 2;
    }

    const recorder::RecordedShell shell;
    const sp<IWifiService> service = new implementation::WifiService();
    if (implementation::vendorTestSuit == nullptr) {
        std::cerr << "explain: the property ro.hardware.wlan.vendor names no known vendor\n";
        return 1;
    }
    const Answer answer = request.command->call(*service, request.values);
    for (const std::string& line : shell.lines()) std::cout << line << '\n';
    if (shell.lines().empty()) std::cerr << "explain: the call runs no command\n";
    return answer.delivered ? 0 : 1;
}
