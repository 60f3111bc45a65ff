// Copyright 2026 The BEX Wi-Fi Authors
// SPDX-License-Identifier: Apache-2.0

#pragma once

#include <optional>
#include <string>
#include <vector>

namespace fuzz {

// What the string tools and the packet counts promise, written a second time from their headers:
// byte by byte, with no thought of speed.

/** The output that runCommand keeps of what a command printed. */
std::string keptOutput(const std::string& printed);

/** VendorTestSuit::replaceSubString. Nothing when that has no end, or none soon. */
std::optional<std::string> replaced(const std::string& text, const std::string& from,
                                    const std::string& to);

/** VendorTestSuit::splitString, for a separator that is not empty. */
std::vector<std::string> pieces(const std::string& text, const std::string& separator);

/** countWithout. */
std::optional<std::string> countWithoutLabel(const std::string& label, const std::string& output);

/** goodPackets. */
std::string goodPacketsField(size_t field, const std::string& output);

/** receivedText. */
std::optional<std::string> received(size_t field, const std::string& output);

} // namespace fuzz
