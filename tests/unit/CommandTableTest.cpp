// Copyright 2026 The BEX Wi-Fi Authors
// SPDX-License-Identifier: Apache-2.0

#include "shell/CommandTable.h"
#include "tests/unit/Expect.h"

namespace vendor::korvan::bex::wifi::V1_0::implementation {
namespace {

TEST(CommandLineTest, PutsABlankAfterEveryWord) {
    for (const auto line : {lineUpToEmptyWord, lineOfEveryWord}) {
        EXPECT_EQ("ifconfig wlan0 down ", line({"ifconfig", "wlan0", "down"}));
        EXPECT_EQ("sleep 1.5 ", line({"sleep 1.5"}));
        EXPECT_EQ("", line({}));
    }
}

TEST(CommandLineTest, NeitherQuotesNorSplitsWords) {
    for (const auto line : {lineUpToEmptyWord, lineOfEveryWord}) {
        EXPECT_EQ("echo -n \"/a b\" > f  | x ", line({"echo", "-n", "\"/a b\"", ">", "f", " | x"}));
    }
}

TEST(CommandLineTest, EndsAtTheFirstEmptyWordOrKeepsItsBlank) {
    EXPECT_EQ("wl rate -r ", lineUpToEmptyWord({"wl", "rate", "-r", "", "-b", "20"}));
    EXPECT_EQ("", lineUpToEmptyWord({"", "wl"}));
    EXPECT_EQ("myftm  -a  ", lineOfEveryWord({"myftm", "", "-a", ""}));
    EXPECT_EQ(" wl ", lineOfEveryWord({"", "wl"}));
}

TEST(CommandLineTest, TakesAnyNumberOfWords) {
    for (const auto line : {lineUpToEmptyWord, lineOfEveryWord}) {
        EXPECT_EQ(200u, line(Command(100, "w")).size());
    }
}

TEST(CommandLineTest, KeepsNulBytes) {
    for (const auto line : {lineUpToEmptyWord, lineOfEveryWord}) {
        EXPECT_EQ(std::string("a\0b ", 4), line({std::string("a\0b", 3)}));
    }
}

/** Runs nothing: a line with "bad" in it fails. */
struct Runner {
    struct CmdRunResult {
        int status;
        std::string output;
    };

    void runCmdCom(const std::string& cmd, CmdRunResult& result) {
        lines.push_back(cmd);
        lastLogs.push_back(shell.log().empty() ? "" : shell.log().back().text);
        result = {cmd.find("bad") == std::string::npos ? 0 : -1, "output of " + cmd};
    }

    RecordedShell shell;
    std::vector<std::string> lines;
    /** What stood in the log last when each line ran. */
    std::vector<std::string> lastLogs;
};

int runPlainly(Runner& runner, const CommandTable& table, const AfterRow& after) {
    return runTable(runner, table, after);
}

int runLogged(Runner& runner, const CommandTable& table, const AfterRow& after) {
    return runLoggedTable(runner, "tag", "method", table, after);
}

/** What both ways of running a table have in common. */
class RunTableTest : public ::testing::TestWithParam<decltype(&runPlainly)> {
  protected:
    int run(const CommandTable& table, const AfterRow& after = {}) {
        mRunner.lines.clear();
        return GetParam()(mRunner, table, after);
    }

    Runner mRunner;
};

TEST_P(RunTableTest, RunsEveryRowInOrder) {
    EXPECT_EQ(0, run({{"a"}, {"b", "c"}}));
    EXPECT_THAT(mRunner.lines, ElementsAre("a ", "b c "));
}

TEST_P(RunTableTest, GoesOnAfterAFailureAndRemembersIt) {
    EXPECT_EQ(-1, run({{"bad"}, {"a"}, {"b"}}));
    EXPECT_THAT(mRunner.lines, ElementsAre("bad ", "a ", "b "));
}

TEST_P(RunTableTest, HandsOnTheOutputOfOneRowAsSoonAsItHasRun) {
    for (size_t row = 1; row <= 3; ++row) {
        std::vector<std::string> taken;
        EXPECT_EQ(-1, run({{"a"}, {"bad"}, {"c"}}, {row, [&](const std::string& output) {
                                                        EXPECT_EQ(row, mRunner.lines.size());
                                                        taken.push_back(output);
                                                    }}));
        EXPECT_THAT(taken, ElementsAre("output of " + mRunner.lines[row - 1]));
    }
}

TEST_P(RunTableTest, SucceedsWithNothingToDo) {
    EXPECT_EQ(0, run({}));
    EXPECT_THAT(mRunner.lines, IsEmpty());
}

INSTANTIATE_TEST_SUITE_P(Both, RunTableTest, ::testing::Values(&runPlainly, &runLogged));

TEST(RunPlainTableTest, EndsALineAtItsFirstEmptyWordAndLogsNothing) {
    Runner runner;
    EXPECT_EQ(-1, runTable(runner, {{"a", "", "b"}, {"insmod", "bad"}}));
    EXPECT_THAT(runner.lines, ElementsAre("a ", "insmod bad "));
    EXPECT_THAT(runner.shell.log(), IsEmpty());
}

TEST(RunLoggedTableTest, LogsEachLineWithAllWordsBeforeItRuns) {
    Runner runner;
    EXPECT_EQ(0, runLoggedTable(runner, "tag", "method", {{"a", "", "b"}, {"%s"}}));
    EXPECT_THAT(runner.lines, ElementsAre("a  b ", "%s "));
    EXPECT_THAT(runner.lastLogs, ElementsAre("method: a  b ", "method: %s "));
    EXPECT_THAT(runner.shell.log(),
                ElementsAre(error("tag", "method: a  b "), error("tag", "method: %s ")));
    EXPECT_EQ("method: %s", runner.shell.log().back().format);
}

TEST(RunLoggedTableTest, ToleratesAFailureOfALineThatBeginsWithInsmod) {
    Runner runner;
    auto run = [&](const CommandTable& table) {
        return runLoggedTable(runner, "tag", "method", table);
    };
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

} // namespace
} // namespace vendor::korvan::bex::wifi::V1_0::implementation
