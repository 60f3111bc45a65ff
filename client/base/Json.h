// Copyright 2026 The BEX Wi-Fi Authors
// SPDX-License-Identifier: Apache-2.0

#pragma once

#include <string>
#include <string_view>

// JSON on one line, valid whatever bytes go in.

namespace vendor::korvan::bex::wifi::client {

/**
 * Text as a JSON string, with its quotes. Control characters (those of Unicode's category Cc) are
 * escaped; every byte that belongs to no well-formed UTF-8 sequence becomes U+FFFD.
 *
 * @param exact If given, set to whether the string stands for exactly these bytes.
 */
std::string jsonString(std::string_view text, bool* exact = nullptr);

/** The bytes as lower-case hexadecimal digits, two for each. */
std::string hexDigits(std::string_view bytes);

/**
 * A JSON object, member by member: `JsonObject().add("a", "1").addText("b", "x").str()` is
 * `{"a":1,"b":"x"}`.
 */
class JsonObject {
  public:
    /** Adds a member whose value is already JSON. */
    JsonObject& add(std::string_view name, std::string_view json);
    /** Adds a member whose value is text. */
    JsonObject& addText(std::string_view name, std::string_view text);
    bool empty() const { return mMembers.empty(); }
    std::string str() const { return "{" + mMembers + "}"; }

  private:
    std::string mMembers;
};

/** A JSON array, element by element. */
class JsonArray {
  public:
    /** Adds an element that is already JSON. */
    JsonArray& add(std::string_view json);
    std::string str() const { return "[" + mElements + "]"; }

  private:
    std::string mElements;
};

} // namespace vendor::korvan::bex::wifi::client
