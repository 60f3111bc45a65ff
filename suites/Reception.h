// Copyright 2026 The BEX Wi-Fi Authors
// SPDX-License-Identifier: Apache-2.0

#pragma once

#include <string>

#include "suites/VendorTestSuit.h"

namespace vendor::korvan::bex::wifi::V1_0::implementation {

// The texts that a reception returns to the client, made with the suite's string tools.

/** The text after the start of a reception: "ok" for status 0, else "failure". */
std::string startWord(int status);

/**
 * The packet count in what a counter command printed: all of it without the newlines and without
 * the label before the number.
 */
std::string countWithout(VendorTestSuit& suit, const std::string& label, const std::string& output);

/**
 * The number of good packets in what myftm printed, after its newlines became blanks. The text from
 * the last "goodPackets" on is split at each blank; the number is one of its fields, counted from
 * 0. When there are fewer fields, an error is logged and the result is that whole text. Without the
 * label the result is empty.
 *
 *     goodPackets(suit, "wifi@1.0-example", 1, "goodPackets 12 badPackets 3 ") gives "12".
 *
 * @param tag The log tag of the caller, for the count and the error.
 */
std::string goodPackets(VendorTestSuit& suit, const char* tag, size_t field,
                        const std::string& output);

/** The text after the end of a reception: "Rx: " and the good packets in what myftm printed. */
std::string receivedText(VendorTestSuit& suit, const char* tag, size_t field,
                         const std::string& output);

} // namespace vendor::korvan::bex::wifi::V1_0::implementation
