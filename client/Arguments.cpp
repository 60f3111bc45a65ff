// Copyright 2026 The BEX Wi-Fi Authors
// SPDX-License-Identifier: Apache-2.0

#include "client/Arguments.h"

#include <android-base/strings.h>

#include <cstdlib>
#include <cstring>
#include <string_view>

#include "client/base/Text.h"

namespace vendor::korvan::bex::wifi::client {
namespace {

using ::android::base::StartsWith;

constexpr char kTimeout[] = "--timeout";
constexpr char kTimeoutEquals[] = "--timeout=";
// Eleven days: longer than any call, and far from where the clock's arithmetic overflows.
constexpr double kLongestTimeout = 1e6;

// Digits with at most one point among them; no sign, no exponent.
bool isDecimal(std::string_view text) {
    return text.find_first_of("0123456789") != text.npos &&
           text.find_first_not_of("0123456789.") == text.npos && text.find('.') == text.rfind('.');
}

bool isOption(std::string_view argument) {
    return argument.size() > 1 && StartsWith(argument, '-') && !isDecimal(argument.substr(1));
}

bool readTimeout(const std::string& text, CommandLine* line, std::string* problem) {
    const double seconds = isDecimal(text) ? strtod(text.c_str(), nullptr) : 0;
    if (!(seconds > 0 && seconds <= kLongestTimeout)) {
        *problem = "--timeout takes a decimal number of seconds above 0 and up to 1000000, not " +
                   quote(text);
        return false;
    }
    line->timeout = std::chrono::duration_cast<std::chrono::nanoseconds>(
            std::chrono::duration<double>(seconds));
    return true;
}

} // namespace

bool readCommandLine(const std::vector<std::string>& arguments, CommandLine* line,
                     std::string* problem) {
    for (auto argument = arguments.begin(); argument != arguments.end(); ++argument) {
        if (*argument == "--") {
            line->words.insert(line->words.end(), argument + 1, arguments.end());
            return true;
        }
        if (!isOption(*argument)) {
            line->words.push_back(*argument);
        } else if (*argument == "--help" || *argument == "-h") {
            line->help = true;
        } else if (*argument == "--json") {
            line->json = true;
        } else if (*argument == "--version") {
            line->version = true;
        } else if (*argument == "--require-count") {
            line->requireCount = true;
        } else if (*argument == "--strict") {
            line->strict = true;
        } else if (StartsWith(*argument, kTimeoutEquals)) {
            if (!readTimeout(argument->substr(strlen(kTimeoutEquals)), line, problem)) return false;
        } else if (*argument == kTimeout) {
            if (++argument == arguments.end()) {
                *problem = "--timeout takes a number of seconds";
                return false;
            }
            if (!readTimeout(*argument, line, problem)) return false;
        } else {
            *problem = "unknown option " + quote(*argument) +
                       " (an argument that begins with \"-\" goes after \"--\")";
            return false;
        }
    }
    return true;
}

} // namespace vendor::korvan::bex::wifi::client
