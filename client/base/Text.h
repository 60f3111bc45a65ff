// Copyright 2026 The BEX Wi-Fi Authors
// SPDX-License-Identifier: Apache-2.0

#pragma once

#include <string>
#include <string_view>

// Text for people: in lines that fit, and with what was given in quotes.

namespace vendor::korvan::bex::wifi::client {

/**
 * The text in lines of at most 80 columns where blanks allow it.
 *
 * @param indent The number of blanks in front of each line but the first.
 * @return It ends in a newline.
 */
std::string wrapped(std::string text, size_t indent);

/**
 * What the user or the service gave, for a message: as jsonString has it. Of a text with more than
 * 40 bytes only the begin, and then its length: "abc"... (100000 bytes).
 */
std::string quote(std::string_view text);

} // namespace vendor::korvan::bex::wifi::client
