// Copyright 2026 The BEX Wi-Fi Authors
// SPDX-License-Identifier: Apache-2.0

#include "suites/VendorTestSuit.h"

#include <android/log.h>

#include <algorithm>
#include <utility>

#include "shell/Command.h"

namespace vendor::korvan::bex::wifi::V1_0::implementation {

namespace {

constexpr const char* kLogTag = "wifi@1.0-VendorTestSuit";

bool endsWith(const std::string& text, const std::string& end) {
    return text.size() >= end.size() &&
           text.compare(text.size() - end.size(), end.size(), end) == 0;
}

} // namespace

VendorTestSuit::VendorTestSuit() {
    __android_log_print(ANDROID_LOG_DEBUG, kLogTag, "function at: %s", "VendorTestSuit");
}

VendorTestSuit::~VendorTestSuit() {
    __android_log_print(ANDROID_LOG_DEBUG, kLogTag, "function at: %s", "~VendorTestSuit");
}

void VendorTestSuit::runCmdCom(const std::string& cmd, CmdRunResult& result) {
    result = {};
    if (std::optional<std::string> output = runCommand(cmd, kLogTag)) {
        result = {0, std::move(*output)};
    }
}

// The first occurrence is the one that ends first. So the text is read up to each place where an
// occurrence may end. If one ends there, it is removed, and its replacement is read next.
std::string VendorTestSuit::replaceSubString(const std::string& src, const std::string& from,
                                             const std::string& to) {
    const std::string backwards(to.rbegin(), to.rend());
    std::string done;         // has been read and holds no occurrence
    std::string replacements; // to be read before the rest of src, backwards
    size_t next = 0;          // the rest of src
    done.reserve(src.size());
    while (true) {
        if (endsWith(done, from)) {
            done.resize(done.size() - from.size());
            replacements += backwards;
        } else if (!replacements.empty()) {
            done += replacements.back();
            replacements.pop_back();
        } else if (next < src.size()) {
            const size_t end = std::min(src.find(from.back(), next), src.size() - 1) + 1;
            done.append(src, next, end - next);
            next = end;
        } else {
            return done;
        }
    }
}

std::vector<std::string> VendorTestSuit::splitString(const std::string& str,
                                                     const std::string& sep) {
    std::vector<std::string> pieces;
    size_t start = 0;
    for (size_t pos = str.find(sep); pos != std::string::npos; pos = str.find(sep, start)) {
        pieces.emplace_back(str, start, pos - start);
        start = pos + sep.size();
    }
    if (start != str.size()) pieces.emplace_back(str, start);
    return pieces;
}

} // namespace vendor::korvan::bex::wifi::V1_0::implementation
