// Copyright 2026 The BEX Wi-Fi Authors
// SPDX-License-Identifier: Apache-2.0

// Prints the command lines that a call would run, one a line, without running any. The phone is the
// file tree in HIDL_HOST_ROOT: its vendor/build.prop names the chip, and the suites find the module
// files that it holds.

#include <stdlib.h>

#include <filesystem>
#include <iostream>
#include <map>

#include "client/Commands.h"
#include "recorder/RecordedShell.h"
#include "service/WifiService.h"

namespace implementation = vendor::korvan::bex::wifi::V1_0::implementation;
using ::android::sp;
using ::vendor::korvan::bex::wifi::client::Answer;
using ::vendor::korvan::bex::wifi::client::readRequest;
using ::vendor::korvan::bex::wifi::client::Request;
using ::vendor::korvan::bex::wifi::V1_0::IWifiService;

namespace {

/** The names in each of the phone's folders of kernel modules, in the order of the folder. */
using Modules = std::map<std::string, std::vector<std::string>>;

Modules modulesOf(const std::string& root) {
    Modules modules;
    for (const char* folder : {"/system/lib/modules", "/vendor/lib/modules"}) {
        std::error_code absent;
        std::filesystem::recursive_directory_iterator files(root + folder, absent);
        for (const auto& file : files) {
            const std::string inside = file.path().parent_path().string().substr(root.size());
            modules[inside].push_back(file.path().filename());
        }
    }
    return modules;
}

void show(const Modules& modules, recorder::RecordedShell& shell) {
    for (const auto& [folder, names] : modules) {
        shell.directory(folder, names);
        for (const std::string& name : names) shell.readable(folder + "/" + name);
    }
}

} // namespace

int main(int argc, char** argv) {
    Request request;
    std::string problem = "usage: explain METHOD [ARGUMENT]...";
    if (argc < 2 || !readRequest({argv + 1, argv + argc}, &request, &problem)) {
        std::cerr << "explain: " << problem << '\n';
        return 2;
    }

    const char* root = getenv("HIDL_HOST_ROOT");
    const Modules modules = modulesOf(root == nullptr ? "" : root);
    // From here on the process sees the files that it shows, and no others.
    recorder::RecordedShell shell;
    show(modules, shell);
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
