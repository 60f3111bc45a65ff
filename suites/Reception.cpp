// Copyright 2026 The BEX Wi-Fi Authors
// SPDX-License-Identifier: Apache-2.0

#include "suites/Reception.h"

#include <android/log.h>

#include <stdexcept>

namespace vendor::korvan::bex::wifi::V1_0::implementation {

namespace {

/** The text from a place up to the end of a field, or all the rest. */
std::string upToField(const std::string& text, size_t start, size_t field) {
    size_t end = start;
    for (size_t i = 0; i <= field; ++i) {
        end = text.find(' ', end);
        if (end == std::string::npos) return text.substr(start);
        ++end;
    }
    return text.substr(start, end - start);
}

} // namespace

std::string startWord(int status) {
    return status == 0 ? "ok" : "failure";
}

std::string countWithout(VendorTestSuit& suit, const std::string& label,
                         const std::string& output) {
    return suit.replaceSubString(suit.replaceSubString(output, "\n", ""), label, "");
}

std::string goodPackets(VendorTestSuit& suit, const char* tag, size_t field,
                        const std::string& output) {
    const size_t label = output.rfind("goodPackets");
    // Not all fields are split off: there may be millions after the one that is wanted.
    std::string count = label == std::string::npos ? "" : upToField(output, label, field);
    try {
        count = suit.splitString(count, " ").at(field);
    } catch (const std::out_of_range& missing) {
        __android_log_print(ANDROID_LOG_ERROR, tag, "%s", missing.what());
    }
    __android_log_print(ANDROID_LOG_DEBUG, tag, "received packets: %s", count.c_str());
    return count;
}

std::string receivedText(VendorTestSuit& suit, const char* tag, size_t field,
                         const std::string& output) {
    return "Rx: " + goodPackets(suit, tag, field, suit.replaceSubString(output, "\n", " "));
}

} // namespace vendor::korvan::bex::wifi::V1_0::implementation
