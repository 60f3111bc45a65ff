// Copyright 2026 The BEX Wi-Fi Authors
// SPDX-License-Identifier: Apache-2.0

#include <optional>

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

TEST(VendorTestSuitTest, OverwritesTheResultOfAnotherCommand) {
    RecordedShell shell;
    BareSuit suit;
    for (const RecordedShell::Answer& answer : {failing("text\n"), {"", 0, false}}) {
        shell.answer("wl", answer);
        VendorTestSuit::CmdRunResult result = {0, "left over"};
        suit.runCmdCom("wl ver", result);
        EXPECT_EQ(-1, result.status);
        EXPECT_EQ("", result.output);
    }
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

/** replaceSubString as its contract words it; nothing when that takes too many steps to end. */
std::optional<std::string> replacedStepByStep(std::string text, const std::string& from,
                                              const std::string& to) {
    for (int steps = 0; steps < 100; ++steps) {
        const size_t pos = text.find(from);
        if (pos == std::string::npos) return text;
        text.replace(pos, from.size(), to);
    }
    return std::nullopt;
}

/** Every text of 'a' and 'b' with a length within the limits. */
std::vector<std::string> textsOfLength(size_t least, size_t most) {
    std::vector<std::string> texts;
    for (size_t length = least; length <= most; ++length) {
        for (unsigned bits = 0; bits < 1u << length; ++bits) {
            std::string text;
            for (size_t i = 0; i < length; ++i) text += (bits >> i & 1) != 0 ? 'b' : 'a';
            texts.push_back(text);
        }
    }
    return texts;
}

TEST(VendorTestSuitTest, ReplacesAsIfStepByStep) {
    BareSuit suit;
    const std::vector<std::string> replacements = textsOfLength(0, 3);
    size_t compared = 0;
    for (const std::string& src : textsOfLength(0, 7)) {
        for (const std::string& from : textsOfLength(1, 3)) {
            for (const std::string& to : replacements) {
                const auto expected = replacedStepByStep(src, from, to);
                if (!expected) continue;
                ASSERT_EQ(*expected, suit.replaceSubString(src, from, to))
                        << src << ": " << from << " by " << to;
                ++compared;
            }
        }
    }
    // Most pairs end.
    EXPECT_GT(compared, 35'000u);
}

// A tool that floods must not keep the thread for minutes: work that grows with the square of the
// output would outlast the time that a test has.
TEST(VendorTestSuitTest, ReplacesInMegabytesOfOutput) {
    BareSuit suit;
    const std::string lines(4'000'000, '\n');
    EXPECT_EQ("", suit.replaceSubString(lines, "\n", ""));
    EXPECT_EQ(std::string(lines.size(), ' '), suit.replaceSubString(lines, "\n", " "));
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
