// Copyright 2026 The BEX Wi-Fi Authors
// SPDX-License-Identifier: Apache-2.0

#include "suites/VendorTestSuit.h"

#include <android/log.h>

#include <utility>

#include "shell/Command.h"

namespace vendor::korvan::bex::wifi::V1_0::implementation {

namespace {

constexpr const char* kLogTag = "wifi@1.0-VendorTestSuit";

/** What replaceSubString says, to the letter: each step searches and moves the whole text. */
std::string replaceStepByStep(const std::string& src, const std::string& from,
                              const std::string& to) {
    std::string result = src;
    for (size_t pos = result.find(from); pos != std::string::npos; pos = result.find(from)) {
        result.replace(pos, from.size(), to);
    }
    return result;
}

bool endsWith(const std::string& text, const std::string& end) {
    return text.size() >= end.size() &&
           text.compare(text.size() - end.size(), end.size(), end) == 0;
}

/**
 * The same in time that grows with the text and the number of steps. The first occurrence is the
 * one that ends first, so a step is: read on until what has been read ends with `from`, take that
 * off, and put `to` back in front of what is to be read.
 */
std::string replaceInOnePass(const std::string& src, const std::string& from,
                             const std::string& to) {
    size_t found = src.find(from);
    if (found == std::string::npos) return src;
    const std::string backwards(to.rbegin(), to.rend());
    std::string done;  // has been read, and holds no occurrence
    std::string again; // replacements that are to be read, backwards
    size_t next = 0;   // what is to be read of `src` behind them
    size_t origin = 0; // from here to `next`, `src` stands at the end of `done`
    done.reserve(src.size());
    for (; found != std::string::npos; found = src.find(from, origin)) {
        if (found < next) {
            done.resize(done.size() - (next - found));
        } else {
            done.append(src, next, found - next);
        }
        again = backwards;
        next = origin = found + from.size();
        // Around a replacement an occurrence may begin in one text and end in another.
        while (!again.empty() || (next < src.size() && next - origin < from.size() - 1)) {
            if (again.empty()) {
                done += src[next++];
            } else {
                done += again.back();
                again.pop_back();
            }
            if (endsWith(done, from)) {
                done.resize(done.size() - from.size());
                again += backwards;
                origin = next;
            }
        }
    }
    return done.append(src, next);
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

std::string VendorTestSuit::replaceSubString(const std::string& src, const std::string& from,
                                             const std::string& to) {
    // What does not end shall not eat up the memory either.
    if (to.find(from) != std::string::npos) return replaceStepByStep(src, from, to);
    return replaceInOnePass(src, from, to);
}

std::vector<std::string> VendorTestSuit::splitString(const std::string& str,
                                                     const std::string& sep) {
    std::vector<std::string> pieces;
    pieces.reserve(4); // what a packet count is picked from
    size_t start = 0;
    for (size_t pos = str.find(sep); pos != std::string::npos; pos = str.find(sep, start)) {
        pieces.emplace_back(str, start, pos - start);
        start = pos + sep.size();
    }
    if (start != str.size()) pieces.emplace_back(str, start);
    return pieces;
}

} // namespace vendor::korvan::bex::wifi::V1_0::implementation
