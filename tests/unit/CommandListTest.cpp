// Copyright 2026 The BEX Wi-Fi Authors
// SPDX-License-Identifier: Apache-2.0

#include "shell/CommandList.h"
#include "tests/unit/Expect.h"

namespace vendor::korvan::bex::wifi::V1_0::implementation {
namespace {

TEST(TokenLineTest, PutsABlankBehindEveryToken) {
    EXPECT_EQ("rmmod wlan.ko ", tokenLine({"rmmod", "wlan.ko"}));
    EXPECT_EQ("sleep 1.5 ", tokenLine({"sleep 1.5"}));
    EXPECT_EQ("", tokenLine({}));
}

TEST(TokenLineTest, KeepsTheBlankOfAnEmptyToken) {
    EXPECT_EQ("myftm  -a  ", tokenLine({"myftm", "", "-a", ""}));
}

TEST(TokenLineTest, TakesAnyNumberOfTokens) {
    const std::string line = tokenLine({"1",  "2",  "3",  "4",  "5",  "6",  "7",  "8",  "9",  "10",
                                        "11", "12", "13", "14", "15", "16", "17", "18", "19", "20",
                                        "21", "22", "23", "24", "25", "26", "27", "28", "29"});
    EXPECT_EQ("1 2 3 4 5 6 7 8 9 10 11 12 13 14 15 16 17 18 19 20 21 22 23 24 25 26 27 28 29 ",
              line);
}

class RunListTest : public ::testing::Test {
  protected:
    int run(const CommandList& list) {
        return runList(
                "method", "tag", list,
                [this](const std::string& cmd, CommandResult& result) {
                    EXPECT_EQ(error("tag", "method: " + cmd), mShell.log().back());
                    mLines.push_back(cmd);
                    result = {cmd.find("bad") == std::string::npos ? 0 : -1, "output of " + cmd};
                },
                mResult);
    }

    RecordedShell mShell;
    std::vector<std::string> mLines;
    CommandResult mResult;
};

TEST_F(RunListTest, LogsAndRunsEveryCommandInOrder) {
    EXPECT_EQ(0, run({{"a"}, {"b", "%s"}}));
    EXPECT_THAT(mLines, ElementsAre("a ", "b %s "));
    EXPECT_THAT(mShell.log(),
                ElementsAre(error("tag", "method: a "), error("tag", "method: b %s ")));
}

TEST_F(RunListTest, GoesOnBehindAFailureAndRemembersIt) {
    EXPECT_EQ(-1, run({{"bad"}, {"a"}, {"b"}}));
    EXPECT_THAT(mLines, ElementsAre("bad ", "a ", "b "));
}

TEST_F(RunListTest, ToleratesAFailureOfALineThatBeginsWithInsmod) {
    EXPECT_EQ(0, run({{"insmod", "bad"}, {"a"}}));
    EXPECT_EQ(0, run({{"insmod-bad"}}));
    EXPECT_EQ(-1, run({{"insmo", "bad"}}));
    EXPECT_EQ(-1, run({{"insmo-bad"}}));
    EXPECT_EQ(-1, run({{"nsmod", "bad"}}));
    EXPECT_EQ(-1, run({{"/vendor/bin/insmod", "bad"}}));
    EXPECT_EQ(-1, run({{" insmod", "bad"}}));
    EXPECT_EQ(-1, run({{"", "insmod", "bad"}}));
    EXPECT_EQ(-1, run({{"bad"}, {"insmod", "bad"}}));
}

TEST_F(RunListTest, LeavesTheLastResult) {
    EXPECT_EQ(-1, run({{"bad"}, {"a"}}));
    EXPECT_EQ(0, mResult.status);
    EXPECT_EQ("output of a ", mResult.output);
}

TEST_F(RunListTest, SucceedsWithNothingToDo) {
    EXPECT_EQ(0, run({}));
}

} // namespace
} // namespace vendor::korvan::bex::wifi::V1_0::implementation
