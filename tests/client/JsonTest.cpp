// Copyright 2026 The BEX Wi-Fi Authors
// SPDX-License-Identifier: Apache-2.0

#include <gtest/gtest.h>

#include "client/base/Json.h"

namespace vendor::korvan::bex::wifi::client {
namespace {

using namespace std::string_view_literals;

const std::string kReplaced = "\xEF\xBF\xBD";

TEST(JsonTest, PlainAndForeignTextStaysAsItIs) {
    EXPECT_EQ(jsonString(""), "\"\"");
    EXPECT_EQ(jsonString("Rx: 12/'x'"), "\"Rx: 12/'x'\"");
    EXPECT_EQ(jsonString("\u00A0\u00E9\u0800\u20AC\uD7FF\uE000\U00010000\U0010FFFF"),
              "\"\u00A0\u00E9\u0800\u20AC\uD7FF\uE000\U00010000\U0010FFFF\"");
}

TEST(JsonTest, EscapesQuotesBackslashesAndControlCharacters) {
    EXPECT_EQ(jsonString("a\"b\\c"), R"("a\"b\\c")");
    EXPECT_EQ(jsonString("\n\r\t"), R"("\n\r\t")");
    EXPECT_EQ(jsonString("\0\x01\b\f\x1B\x1F\x7F"sv),
              R"("\u0000\u0001\u0008\u000c\u001b\u001f\u007f")");
    EXPECT_EQ(jsonString("\u0080\u009F"), R"("\u0080\u009f")");
}

TEST(JsonTest, ReplacesEveryByteThatIsNotUtf8) {
    const std::pair<std::string_view, int> cases[] = {
            {"\xFF", 1},             // no such byte
            {"\x80", 1},             // a continuation without a start
            {"\xC3", 1},             // cut at the end of the text
            {"\xE2\x82", 2},         // the same, of three
            {"\xC0\xAF", 2},         // overlong in two,
            {"\xE0\x9F\xBF", 3},     // in three
            {"\xF0\x8F\xBF\xBF", 4}, // and in four bytes
            {"\xED\xA0\x80", 3},     // a surrogate
            {"\xED\xBF\xBF", 3},     // the last one
            {"\xF4\x90\x80\x80", 4}, // above U+10FFFF
            {"\xF5\x80\x80\x80", 4}, // a start that no character has
    };
    for (const auto& [bytes, replacements] : cases) {
        SCOPED_TRACE(hexDigits(bytes));
        std::string expected = "\"a";
        for (int i = 0; i < replacements; ++i) expected += kReplaced;
        bool exact = true;
        EXPECT_EQ(jsonString("a" + std::string(bytes), &exact), expected + "\"");
        EXPECT_FALSE(exact);
    }
}

TEST(JsonTest, NeverReadsPastTheTextsEnd) {
    const std::string_view euro = "\u20AC"; // Three bytes, of which the text has two.
    EXPECT_EQ(jsonString(euro.substr(0, 2)), "\"" + kReplaced + kReplaced + "\"");
}

TEST(JsonTest, GoesOnAfterABadByte) {
    EXPECT_EQ(jsonString("\xC3(\xE2\x82\xE2\x82\xAC"),
              "\"" + kReplaced + "(" + kReplaced + kReplaced + "\u20AC\"");
}

TEST(JsonTest, IsExactForAllThatIsUtf8) {
    bool exact = false;
    jsonString("\0\u20AC\uFFFD"sv, &exact);
    EXPECT_TRUE(exact);
}

TEST(JsonTest, HexDigitsShowEachByte) {
    EXPECT_EQ(hexDigits(""), "");
    EXPECT_EQ(hexDigits("\0\x09\xA0\xFF"sv), "0009a0ff");
}

TEST(JsonTest, ObjectsAndArraysSeparateTheirItems) {
    EXPECT_EQ(JsonObject().str(), "{}");
    EXPECT_EQ(JsonObject().add("a", "1").addText("b\"", "x\n").str(), R"({"a":1,"b\"":"x\n"})");
    EXPECT_EQ(JsonArray().str(), "[]");
    EXPECT_EQ(JsonArray().add("1").add("{}").str(), "[1,{}]");
}

} // namespace
} // namespace vendor::korvan::bex::wifi::client
