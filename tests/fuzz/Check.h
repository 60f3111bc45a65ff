// Copyright 2026 The BEX Wi-Fi Authors
// SPDX-License-Identifier: Apache-2.0

#pragma once

#include <stdio.h>
#include <stdlib.h>

#include <string>

namespace fuzz {

/** The text with every byte that does not print, and the quote's own marks, as \xNN. */
inline std::string quoted(const std::string& text) {
    std::string result = "\"";
    for (const char byte : text) {
        char escaped[5];
        const bool plain = byte >= ' ' && byte <= '~' && byte != '"' && byte != '\\';
        snprintf(escaped, sizeof(escaped), plain ? "%c" : "\\x%02x",
                 static_cast<unsigned char>(byte));
        result += escaped;
    }
    return result + '"';
}

/**
 * Ends the process when something that must hold does not: the fuzzer keeps the input that led
 * there.
 *
 *     check(status == 0 || status == -1, "a result is 0 or -1", std::to_string(status));
 *
 * @param rule What must hold, in words.
 * @param found What there is instead.
 */
inline void check(bool holds, const char* rule, const std::string& found) {
    if (holds) return;
    fprintf(stderr, "fuzz: broken: %s; found %s\n", rule, found.c_str());
    abort();
}

/** The same for two texts that must be equal. */
inline void checkEqual(const std::string& expected, const std::string& found, const char* rule) {
    if (expected != found) check(false, rule, quoted(found) + ", expected " + quoted(expected));
}

} // namespace fuzz
