// Copyright 2026 The BEX Wi-Fi Authors
// SPDX-License-Identifier: Apache-2.0

#include "suites/VendorTestSuit.h"
#include "tests/unit/Expect.h"

namespace vendor::korvan::bex::wifi::V1_0::implementation {
namespace {

constexpr const char* kTag = "wifi@1.0-VendorTestSuit";

/** A suite without tests of its own: what is left is the base. */
class BareSuit : public VendorTestSuit {
  public:
    using S = const std::string&;
    int RunTxBGStart(S, S, S, S) override { return 0; }
    int RunTxNStart(S, S, S, S, bool, S) override { return 0; }
    int RunTxAxStart(S, S, S, S, S, S) override { return 0; }
    int RunTxStStart(S, S, S) override { return 0; }
    int RunTxStStop(S) override { return 0; }
    int RunTxStop(S) override { return 0; }
    int RunRxApJoinHoc(S, S) override { return 0; }
    int RunRxBgStart(S, S, S, std::string&) override { return 0; }
    int RunRxNStart(std::string, S, S, bool, S, std::string&) override { return 0; }
    int RunRxAxStart(S, S, S, S, std::string&) override { return 0; }
    int RunRxStop(S, std::string&) override { return 0; }
};

TEST(VendorTestSuitTest, LogsItsLife) {
    RecordedShell shell;
    { const BareSuit suit; }
    EXPECT_THAT(shell.log(), ElementsAre(debug(kTag, "function at: VendorTestSuit"),
                                         debug(kTag, "function at: ~VendorTestSuit")));
}

TEST(VendorTestSuitTest, RunsCommandsUnderItsTag) {
    RecordedShell shell;
    BareSuit suit;
    shell.clear();
    shell.answer("wl", {"1\n"});
    VendorTestSuit::CmdRunResult result;
    EXPECT_EQ(-1, result.status);
    suit.runCmdCom("wl ver", result);
    EXPECT_EQ(0, result.status);
    EXPECT_EQ("1\n", result.output);
    EXPECT_THAT(shell.lines(), ElementsAre("wl ver"));
    EXPECT_THAT(shell.log(), ElementsAre(debug(kTag, "1\n"),
                                         debug(kTag, "cmd: \"wl ver\" successful execution")));
}

TEST(VendorTestSuitTest, ReplacesEveryOccurrence) {
    BareSuit suit;
    EXPECT_EQ("a b c", suit.replaceSubString("a-b-c", "-", " "));
    EXPECT_EQ("abc", suit.replaceSubString("abc", "x", "y"));
    EXPECT_EQ("ac", suit.replaceSubString("abbc", "b", ""));
    EXPECT_EQ("", suit.replaceSubString("", "b", "c"));
    EXPECT_EQ("abc", suit.replaceSubString("abc", "abcd", ""));
}

TEST(VendorTestSuitTest, ReplacesWhatAReplacementBringsTogether) {
    BareSuit suit;
    EXPECT_EQ("", suit.replaceSubString("aabb", "ab", ""));
    EXPECT_EQ("b", suit.replaceSubString("aaaab", "ab", "b"));
}

TEST(VendorTestSuitTest, SplitsAtEverySeparator) {
    BareSuit suit;
    EXPECT_THAT(suit.splitString("a b ", " "), ElementsAre("a", "b"));
    EXPECT_THAT(suit.splitString(" a", " "), ElementsAre("", "a"));
    EXPECT_THAT(suit.splitString("a  b", " "), ElementsAre("a", "", "b"));
    EXPECT_THAT(suit.splitString("a", " "), ElementsAre("a"));
    EXPECT_THAT(suit.splitString("a::b:", "::"), ElementsAre("a", "b:"));
    EXPECT_THAT(suit.splitString(" ", " "), ElementsAre(""));
    EXPECT_THAT(suit.splitString("", " "), IsEmpty());
}

} // namespace
} // namespace vendor::korvan::bex::wifi::V1_0::implementation
