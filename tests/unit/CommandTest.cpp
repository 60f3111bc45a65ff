// Copyright 2026 The BEX Wi-Fi Authors
// SPDX-License-Identifier: Apache-2.0

#include <signal.h>

#include "shell/Command.h"
#include "tests/unit/Expect.h"

namespace vendor::korvan::bex::wifi::V1_0::implementation {
namespace {

class CommandTest : public ::testing::Test {
  protected:
    ~CommandTest() override { EXPECT_TRUE(mShell.allClosed()); }

    std::optional<std::string> run(const std::string& cmd) { return runCommand(cmd, "tag"); }

    RecordedShell mShell;
};

TEST_F(CommandTest, HandsTheLineToTheShellAsItStands) {
    run("wl \"a  b\" | grep '$x' > f ");
    EXPECT_THAT(mShell.lines(), ElementsAre("wl \"a  b\" | grep '$x' > f "));
}

TEST_F(CommandTest, KeepsTheOutputOfASuccess) {
    mShell.answer("wl", {"one\ntwo\n"});
    EXPECT_EQ("one\ntwo\n", run("wl ver "));
    EXPECT_THAT(mShell.log(), ElementsAre(debug("tag", "one\n"), debug("tag", "two\n"),
                                          debug("tag", "cmd: \"wl ver \" successful execution")));
}

TEST_F(CommandTest, SucceedsWithoutOutput) {
    EXPECT_EQ("", run("true "));
    EXPECT_THAT(mShell.log(), ElementsAre(debug("tag", "cmd: \"true \" successful execution")));
}

TEST_F(CommandTest, DropsTheOutputOfAFailure) {
    mShell.answer("wl", failing("text\n"));
    EXPECT_EQ(std::nullopt, run("wl ver "));
    EXPECT_THAT(mShell.log(), ElementsAre(debug("tag", "text\n"),
                                          error("tag", "cmd: \"wl ver \" unsuccessful execution")));
}

TEST_F(CommandTest, TakesDeathBySignalAndAnErrorOfPcloseForAFailure) {
    for (int status : {SIGKILL, -1}) {
        mShell.answer("wl", {"text\n", status});
        EXPECT_EQ(std::nullopt, run("wl ")) << status;
    }
}

TEST_F(CommandTest, SaysNothingWhenTheShellCannotBeStarted) {
    mShell.answer("wl", {"", 0, false});
    EXPECT_EQ(std::nullopt, run("wl "));
    EXPECT_THAT(mShell.log(), IsEmpty());
}

TEST_F(CommandTest, LogsALongLineInPiecesAndKeepsItWhole) {
    const std::string line = std::string(300, 'x') + "\n";
    mShell.answer("wl", {line});
    EXPECT_EQ(line, run("wl "));
    EXPECT_THAT(mShell.log(), ElementsAre(debug("tag", std::string(255, 'x')),
                                          debug("tag", std::string(45, 'x') + "\n"),
                                          debug("tag", "cmd: \"wl \" successful execution")));
}

TEST_F(CommandTest, KeepsALastLineWithoutNewline) {
    mShell.answer("wl", {"one\ntwo"});
    EXPECT_EQ("one\ntwo", run("wl "));
}

TEST_F(CommandTest, SkipsPiecesThatBeginWithNul) {
    mShell.answer("wl", {std::string("\0lost\na\0lost too\nb\n", 19)});
    EXPECT_EQ("ab\n", run("wl "));
    EXPECT_THAT(mShell.log(), ElementsAre(debug("tag", "a"), debug("tag", "b\n"),
                                          debug("tag", "cmd: \"wl \" successful execution")));
}

TEST_F(CommandTest, DoesNotTakeOutputForAFormat) {
    mShell.answer("wl", {"100%s %n\n"});
    EXPECT_EQ("100%s %n\n", run("wl %d "));
    EXPECT_THAT(mShell.log(), ElementsAre(debug("tag", "100%s %n\n"),
                                          debug("tag", "cmd: \"wl %d \" successful execution")));
}

} // namespace
} // namespace vendor::korvan::bex::wifi::V1_0::implementation
