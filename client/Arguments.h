// Copyright 2026 The BEX Wi-Fi Authors
// SPDX-License-Identifier: Apache-2.0

#pragma once

#include <chrono>
#include <optional>
#include <string>
#include <vector>

// The command line: words, and options before, between and after them.

namespace vendor::korvan::bex::wifi::client {

/** A command line that has been read. */
struct CommandLine {
    bool help = false;
    bool version = false;
    bool json = false;
    bool requireCount = false;
    bool strict = false;
    std::optional<std::chrono::nanoseconds> timeout;
    /** The subcommand and its arguments, byte for byte. */
    std::vector<std::string> words;
};

/**
 * Reads the options --help (-h), --version, --json, --require-count, --strict, --timeout SECONDS
 * and --timeout=SECONDS. "--" ends the options. "-" and negative decimal numbers such as "-20" and
 * "-0.5" are words; anything else that begins with "-" is an option. SECONDS is a decimal number,
 * such as 2.5, above 0 and up to a million.
 *
 * @param arguments The command line without the program's name.
 * @param problem On failure one line (without a newline) that says what is wrong.
 */
bool readCommandLine(const std::vector<std::string>& arguments, CommandLine* line,
                     std::string* problem);

} // namespace vendor::korvan::bex::wifi::client
