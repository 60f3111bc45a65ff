// Copyright 2026 The BEX Wi-Fi Authors
// SPDX-License-Identifier: Apache-2.0

#include "suites/Wcn39xxTestSuit.h"
#include "tests/unit/Expect.h"

namespace vendor::korvan::bex::wifi::V1_0::implementation {
namespace {

constexpr const char* kTag = "wifi@1.0-Wcn39xxTestSuit.wcn39xx";

class Wcn39xxTestSuitTest : public ::testing::Test {
  protected:
    Wcn39xxTestSuitTest() {
        mShell.readable("/vendor/lib/modules/wlan.ko");
        mSuit.getFwPath();
        mShell.clear();
    }

    /** The myftm command that the last operation ended with. */
    std::string test() { return mShell.lines().back(); }

    RecordedShell mShell;
    Wcn39xxTestSuit mSuit;
    std::string mOut = "left over";
};

// clang-format off

TEST_F(Wcn39xxTestSuitTest, RunTxBGStart) {
    EXPECT_EQ(0, mSuit.RunTxBGStart("1", "11", "18", "1"));
    EXPECT_THAT(mShell.lines(), ElementsAre(
        "/vendor/bin/myftm -t 0 ",
        "/vendor/bin/rmmod wlan.ko ",
        "/vendor/bin/insmod /vendor/lib/modules/wlan.ko ",
        "/vendor/bin/sleep 1 ",
        "/vendor/bin/ifconfig wlan0 up ",
        "echo 5 > /sys/module/wlan/parameters/con_mode ",
        "/vendor/bin/myftm --dpdflag -a 1 -r 6 -f 2412 -p 18 -t 3 "));
}

TEST_F(Wcn39xxTestSuitTest, RunTxNStart) {
    EXPECT_EQ(0, mSuit.RunTxNStart("36", "40", "7", "15", true, "2"));
    EXPECT_THAT(mShell.lines(), ElementsAre(
        "/vendor/bin/myftm -t 0 ",
        "/vendor/bin/rmmod wlan.ko ",
        "/vendor/bin/insmod /vendor/lib/modules/wlan.ko ",
        "/vendor/bin/sleep 1 ",
        "/vendor/bin/ifconfig wlan0 up ",
        "echo 5 > /sys/module/wlan/parameters/con_mode ",
        "/vendor/bin/myftm --dpdflag -a 2 -M 6 -r 22 -f 5180 -p 15 -t 3 "));
}

TEST_F(Wcn39xxTestSuitTest, RunTxAxStart) {
    EXPECT_EQ(0, mSuit.RunTxAxStart("36", "80", "9", "12", "0", "1"));
    EXPECT_THAT(mShell.lines(), ElementsAre(
        "/vendor/bin/myftm -t 0 ",
        "/vendor/bin/rmmod wlan.ko ",
        "/vendor/bin/insmod /vendor/lib/modules/wlan.ko ",
        "/vendor/bin/sleep 1 ",
        "/vendor/bin/ifconfig wlan0 up ",
        "echo 5 > /sys/module/wlan/parameters/con_mode "));
}

TEST_F(Wcn39xxTestSuitTest, RunTxStStart) {
    EXPECT_EQ(0, mSuit.RunTxStStart("14", "ignored", "2"));
    EXPECT_THAT(mShell.lines(), ElementsAre(
        "/vendor/bin/myftm -t 0 ",
        "/vendor/bin/rmmod wlan.ko ",
        "/vendor/bin/insmod /vendor/lib/modules/wlan.ko ",
        "/vendor/bin/sleep 1 ",
        "/vendor/bin/ifconfig wlan0 up ",
        "echo 5 > /sys/module/wlan/parameters/con_mode ",
        "/vendor/bin/myftm -a 2 -f 2484 -t 1 "));
}

TEST_F(Wcn39xxTestSuitTest, RunTxStStop) {
    EXPECT_EQ(0, mSuit.RunTxStStop("6"));
    EXPECT_THAT(mShell.lines(), ElementsAre(
        "/vendor/bin/myftm -t 0 ",
        "/vendor/bin/rmmod wlan.ko ",
        "/vendor/bin/insmod /vendor/lib/modules/wlan.ko "));
}

TEST_F(Wcn39xxTestSuitTest, RunTxStop) {
    EXPECT_EQ(0, mSuit.RunTxStop("6"));
    EXPECT_THAT(mShell.lines(), ElementsAre(
        "/vendor/bin/myftm -t 0 ",
        "/vendor/bin/rmmod wlan.ko ",
        "/vendor/bin/insmod /vendor/lib/modules/wlan.ko "));
}

TEST_F(Wcn39xxTestSuitTest, RunRxApJoinHoc) {
    EXPECT_EQ(0, mSuit.RunRxApJoinHoc("test ap", "192.168.1.7"));
    EXPECT_THAT(mShell.lines(), ElementsAre(
        "/vendor/bin/myftm -x 0 ",
        "/vendor/bin/rmmod wlan.ko ",
        "/vendor/bin/insmod /vendor/lib/modules/wlan.ko ",
        "/vendor/bin/sleep 1 ",
        "/vendor/bin/ifconfig wlan0 up ",
        "echo 5 > /sys/module/wlan/parameters/con_mode ",
        "/vendor/bin/iwlist wlan0 scan ",
        "/vendor/bin/iwconfig wlan0 essid test ap ",
        "/vendor/bin/ifconfig wlan0 192.168.1.7 ",
        "/vendor/bin/ping -c 4 192.168.1.1 "));
}

TEST_F(Wcn39xxTestSuitTest, RunRxBgStart) {
    EXPECT_EQ(0, mSuit.RunRxBgStart("11", "5.5", "1", mOut));
    EXPECT_EQ("ok", mOut);
    EXPECT_THAT(mShell.lines(), ElementsAre(
        "/vendor/bin/myftm -x 0 ",
        "/vendor/bin/rmmod wlan.ko ",
        "/vendor/bin/insmod /vendor/lib/modules/wlan.ko ",
        "/vendor/bin/sleep 1 ",
        "/vendor/bin/ifconfig wlan0 up ",
        "echo 5 > /sys/module/wlan/parameters/con_mode ",
        "/vendor/bin/myftm -a 1 -f 2462 -r 3 -M 4 -x 1 "));
}

TEST_F(Wcn39xxTestSuitTest, RunRxNStart) {
    EXPECT_EQ(0, mSuit.RunRxNStart("6", "20", "0", false, "1", mOut));
    EXPECT_EQ("ok", mOut);
    EXPECT_THAT(mShell.lines(), ElementsAre(
        "/vendor/bin/myftm -x 0 ",
        "/vendor/bin/rmmod wlan.ko ",
        "/vendor/bin/insmod /vendor/lib/modules/wlan.ko ",
        "/vendor/bin/sleep 1 ",
        "/vendor/bin/ifconfig wlan0 up ",
        "echo 5 > /sys/module/wlan/parameters/con_mode ",
        "/vendor/bin/myftm -a 1 -f 2437 -M 1 -r 15 -x 1 "));
}

TEST_F(Wcn39xxTestSuitTest, RunRxAxStart) {
    EXPECT_EQ(0, mSuit.RunRxAxStart("36", "80", "9", "1", mOut));
    EXPECT_EQ("ok", mOut);
    EXPECT_THAT(mShell.lines(), ElementsAre(
        "/vendor/bin/myftm -x 0 ",
        "/vendor/bin/rmmod wlan.ko ",
        "/vendor/bin/insmod /vendor/lib/modules/wlan.ko ",
        "/vendor/bin/sleep 1 ",
        "/vendor/bin/ifconfig wlan0 up ",
        "echo 5 > /sys/module/wlan/parameters/con_mode "));
}

TEST_F(Wcn39xxTestSuitTest, RunRxStop) {
    mShell.answer("myftm", {"goodPackets 42"});
    EXPECT_EQ(0, mSuit.RunRxStop("6", mOut));
    EXPECT_EQ("Rx: 42", mOut);
    EXPECT_THAT(mShell.lines(), ElementsAre(
        "/vendor/bin/myftm -x 0 ",
        "/vendor/bin/rmmod wlan.ko ",
        "/vendor/bin/insmod /vendor/lib/modules/wlan.ko "));
    EXPECT_THAT(mShell.log(kTag), ElementsAre(debug(kTag, "received packets: 42")));
}

// clang-format on

TEST_F(Wcn39xxTestSuitTest, AnEmptyArgumentEndsItsLine) {
    mSuit.RunTxBGStart("6", "54", "15", "");
    EXPECT_EQ("/vendor/bin/myftm --dpdflag -a ", test());
    mSuit.RunTxBGStart("", "", "", "1");
    EXPECT_EQ("/vendor/bin/myftm --dpdflag -a 1 -r 1 -f 2412 -p ", test());
    mSuit.RunTxNStart("6", "80", "7", "", false, "1");
    EXPECT_EQ("/vendor/bin/myftm --dpdflag -a 1 -M 8 -r 22 -f 2437 -p ", test());
    mShell.clear();
    mSuit.RunRxApJoinHoc("", "");
    EXPECT_EQ("/vendor/bin/iwconfig wlan0 essid ", mShell.lines()[7]);
    EXPECT_EQ("/vendor/bin/ifconfig wlan0 ", mShell.lines()[8]);
}

TEST_F(Wcn39xxTestSuitTest, AFailedLineStopsNothingAndGivesMinusOne) {
    failEachLine(mShell, [&] { return mSuit.RunTxBGStart("6", "54", "15", "1"); });
    failEachLine(mShell, [&] { return mSuit.RunTxNStart("6", "20", "7", "15", true, "1"); });
    failEachLine(mShell, [&] { return mSuit.RunTxAxStart("", "", "", "", "", ""); });
    failEachLine(mShell, [&] { return mSuit.RunTxStStart("6", "", "1"); });
    failEachLine(mShell, [&] { return mSuit.RunTxStStop(""); });
    failEachLine(mShell, [&] { return mSuit.RunTxStop(""); });
    failEachLine(mShell, [&] { return mSuit.RunRxApJoinHoc("ap", "192.168.1.7"); });
    failEachLine(mShell, [&] { return mSuit.RunRxBgStart("6", "54", "1", mOut); });
    failEachLine(mShell, [&] { return mSuit.RunRxNStart("6", "20", "7", true, "1", mOut); });
    failEachLine(mShell, [&] { return mSuit.RunRxAxStart("", "", "", "", mOut); });
    failEachLine(mShell, [&] { return mSuit.RunRxStop("", mOut); });
}

TEST_F(Wcn39xxTestSuitTest, AFailedReceptionStartSaysFailure) {
    mShell.answer("sleep", failing());
    EXPECT_EQ(-1, mSuit.RunRxBgStart("6", "54", "1", mOut));
    EXPECT_EQ("failure", mOut);
    mOut.clear();
    EXPECT_EQ(-1, mSuit.RunRxNStart("6", "20", "7", true, "1", mOut));
    EXPECT_EQ("failure", mOut);
    mOut.clear();
    EXPECT_EQ(-1, mSuit.RunRxAxStart("", "", "", "", mOut));
    EXPECT_EQ("failure", mOut);
}

TEST_F(Wcn39xxTestSuitTest, ParsesTheSecondField) {
    EXPECT_EQ("12", mSuit.ParseReceivedPacketNum("x goodPackets 12 13 14"));
    mShell.clear();
    EXPECT_EQ("", mSuit.ParseReceivedPacketNum("none"));
    EXPECT_THAT(mShell.log(),
                ElementsAre(error(kTag, rangeMessage(1, 0)), debug(kTag, "received packets: ")));
}

TEST_F(Wcn39xxTestSuitTest, KnowsTheRatesOfTheTool) {
    EXPECT_EQ("10", mSuit.getBgRateIndex("24"));
    EXPECT_EQ("4", mSuit.getAbgProtocalIndex("11"));
    EXPECT_EQ("0", mSuit.getAbgProtocalIndex("1.0"));
}

/** Has a stop of its own, which tells whether another operation uses it. */
class OwnStop : public Wcn39xxTestSuit {
  public:
    int RunTxStop(const std::string& channel) override { return channel == "6" ? 42 : 0; }
};

TEST_F(Wcn39xxTestSuitTest, TheToneStopFollowsASubclassStop) {
    OwnStop suit;
    EXPECT_EQ(42, suit.RunTxStStop("6"));
}

} // namespace
} // namespace vendor::korvan::bex::wifi::V1_0::implementation
