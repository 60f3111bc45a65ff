// Copyright 2026 The BEX Wi-Fi Authors
// SPDX-License-Identifier: Apache-2.0

#ifndef TESTS_CLIENT_MATCHES_H
#define TESTS_CLIENT_MATCHES_H

#include <regex.h>

#include <string>
#include <vector>

namespace vendor::korvan::bex::wifi::client {

/**
 * Every part of a text that fits an extended regular expression, see regex(7). The compiler needs
 * seconds for each file that uses std::regex.
 */
inline std::vector<std::string> matches(const std::string& text, const std::string& pattern) {
    std::vector<std::string> found;
    regex_t expression;
    if (regcomp(&expression, pattern.c_str(), REG_EXTENDED) != 0) return found;
    regmatch_t match;
    for (const char* rest = text.c_str(); regexec(&expression, rest, 1, &match, 0) == 0;
         rest += match.rm_eo) {
        found.emplace_back(rest + match.rm_so, rest + match.rm_eo);
    }
    regfree(&expression);
    return found;
}

} // namespace vendor::korvan::bex::wifi::client

#endif // TESTS_CLIENT_MATCHES_H
