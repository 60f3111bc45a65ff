// Copyright 2026 The BEX Wi-Fi Authors
// SPDX-License-Identifier: Apache-2.0

#include "sniffer/Qca639xSnifferTool.h"
#include "tests/unit/Expect.h"

namespace vendor::korvan::bex::wifi::V1_0::implementation {
namespace {

constexpr const char* kTag = "wifi@1.0-SnifferTool";

class Qca639xSnifferToolTest : public ::testing::Test {
  protected:
    Qca639xSnifferToolTest() { mShell.clear(); }

    RecordedShell mShell;
    Qca639xSnifferTool mTool;
};

TEST_F(Qca639xSnifferToolTest, LogsTheLifeOfASnifferTool) {
    delete static_cast<SnifferTool*>(new Qca639xSnifferTool());
    EXPECT_THAT(mShell.log(),
                ElementsAre(debug(kTag, "SnifferTool "), debug(kTag, "~SnifferTool ")));
}

// clang-format off

TEST_F(Qca639xSnifferToolTest, SnifferStart) {
    EXPECT_EQ(0, mTool.snifferStart("149", "80"));
    EXPECT_THAT(mShell.lines(), ElementsAre(
        "setprop vendor.hardware.wlan.runtcpdump stop ",
        "echo 4 > /sys/module/wlan/parameters/con_mode ",
        "/vendor/bin/ifconfig wlan0 up ",
        "/vendor/bin/iwpriv wlan0 setMonChan 149 2 ",
        "setprop vendor.hardware.wlan.runsniffer start "));
}

TEST_F(Qca639xSnifferToolTest, SnifferStop) {
    EXPECT_EQ(0, mTool.snifferStop());
    EXPECT_THAT(mShell.lines(), ElementsAre(
        "setprop vendor.hardware.wlan.runsniffer stop ",
        "/vendor/bin/ifconfig wlan0 down ",
        "echo 0 > /sys/module/wlan/parameters/con_mode ",
        "setprop vendor.hardware.wlan.runtcpdump start "));
}

TEST_F(Qca639xSnifferToolTest, TheBandwidthCodeFollowsTheBandwidth) {
    const struct { const char *channel, *bandwidth, *words; } cases[] = {
        {"6",  "20",  "6 0 "}, {"36", "40", "36 1 "}, {"36", "80", "36 2 "}, {"1", "160", "1 3 "},
        {"6",  "",    "6 3 "}, {"6",  "20 ", "6 3 "}, {"6", "020", "6 3 "}, {"", "20", ""},
    };
    for (const auto& [channel, bandwidth, words] : cases) {
        mShell.clear();
        mTool.snifferStart(channel, bandwidth);
        EXPECT_EQ(std::string("/vendor/bin/iwpriv wlan0 setMonChan ") + words, mShell.lines()[3]);
    }
}

// clang-format on

TEST_F(Qca639xSnifferToolTest, AFailedLineStopsNothingAndGivesMinusOne) {
    failEachLine(mShell, [&] { return mTool.snifferStart("6", "20"); });
    failEachLine(mShell, [&] { return mTool.snifferStop(); });
}

TEST_F(Qca639xSnifferToolTest, ReadsTheModeAsEverySnifferTool) {
    mShell.answer("con_mode", {"4\n"});
    EXPECT_TRUE(mTool.isSnifferMode());
    EXPECT_EQ(4, mTool.getWlanMode());
}

} // namespace
} // namespace vendor::korvan::bex::wifi::V1_0::implementation
