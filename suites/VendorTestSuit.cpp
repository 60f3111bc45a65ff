// Copyright 2026 The BEX Wi-Fi Authors
// SPDX-License-Identifier: Apache-2.0

#include "suites/VendorTestSuit.h"

#include <android/log.h>

namespace vendor::korvan::bex::wifi::V1_0::implementation {

namespace {
constexpr const char* kLogTag = "wifi@1.0-VendorTestSuit";
} // namespace

VendorTestSuit::VendorTestSuit() {
    __android_log_print(ANDROID_LOG_DEBUG, kLogTag, "function at: %s", "VendorTestSuit");
}

VendorTestSuit::~VendorTestSuit() {
    __android_log_print(ANDROID_LOG_DEBUG, kLogTag, "function at: %s", "~VendorTestSuit");
}

void VendorTestSuit::runCmdCom(const std::string& cmd, CmdRunResult& result) {
    runCommand(cmd, kLogTag, result);
}

std::string VendorTestSuit::replaceSubString(const std::string& src, const std::string& from,
                                             const std::string& to) {
    std::string result = src;
    for (size_t pos = result.find(from); pos != std::string::npos; pos = result.find(from)) {
        result.replace(pos, from.size(), to);
    }
    return result;
}

std::vector<std::string> VendorTestSuit::splitString(const std::string& str,
                                                     const std::string& sep) {
    std::vector<std::string> pieces;
    size_t start = 0;
    for (size_t pos = str.find(sep); pos != std::string::npos; pos = str.find(sep, start)) {
        pieces.push_back(str.substr(start, pos - start));
        start = pos + sep.size();
    }
    if (start != str.size()) pieces.push_back(str.substr(start));
    return pieces;
}

int VendorTestSuit::runTable(const Table& table, CmdRunResult& result) {
    return implementation::runTable(
            table,
            [this](const std::string& cmd, CmdRunResult& cmdResult) { runCmdCom(cmd, cmdResult); },
            result);
}

int VendorTestSuit::runTable(const Table& table) {
    CmdRunResult result;
    return runTable(table, result);
}

} // namespace vendor::korvan::bex::wifi::V1_0::implementation
