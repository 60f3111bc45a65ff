// Copyright 2026 The BEX Wi-Fi Authors
// SPDX-License-Identifier: Apache-2.0

#include <gtest/gtest.h>

#include "client/base/Text.h"

namespace vendor::korvan::bex::wifi::client {
namespace {

TEST(TextTest, WrapsAtBlanksAndIndentsTheLaterLines) {
    const std::string word(40, 'a');
    EXPECT_EQ(wrapped("short", 4), "short\n");
    EXPECT_EQ(wrapped(word + " " + std::string(39, 'b'), 2),
              word + " " + std::string(39, 'b') + "\n");
    EXPECT_EQ(wrapped(word + " " + std::string(40, 'b'), 2),
              word + "\n  " + std::string(40, 'b') + "\n");
    EXPECT_EQ(wrapped(std::string(100, 'c'), 2), std::string(100, 'c') + "\n");
}

TEST(TextTest, QuotesAShortTextWhole) {
    EXPECT_EQ(quote(""), "\"\"");
    EXPECT_EQ(quote("a\n\xFF"), "\"a\\n\uFFFD\"");
    EXPECT_EQ(quote(std::string(40, '6')), "\"" + std::string(40, '6') + "\"");
}

TEST(TextTest, QuotesTheBeginOfALongText) {
    EXPECT_EQ(quote(std::string(100'000, '6')),
              "\"" + std::string(40, '6') + "\"... (100000 bytes)");
    EXPECT_EQ(quote(std::string(41, '\x80')).rfind("\"\uFFFD", 0), 0u);
}

TEST(TextTest, TearsNoLetterApart) {
    for (const std::string letter : {"\u00E9", "\u20AC", "\U0001F600"}) {
        for (size_t before = 40 - letter.size() + 1; before < 40; ++before) {
            const std::string begin(before, 'a');
            EXPECT_EQ(quote(begin + letter + "b"),
                      "\"" + begin + "\"... (" + std::to_string(before + letter.size() + 1) +
                              " bytes)");
        }
    }
}

} // namespace
} // namespace vendor::korvan::bex::wifi::client
