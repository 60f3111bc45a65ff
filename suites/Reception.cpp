// Copyright 2026 The BEX Wi-Fi Authors
// SPDX-License-Identifier: Apache-2.0

#include "suites/Reception.h"

#include <android/log.h>

#include <algorithm>
#include <stdexcept>
#include <string_view>

namespace vendor::korvan::bex::wifi::V1_0::implementation {

namespace {

/** The same as rfind(), which looks at every place where this skips to the next first letter. */
size_t findLast(std::string_view text, std::string_view word) {
    size_t last = std::string_view::npos;
    for (size_t pos = text.find(word); pos != std::string_view::npos;
         pos = text.find(word, pos + 1)) {
        last = pos;
    }
    return last;
}

/**
 * From the last "goodPackets" on up to the end of a field, counted from 0, or of the text; empty
 * without the label. The fields behind, of which there may be millions, are nobody's.
 */
template <typename Separates>
std::string_view statistics(std::string_view output, const Separates& separates, size_t field) {
    const size_t label = findLast(output, "goodPackets");
    if (label == std::string_view::npos) return "";
    const std::string_view text = output.substr(label);
    const char* end = text.begin();
    for (size_t fields = 0; fields <= field; ++fields) {
        end = std::find_if(end, text.end(), separates);
        if (end == text.end()) return text;
        ++end;
    }
    return text.substr(0, static_cast<size_t>(end - text.begin()));
}

bool isBlank(char c) {
    return c == ' ';
}

bool isBlankOrNewline(char c) {
    return c == ' ' || c == '\n';
}

/** The field of what statistics() found, or all of that without the field. */
std::string countIn(VendorTestSuit& suit, const char* tag, size_t field, std::string count) {
    try {
        count = suit.splitString(count, " ").at(field);
    } catch (const std::out_of_range& missing) {
        __android_log_print(ANDROID_LOG_ERROR, tag, "%s", missing.what());
    }
    __android_log_print(ANDROID_LOG_DEBUG, tag, "received packets: %s", count.c_str());
    return count;
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
    return countIn(suit, tag, field, std::string(statistics(output, isBlank, field)));
}

std::string receivedText(VendorTestSuit& suit, const char* tag, size_t field,
                         const std::string& output) {
    const std::string text(statistics(output, isBlankOrNewline, field));
    return "Rx: " + countIn(suit, tag, field, suit.replaceSubString(text, "\n", " "));
}

} // namespace vendor::korvan::bex::wifi::V1_0::implementation
