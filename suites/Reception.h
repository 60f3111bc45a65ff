// Copyright 2026 The BEX Wi-Fi Authors
// SPDX-License-Identifier: Apache-2.0

#pragma once

#include <string>

#include "suites/VendorTestSuit.h"

namespace vendor::korvan::bex::wifi::V1_0::implementation {

// What a reception tells the client. Every text that a tool prints goes through the suite's own
// string tools.

/** What the start of a reception says: "ok" for status 0, else "failure". */
std::string startWord(int status);

/**
 * The packet count in what a counter command printed: all of it but the newlines and the label that
 * stands in front of the number.
 */
std::string countWithout(VendorTestSuit& suit, const std::string& label, const std::string& output);

/**
 * The number of good packets in what myftm printed, newlines already turned into blanks: a field of
 * the text that begins with the last "goodPackets", counted from 0 and split at each single blank.
 * Without that field, which is logged as an error, that whole text; empty without the label.
 *
 *     goodPackets(suit, "wifi@1.0-example", 1, "goodPackets 12 badPackets 3 ") gives "12".
 *
 * @param tag The log tag of the caller, for the count and the error.
 */
std::string goodPackets(VendorTestSuit& suit, const char* tag, size_t field,
                        const std::string& output);

/** What the end of a reception says: "Rx: " and the good packets in what myftm printed. */
std::string receivedText(VendorTestSuit& suit, const char* tag, size_t field,
                         const std::string& output);

} // namespace vendor::korvan::bex::wifi::V1_0::implementation
