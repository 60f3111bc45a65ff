// Copyright 2026 The BEX Wi-Fi Authors
// SPDX-License-Identifier: Apache-2.0

#include <gmock/gmock.h>
#include <gtest/gtest.h>

#include "client/Arguments.h"

namespace vendor::korvan::bex::wifi::client {
namespace {

using ::testing::ElementsAre;
using namespace std::chrono_literals;

CommandLine read(const std::vector<std::string>& arguments) {
    CommandLine line;
    std::string problem;
    EXPECT_TRUE(readCommandLine(arguments, &line, &problem)) << problem;
    return line;
}

std::string problemOf(const std::vector<std::string>& arguments) {
    CommandLine line;
    std::string problem;
    return readCommandLine(arguments, &line, &problem) ? "none" : problem;
}

TEST(ArgumentsTest, WithoutOptionsAllAreWords) {
    const CommandLine line = read({"RunTxStop", "", "6"});
    EXPECT_THAT(line.words, ElementsAre("RunTxStop", "", "6"));
    EXPECT_FALSE(line.help);
    EXPECT_FALSE(line.json);
    EXPECT_FALSE(line.timeout);
}

TEST(ArgumentsTest, OptionsStandAnywhere) {
    for (const auto& arguments :
         std::vector<std::vector<std::string>>{{"--json", "--timeout", "2.5", "--help", "RunTxStop",
                                                "6"},
                                               {"RunTxStop", "--timeout=2.5", "--help", "6",
                                                "--json"}}) {
        const CommandLine line = read(arguments);
        EXPECT_THAT(line.words, ElementsAre("RunTxStop", "6"));
        EXPECT_TRUE(line.help);
        EXPECT_TRUE(line.json);
        EXPECT_EQ(line.timeout, 2500ms);
    }
}

TEST(ArgumentsTest, NegativeNumbersAndADashAreWords) {
    EXPECT_THAT(read({"m", "-20", "-0.5", "-.5", "-"}).words,
                ElementsAre("m", "-20", "-0.5", "-.5", "-"));
}

TEST(ArgumentsTest, TwoDashesEndTheOptions) {
    const CommandLine line = read({"m", "--", "--json", "-x", "--", "--help"});
    EXPECT_THAT(line.words, ElementsAre("m", "--json", "-x", "--", "--help"));
    EXPECT_FALSE(line.json);
    EXPECT_FALSE(line.help);
}

TEST(ArgumentsTest, UnknownOptionsAreNamedOnOneLine) {
    for (const std::string option :
         {"--jsonn", "-j", "-x", "--timeouts", "-1-2", "-1.2.3", "-.", "-0x5", "--help=1"}) {
        EXPECT_EQ(problemOf({"m", option}),
                  "unknown option \"" + option +
                          "\" (an argument that begins with \"-\" goes after \"--\")");
    }
    EXPECT_THAT(problemOf({"-\n"}), ::testing::HasSubstr("\"-\\n\""));
}

TEST(ArgumentsTest, ATimeoutIsADecimalNumberOfSeconds) {
    EXPECT_EQ(read({"--timeout", "5"}).timeout, 5s);
    EXPECT_EQ(read({"--timeout", ".25"}).timeout, 250ms);
    EXPECT_EQ(read({"--timeout", "1."}).timeout, 1s);
    EXPECT_EQ(read({"--timeout=1000000"}).timeout, 1000000s);
    EXPECT_EQ(read({"--timeout", "1", "--timeout", "2"}).timeout, 2s);

    for (const std::string text : {"", "0", "0.0", "-1", "+1", "1s", " 1", "1e3", "0x1", "nan",
                                   "inf", ".", "1.2.3", "1000000.1", "1,5", "--json"}) {
        const std::string problem =
                "--timeout takes a decimal number of seconds above 0 and up to 1000000, not \"" +
                text + "\"";
        EXPECT_EQ(problemOf({"--timeout", text}), problem);
        EXPECT_EQ(problemOf({"--timeout=" + text}), problem);
    }
    EXPECT_NE(problemOf({"--timeout", std::string(5000, '9')}), "none");
    EXPECT_EQ(problemOf({"m", "--timeout"}), "--timeout takes a number of seconds");
}

} // namespace
} // namespace vendor::korvan::bex::wifi::client
