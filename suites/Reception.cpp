// Copyright 2026 The BEX Wi-Fi Authors
// SPDX-License-Identifier: Apache-2.0

#include "suites/Reception.h"

#include <android/log.h>

#include <stdexcept>
#include <string_view>

namespace vendor::korvan::bex::wifi::V1_0::implementation {

namespace {

/** The text up to the blank that ends a field, counted from 0; all of it without that blank. */
std::string_view upToField(std::string_view text, size_t field) {
    size_t end = 0;
    for (size_t fields = 0; fields <= field; ++fields) {
        end = text.find(' ', end);
        if (end == std::string_view::npos) return text;
        ++end;
    }
    return text.substr(0, end);
}

/** The same as rfind(), which looks at every place where this skips to the next first letter. */
size_t findLast(std::string_view text, std::string_view word) {
    size_t last = std::string_view::npos;
    for (size_t pos = text.find(word); pos != std::string_view::npos;
         pos = text.find(word, pos + 1)) {
        last = pos;
    }
    return last;
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
    std::string count;
    const size_t label = findLast(output, "goodPackets");
    // The fields behind, of which there may be millions, need no splitting.
    if (label != std::string::npos) {
        count = upToField(std::string_view(output).substr(label), field);
    }
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
