// Copyright 2026 The BEX Wi-Fi Authors
// SPDX-License-Identifier: Apache-2.0

#include "client/base/Text.h"

#include "client/base/Json.h"

namespace vendor::korvan::bex::wifi::client {
namespace {

constexpr size_t kColumns = 80;
constexpr size_t kLongestQuote = 40;

/** Whether the byte continues a UTF-8 sequence. */
bool continues(char byte) {
    return (static_cast<unsigned char>(byte) & 0xC0) == 0x80;
}

} // namespace

std::string wrapped(std::string text, size_t indent) {
    size_t begin = 0; // of the last line
    while (text.size() - begin > kColumns) {
        const size_t blank = text.rfind(' ', begin + kColumns);
        if (blank == std::string::npos || blank <= begin + indent) break;
        text.replace(blank, 1, "\n" + std::string(indent, ' '));
        begin = blank + 1;
    }
    return text + "\n";
}

std::string quote(std::string_view text) {
    if (text.size() <= kLongestQuote) return jsonString(text);
    size_t end = kLongestQuote;
    // No sequence has more than three such bytes; others are no text that could be torn apart.
    while (end > kLongestQuote - 3 && continues(text[end])) --end;
    return jsonString(text.substr(0, end)) + "... (" + std::to_string(text.size()) + " bytes)";
}

} // namespace vendor::korvan::bex::wifi::client
