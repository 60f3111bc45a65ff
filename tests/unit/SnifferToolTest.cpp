// Copyright 2026 The BEX Wi-Fi Authors
// SPDX-License-Identifier: Apache-2.0

#include "sniffer/SnifferTool.h"
#include "suites/VendorTestSuit.h"
#include "tests/unit/Expect.h"

namespace vendor::korvan::bex::wifi::V1_0::implementation {
namespace {

constexpr const char* kTag = "wifi@1.0-SnifferTool";

class SnifferToolTest : public ::testing::Test {
  protected:
    SnifferToolTest() { mShell.clear(); }

    RecordedShell mShell;
    SnifferTool mTool;
};

TEST_F(SnifferToolTest, LogsItsLife) {
    { const SnifferTool tool; }
    EXPECT_THAT(mShell.log(),
                ElementsAre(debug(kTag, "SnifferTool "), debug(kTag, "~SnifferTool ")));
}

// clang-format off

TEST_F(SnifferToolTest, SnifferStart) {
    EXPECT_EQ(0, mTool.snifferStart("6", "20"));
    EXPECT_THAT(mShell.lines(), ElementsAre(
        "setprop vendor.hardware.wlan.runtcpdump stop ",
        "echo 4 > /sys/module/wlan/parameters/con_mode ",
        "/vendor/bin/ifconfig wlan0 up ",
        "/vendor/bin/iw wlan0 set channel 6 HT20 ",
        "setprop vendor.hardware.wlan.runsniffer start "));
}

TEST_F(SnifferToolTest, SnifferStop) {
    EXPECT_EQ(0, mTool.snifferStop());
    EXPECT_THAT(mShell.lines(), ElementsAre(
        "setprop vendor.hardware.wlan.runsniffer stop ",
        "/vendor/bin/ifconfig wlan0 down ",
        "echo 0 > /sys/module/wlan/parameters/con_mode ",
        "setprop vendor.hardware.wlan.runtcpdump start "));
}

TEST_F(SnifferToolTest, TheHtModeFollowsChannelAndBandwidth) {
    const struct { const char *channel, *bandwidth, *htMode; } cases[] = {
        {"1",   "20",  "HT20"},  {"36",  "20",  "HT20"},
        {"1",   "40",  "HT40+"}, {"1",   "80",  "HT40+"},
        {"36",  "40",  "HT40+"}, {"149", "80",  "HT40+"},
        {"40",  "40",  "HT40-"}, {"6",   "",    "HT40-"},
        {"01",  "40",  "HT40-"}, {"6",   "20 ", "HT40-"},
        {"",    "40",  ""},
    };
    for (const auto& [channel, bandwidth, htMode] : cases) {
        mShell.clear();
        mTool.snifferStart(channel, bandwidth);
        const std::string words = *channel == '\0' ? "" : std::string(channel) + " " + htMode + " ";
        EXPECT_EQ("/vendor/bin/iw wlan0 set channel " + words, mShell.lines()[3]);
    }
}

// clang-format on

TEST_F(SnifferToolTest, AFailedLineStopsNothingAndGivesMinusOne) {
    for (const char* line : {"runtcpdump", "echo", "ifconfig", "iw wlan0", "runsniffer"}) {
        mShell.clear();
        mShell.answer(line, failing());
        EXPECT_EQ(-1, mTool.snifferStart("6", "20")) << line;
        EXPECT_EQ(5u, mShell.lines().size()) << line;
        mShell.answer(line, {});
    }
    for (const char* line : {"runsniffer", "ifconfig", "echo", "runtcpdump"}) {
        mShell.clear();
        mShell.answer(line, failing());
        EXPECT_EQ(-1, mTool.snifferStop()) << line;
        EXPECT_EQ(4u, mShell.lines().size()) << line;
        mShell.answer(line, {});
    }
}

TEST_F(SnifferToolTest, ReadsTheModeFile) {
    mShell.answer("con_mode", {"4\n"});
    EXPECT_TRUE(mTool.isSnifferMode());
    EXPECT_THAT(mShell.lines(),
                ElementsAre("/vendor/bin/cat /sys/module/wlan/parameters/con_mode "));
    const auto read = ElementsAre(debug(kTag, "4\n"),
                                  debug(kTag,
                                        "cmd: \"/vendor/bin/cat "
                                        "/sys/module/wlan/parameters/con_mode \" successful "
                                        "execution"),
                                  debug(kTag, "wlan con_mode value is : 4\n , atoi() is 4"));
    EXPECT_THAT(mShell.log(), read);

    mShell.clear();
    EXPECT_EQ(4, mTool.getWlanMode());
    EXPECT_THAT(mShell.lines(),
                ElementsAre("/vendor/bin/cat /sys/module/wlan/parameters/con_mode "));
    EXPECT_THAT(mShell.log(), read);
}

TEST_F(SnifferToolTest, KnowsThreeModes) {
    const struct {
        const char* file;
        bool sniffer;
        int mode;
    } cases[] = {
            {"0\n", false, 0},   {"1\n", false, -1}, {"2\n", false, -1}, {"3\n", false, -1},
            {"4", true, 4},      {"5\n", false, 5},  {"6\n", false, -1}, {"7\n", false, -1},
            {"-1\n", false, -1}, {"x\n", false, 0},  {"\n", false, 0},   {"4x\n", true, 4},
    };
    for (const auto& [file, sniffer, mode] : cases) {
        mShell.answer("con_mode", {file});
        EXPECT_EQ(sniffer, mTool.isSnifferMode()) << file;
        EXPECT_EQ(mode, mTool.getWlanMode()) << file;
    }
}

TEST_F(SnifferToolTest, AnUnreadableModeCountsAsMonitorMode) {
    const RecordedShell::Answer unreadable[] = {failing("4\n"), {""}, {"", 0, false}};
    for (const auto& answer : unreadable) {
        mShell.answer("con_mode", answer);
        mShell.clear();
        EXPECT_TRUE(mTool.isSnifferMode());
        EXPECT_EQ(error(kTag, "isSnifferMode return data error!"), mShell.log().back());
        EXPECT_EQ(-1, mTool.getWlanMode());
        EXPECT_EQ(error(kTag, "getWlanMode return data error!"), mShell.log().back());
    }
}

TEST_F(SnifferToolTest, RunsCommandsUnderItsTag) {
    SnifferTool::CmdRunResult result = {0, "left over"};
    mShell.answer("false", failing("text"));
    mTool.runCmdCom("false ", result);
    EXPECT_EQ(-1, result.status);
    EXPECT_EQ("", result.output);
    EXPECT_THAT(mShell.log(), ElementsAre(debug(kTag, "text"),
                                          error(kTag, "cmd: \"false \" unsuccessful execution")));
}

const char* ownerOf(const VendorTestSuit::CmdRunResult&) {
    return "VendorTestSuit";
}

const char* ownerOf(const SnifferTool::CmdRunResult&) {
    return "SnifferTool";
}

TEST(CmdRunResultTest, IsARecordOfItsClass) {
    EXPECT_STREQ("VendorTestSuit", ownerOf(VendorTestSuit::CmdRunResult{0, "text"}));
    EXPECT_STREQ("SnifferTool", ownerOf(SnifferTool::CmdRunResult{0, "text"}));
}

} // namespace
} // namespace vendor::korvan::bex::wifi::V1_0::implementation
