// Copyright 2026 The BEX Wi-Fi Authors
// SPDX-License-Identifier: Apache-2.0

#include "shell/CommandTable.h"
#include "tests/unit/Expect.h"

namespace vendor::korvan::bex::wifi::V1_0::implementation {
namespace {

TEST(CommandLineTest, PutsABlankBehindEveryWord) {
    EXPECT_EQ("ifconfig wlan0 down ", commandLine({"ifconfig", "wlan0", "down"}));
}

TEST(CommandLineTest, NeitherQuotesNorSplitsWords) {
    EXPECT_EQ("echo -n \"/a b\" > f  | x ",
              commandLine({"echo", "-n", "\"/a b\"", ">", "f", " | x"}));
}

TEST(CommandLineTest, EndsAtTheFirstEmptyWord) {
    EXPECT_EQ("wl rate -r ", commandLine({"wl", "rate", "-r", "", "-b", "20"}));
    EXPECT_EQ("", commandLine({"", "wl"}));
}

TEST(CommandLineTest, UsesAllSlots) {
    Row row;
    row.fill("w");
    EXPECT_EQ(2 * row.size(), commandLine(row).size());
}

TEST(CommandLineTest, KeepsNulBytes) {
    EXPECT_EQ(std::string("a\0b ", 4), commandLine({std::string_view("a\0b", 3)}));
}

class RunTableTest : public ::testing::Test {
  protected:
    int run(const Table& table) {
        return runTable(
                table,
                [this](const std::string& cmd, CommandResult& result) {
                    mLines.push_back(cmd);
                    result = {cmd == "bad " ? -1 : 0, "output of " + cmd};
                },
                mResult);
    }

    std::vector<std::string> mLines;
    CommandResult mResult;
};

TEST_F(RunTableTest, RunsEveryRowInOrder) {
    EXPECT_EQ(0, run({{"a"}, {"b", "c"}}));
    EXPECT_THAT(mLines, ElementsAre("a ", "b c "));
}

TEST_F(RunTableTest, GoesOnBehindAFailureAndRemembersIt) {
    EXPECT_EQ(-1, run({{"bad"}, {"a"}, {"b"}}));
    EXPECT_THAT(mLines, ElementsAre("bad ", "a ", "b "));
}

TEST_F(RunTableTest, LeavesTheLastResult) {
    EXPECT_EQ(-1, run({{"bad"}, {"a"}}));
    EXPECT_EQ(0, mResult.status);
    EXPECT_EQ("output of a ", mResult.output);
}

TEST_F(RunTableTest, SucceedsWithNothingToDo) {
    EXPECT_EQ(0, run({}));
}

} // namespace
} // namespace vendor::korvan::bex::wifi::V1_0::implementation
