// Copyright 2026 The BEX Wi-Fi Authors
// SPDX-License-Identifier: Apache-2.0

// Prints the command lines that calls would run, one a line, without running any:
//
//     explain                        no call: the methods with their arguments' names
//     explain METHOD [ARGUMENT]...   the lines of one call
//     explain --quoted METHOD [ARGUMENT]...
//                                    the same between quotes, since their blanks count
//     explain -                      those of each call on stdin, one a line, a tab between its
//                                    words; an empty line ends each answer
//     explain methods                no call: the interface's methods, as the client lists them
//     explain family                 no call: the name of the phone's chip family
//
// The phone is the file tree in HIDL_HOST_ROOT: its vendor/build.prop names the chip, and the
// suites find the module files that it holds.

#include <android-base/strings.h>
#include <stdlib.h>

#include <filesystem>
#include <iostream>
#include <map>

#include "client/Commands.h"
#include "client/Help.h"
#include "client/doctor/PhoneChecks.h"
#include "recorder/RecordedShell.h"
#include "service/WifiService.h"

namespace implementation = vendor::korvan::bex::wifi::V1_0::implementation;
using ::android::sp;
using ::android::base::Split;
using ::vendor::korvan::bex::wifi::ChipFamily;
using ::vendor::korvan::bex::wifi::client::Answer;
using ::vendor::korvan::bex::wifi::client::ArgumentKind;
using ::vendor::korvan::bex::wifi::client::Command;
using ::vendor::korvan::bex::wifi::client::commands;
using ::vendor::korvan::bex::wifi::client::listJson;
using ::vendor::korvan::bex::wifi::client::phoneFamily;
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

void listMethods() {
    std::cout << "A call is a method and its arguments:\n";
    for (const Command& command : commands()) {
        std::cout << "  " << command.name;
        for (const ArgumentKind* argument : command.arguments) std::cout << ' ' << argument->name;
        std::cout << '\n';
    }
}

enum class Outcome { failed, noCommand, explained };

/** Prints the lines of a call, each between two of `quote`, and forgets them. */
Outcome explain(IWifiService& service, const Request& request, recorder::RecordedShell& shell,
                const char* quote) {
    const Answer answer = request.command->call(service, request.values);
    const std::vector<std::string> lines = shell.lines();
    for (const std::string& line : lines) std::cout << quote << line << quote << '\n';
    shell.clear();
    if (!answer.delivered) return Outcome::failed;
    return lines.empty() ? Outcome::noCommand : Outcome::explained;
}

int explainEachLine(IWifiService& service, recorder::RecordedShell& shell) {
    std::string line;
    for (int number = 1; std::getline(std::cin, line); ++number) {
        Request request;
        std::string problem;
        if (!readRequest(Split(line, "\t"), &request, &problem)) {
            std::cerr << "explain: line " << number << ": " << problem << '\n';
            return 2;
        }
        if (explain(service, request, shell, "") == Outcome::failed) return 1;
        std::cout << '\n';
    }
    return 0;
}

} // namespace

int main(int argc, char** argv) {
    std::vector<std::string> words(argv + 1, argv + argc);
    const bool quoted = !words.empty() && words[0] == "--quoted";
    if (quoted) words.erase(words.begin());
    if (words.empty()) {
        listMethods();
        return 0;
    }
    if (words == std::vector<std::string>{"methods"}) {
        std::cout << listJson();
        return 0;
    }
    const bool family = words == std::vector<std::string>{"family"};
    const bool eachLine = words == std::vector<std::string>{"-"};
    Request request;
    std::string problem;
    if (!family && !eachLine && !readRequest(words, &request, &problem)) {
        std::cerr << "explain: " << problem << '\n';
        return 2;
    }

    const ChipFamily* known = phoneFamily();
    if (known == nullptr) {
        std::cerr << "explain: the property ro.hardware.wlan.vendor names no known vendor\n";
        return 1;
    }
    if (family) {
        std::cout << known->name << '\n';
        return 0;
    }

    const char* root = getenv("HIDL_HOST_ROOT");
    const Modules modules = modulesOf(root == nullptr ? "" : root);
    // From here on the process sees only the files that `shell` has.
    recorder::RecordedShell shell;
    show(modules, shell);
    const sp<IWifiService> service = new implementation::WifiService();
    if (eachLine) return explainEachLine(*service, shell);
    const Outcome outcome = explain(*service, request, shell, quoted ? "\"" : "");
    if (outcome == Outcome::noCommand) std::cerr << "explain: the call runs no command\n";
    return outcome == Outcome::failed ? 1 : 0;
}
