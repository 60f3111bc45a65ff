// Copyright 2026 The BEX Wi-Fi Authors
// SPDX-License-Identifier: Apache-2.0

#include "sniffer/Wcn685xSnifferTool.h"
#include "tests/unit/Expect.h"

namespace vendor::korvan::bex::wifi::V1_0::implementation {
namespace {

constexpr const char* kTag = "wifi@1.0-SnifferTool";

class Wcn685xSnifferToolTest : public ::testing::Test {
  protected:
    Wcn685xSnifferToolTest() { mShell.clear(); }

    RecordedShell mShell;
    Wcn685xSnifferTool mTool;
};

TEST_F(Wcn685xSnifferToolTest, LogsTheLifeOfASnifferTool) {
    delete static_cast<SnifferTool*>(new Wcn685xSnifferTool());
    EXPECT_THAT(mShell.log(),
                ElementsAre(debug(kTag, "SnifferTool "), debug(kTag, "~SnifferTool ")));
}

// clang-format off

TEST_F(Wcn685xSnifferToolTest, SnifferStart) {
    EXPECT_EQ(0, mTool.snifferStart("36", "40"));
    EXPECT_THAT(mShell.lines(), ElementsAre(
        "/vendor/bin/stop vendor.tcpdump ",
        "echo 4 > /sys/module/wlan/parameters/con_mode ",
        "/vendor/bin/ifconfig wlan0 up ",
        "/vendor/bin/iwpriv wlan0 setMonChan 36 1 ",
        "/vendor/bin/start vendor.sniffer "));
}

TEST_F(Wcn685xSnifferToolTest, SnifferStop) {
    EXPECT_EQ(0, mTool.snifferStop());
    EXPECT_THAT(mShell.lines(), ElementsAre(
        "/vendor/bin/stop vendor.sniffer ",
        "/vendor/bin/ifconfig wlan0 down ",
        "echo 0 > /sys/module/wlan/parameters/con_mode ",
        "/vendor/bin/start vendor.tcpdump "));
}

// clang-format on

TEST_F(Wcn685xSnifferToolTest, AFailedLineStopsNothingAndGivesMinusOne) {
    failEachLine(mShell, [&] { return mTool.snifferStart("6", "20"); });
    failEachLine(mShell, [&] { return mTool.snifferStop(); });
}

TEST_F(Wcn685xSnifferToolTest, ReadsTheModeAsEverySnifferTool) {
    EXPECT_TRUE(mTool.isSnifferMode());
    EXPECT_EQ(error(kTag, "isSnifferMode return data error!"), mShell.log().back());
    mShell.answer("con_mode", {"5\n"});
    EXPECT_FALSE(mTool.isSnifferMode());
    EXPECT_EQ(5, mTool.getWlanMode());
}

} // namespace
} // namespace vendor::korvan::bex::wifi::V1_0::implementation
