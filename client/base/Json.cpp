// Copyright 2026 The BEX Wi-Fi Authors
// SPDX-License-Identifier: Apache-2.0

#include "client/base/Json.h"

#include <cstdint>

namespace vendor::korvan::bex::wifi::client {
namespace {

constexpr char kHexDigits[] = "0123456789abcdef";
constexpr std::string_view kReplacement = "\xEF\xBF\xBD"; // U+FFFD

struct Decoded {
    uint32_t codePoint;
    /** The bytes it takes; 0 when the text does not begin with a well-formed sequence. */
    size_t length;
};

// UTF-8 as RFC 3629 has it: shortest forms only, no surrogates, nothing above U+10FFFF.
Decoded decode(std::string_view text) {
    const auto byte = [text](size_t i) { return static_cast<unsigned char>(text[i]); };
    const unsigned char lead = byte(0);
    if (lead < 0x80) return {lead, 1};

    const size_t length = lead >= 0xF0 ? 4 : lead >= 0xE0 ? 3 : 2;
    if (lead < 0xC2 || lead > 0xF4 || text.size() < length) return {0, 0};
    uint32_t codePoint = lead & (0xFF >> (length + 1));
    for (size_t i = 1; i < length; ++i) {
        if ((byte(i) & 0xC0) != 0x80) return {0, 0};
        codePoint = codePoint << 6 | (byte(i) & 0x3F);
    }
    const bool overlong =
            (length == 3 && codePoint < 0x800) || (length == 4 && codePoint < 0x10000);
    const bool surrogate = codePoint >= 0xD800 && codePoint <= 0xDFFF;
    if (overlong || surrogate || codePoint > 0x10FFFF) return {0, 0};
    return {codePoint, length};
}

void appendEscape(uint32_t codePoint, std::string* out) {
    switch (codePoint) {
        case '"':
            *out += "\\\"";
            return;
        case '\\':
            *out += "\\\\";
            return;
        case '\n':
            *out += "\\n";
            return;
        case '\r':
            *out += "\\r";
            return;
        case '\t':
            *out += "\\t";
            return;
    }
    *out += "\\u00";
    *out += kHexDigits[codePoint >> 4];
    *out += kHexDigits[codePoint & 0xF];
}

bool needsEscape(uint32_t codePoint) {
    return codePoint < 0x20 || codePoint == '"' || codePoint == '\\' ||
           (codePoint >= 0x7F && codePoint < 0xA0);
}

void appendSeparated(std::string_view item, std::string* list) {
    if (!list->empty()) *list += ',';
    *list += item;
}

} // namespace

std::string jsonString(std::string_view text, bool* exact) {
    bool wellFormed = true;
    std::string out = "\"";
    while (!text.empty()) {
        const Decoded next = decode(text);
        if (next.length == 0) {
            wellFormed = false;
            out += kReplacement;
            text.remove_prefix(1);
            continue;
        }
        if (needsEscape(next.codePoint)) {
            appendEscape(next.codePoint, &out);
        } else {
            out += text.substr(0, next.length);
        }
        text.remove_prefix(next.length);
    }
    if (exact != nullptr) *exact = wellFormed;
    return out + '"';
}

std::string hexDigits(std::string_view bytes) {
    std::string out;
    for (const unsigned char byte : bytes) {
        out += kHexDigits[byte >> 4];
        out += kHexDigits[byte & 0xF];
    }
    return out;
}

JsonObject& JsonObject::add(std::string_view name, std::string_view json) {
    appendSeparated(jsonString(name) + ":" + std::string(json), &mMembers);
    return *this;
}

JsonObject& JsonObject::addText(std::string_view name, std::string_view text) {
    return add(name, jsonString(text));
}

JsonArray& JsonArray::add(std::string_view json) {
    appendSeparated(json, &mElements);
    return *this;
}

} // namespace vendor::korvan::bex::wifi::client
