// Copyright 2026 The BEX Wi-Fi Authors
// SPDX-License-Identifier: Apache-2.0

#include "suites/QcaTestSuit.h"
#include "tests/unit/Expect.h"

namespace vendor::korvan::bex::wifi::V1_0::implementation {
namespace {

constexpr const char* kTag = "wifi@1.0-QcaTestSuit-qca";

class QcaTestSuitTest : public ::testing::Test {
  protected:
    QcaTestSuitTest() {
        mShell.readable("/vendor/lib/modules/qca_cld3_wlan.ko");
        mSuit.getFwPath();
        mShell.clear();
    }

    /** The myftm command that the last operation ended with. */
    std::string test() { return mShell.lines().back(); }

    RecordedShell mShell;
    QcaTestSuit mSuit;
    std::string mOut = "left over";
};

// clang-format off

TEST_F(QcaTestSuitTest, RunTxBGStart) {
    EXPECT_EQ(0, mSuit.RunTxBGStart("6", "54", "x", "1"));
    EXPECT_THAT(mShell.lines(), ElementsAre(
        "myftm -x 0 ",
        "rmmod wlan.ko ",
        "insmod /vendor/lib/modules/qca_cld3_wlan.ko con_mode=5 ",
        "myftm -a 1 -f 2437 -r 14 -M 0 -x 1 "));
}

TEST_F(QcaTestSuitTest, RunTxNStart) {
    EXPECT_EQ(0, mSuit.RunTxNStart("36", "40", "7", "15", true, "2"));
    EXPECT_THAT(mShell.lines(), ElementsAre(
        "myftm -t 0 ",
        "rmmod wlan.ko ",
        "insmod /vendor/lib/modules/qca_cld3_wlan.ko con_mode=5 ",
        "myftm -a 2 -M 6 -r 22 -f 5180 -p 15 -t 3 "));
}

TEST_F(QcaTestSuitTest, RunTxAxStart) {
    EXPECT_EQ(0, mSuit.RunTxAxStart("36", "80", "9", "12", "0", "1"));
    EXPECT_THAT(mShell.lines(), ElementsAre(
        "myftm -t 0 ",
        "rmmod wlan.ko ",
        "insmod /vendor/lib/modules/qca_cld3_wlan.ko "));
}

TEST_F(QcaTestSuitTest, RunTxStStart) {
    EXPECT_EQ(0, mSuit.RunTxStStart("14", "ignored", "2"));
    EXPECT_THAT(mShell.lines(), ElementsAre(
        "myftm -t 0 ",
        "rmmod wlan.ko ",
        "insmod /vendor/lib/modules/qca_cld3_wlan.ko con_mode=5 ",
        "myftm -a 2 -f 2484 -t 1 "));
}

TEST_F(QcaTestSuitTest, RunTxStStop) {
    EXPECT_EQ(0, mSuit.RunTxStStop("6"));
    EXPECT_THAT(mShell.lines(), ElementsAre(
        "myftm -t 0 ",
        "rmmod wlan.ko ",
        "insmod /vendor/lib/modules/qca_cld3_wlan.ko "));
}

TEST_F(QcaTestSuitTest, RunTxStop) {
    EXPECT_EQ(0, mSuit.RunTxStop("6"));
    EXPECT_THAT(mShell.lines(), ElementsAre(
        "myftm -t 0 ",
        "rmmod wlan.ko ",
        "insmod /vendor/lib/modules/qca_cld3_wlan.ko "));
}

TEST_F(QcaTestSuitTest, RunRxApJoinHoc) {
    EXPECT_EQ(0, mSuit.RunRxApJoinHoc("test ap", "192.168.1.7"));
    EXPECT_THAT(mShell.lines(), ElementsAre(
        "myftm -x 0 ",
        "rmmod wlan.ko ",
        "insmod /vendor/lib/modules/qca_cld3_wlan.ko ",
        "iwlist wlan0 scan ",
        "iwconfig wlan0 essid test ap ",
        "ifconfig wlan0 192.168.1.7 up ",
        "ping -c 4 192.168.1.1 "));
}

TEST_F(QcaTestSuitTest, RunRxBgStart) {
    EXPECT_EQ(0, mSuit.RunRxBgStart("11", "5.5", "1", mOut));
    EXPECT_EQ("ok", mOut);
    EXPECT_THAT(mShell.lines(), ElementsAre(
        "myftm -x 0 ",
        "rmmod wlan.ko ",
        "insmod /vendor/lib/modules/qca_cld3_wlan.ko ",
        "sleep 1 ",
        "ifconfig wlan0 up ",
        "echo 5 > /sys/module/wlan/parameters/con_mode ",
        "myftm -a 1 -f 2462 -r 3 -M 4 -x 1 "));
}

TEST_F(QcaTestSuitTest, RunRxNStart) {
    EXPECT_EQ(0, mSuit.RunRxNStart("6", "20", "0", false, "1", mOut));
    EXPECT_EQ("ok", mOut);
    EXPECT_THAT(mShell.lines(), ElementsAre(
        "myftm -x 0 ",
        "rmmod wlan.ko ",
        "insmod /vendor/lib/modules/qca_cld3_wlan.ko con_mode=5 ",
        "myftm -a 1 -f 2437 -M 1 -r 15 -x 1 "));
}

TEST_F(QcaTestSuitTest, RunRxAxStart) {
    EXPECT_EQ(0, mSuit.RunRxAxStart("36", "80", "9", "1", mOut));
    EXPECT_EQ("ok", mOut);
    EXPECT_THAT(mShell.lines(), ElementsAre(
        "myftm -x 0 ",
        "rmmod wlan.ko ",
        "insmod /vendor/lib/modules/qca_cld3_wlan.ko "));
}

TEST_F(QcaTestSuitTest, RunRxStop) {
    mShell.answer("myftm", {"goodPackets 1234\nbadPackets 5\n"});
    EXPECT_EQ(0, mSuit.RunRxStop("6", mOut));
    EXPECT_EQ("Rx: 1234", mOut);
    EXPECT_THAT(mShell.lines(), ElementsAre(
        "myftm -x 0 ",
        "rmmod wlan.ko ",
        "/vendor/bin/insmod /vendor/lib/modules/qca_cld3_wlan.ko "));
    const std::string base = "wifi@1.0-VendorTestSuit";
    EXPECT_THAT(mShell.log(), ElementsAre(
        debug(base, "goodPackets 1234\n"),
        debug(base, "badPackets 5\n"),
        debug(base, "cmd: \"myftm -x 0 \" successful execution"),
        debug(kTag, "received packets: 1234"),
        debug(base, "cmd: \"rmmod wlan.ko \" successful execution"),
        debug(base, "cmd: \"/vendor/bin/insmod /vendor/lib/modules/qca_cld3_wlan.ko \" "
                    "successful execution")));
}

// clang-format on

TEST_F(QcaTestSuitTest, TheBgTestFollowsRateAndChannel) {
    mSuit.RunTxBGStart("1", "11", "", "2");
    EXPECT_EQ("myftm -a 2 -f 2412 -r 6 -M 4 -x 1 ", test());
    mSuit.RunTxBGStart("165", "unknown", "", "1");
    EXPECT_EQ("myftm -a 1 -f 5825 -r 1 -M 0 -x 1 ", test());
    mSuit.RunRxBgStart("abc", "24", "3", mOut);
    EXPECT_EQ("myftm -a 3 -f 2412 -r 10 -M 0 -x 1 ", test());
}

TEST_F(QcaTestSuitTest, TheNTestFollowsBandwidthAndStandard) {
    mSuit.RunTxNStart("1", "80", "0", "9", false, "1");
    EXPECT_EQ("myftm -a 1 -M 8 -r 15 -f 2412 -p 9 -t 3 ", test());
    mSuit.RunTxNStart("1", "160", "abc", "9", false, "1");
    EXPECT_EQ("myftm -a 1 -M 1 -r 15 -f 2412 -p 9 -t 3 ", test());
    mSuit.RunTxNStart("1", "40", "-20", "9", false, "1");
    EXPECT_EQ("myftm -a 1 -M 2 -r -5 -f 2412 -p 9 -t 3 ", test());
    mSuit.RunRxNStart("36", "40", "9", true, "2", mOut);
    EXPECT_EQ("myftm -a 2 -f 5180 -M 6 -r 24 -x 1 ", test());
}

TEST_F(QcaTestSuitTest, AnEmptyArgumentEndsItsLine) {
    mSuit.RunTxBGStart("6", "54", "15", "");
    EXPECT_EQ("myftm -a ", test());
    mSuit.RunTxBGStart("", "", "", "1");
    EXPECT_EQ("myftm -a 1 -f 2412 -r 1 -M 0 -x 1 ", test());
    mSuit.RunTxNStart("6", "20", "7", "", false, "1");
    EXPECT_EQ("myftm -a 1 -M 1 -r 22 -f 2437 -p ", test());
    mSuit.RunTxStStart("6", "", "");
    EXPECT_EQ("myftm -a ", test());
    mSuit.RunRxNStart("6", "20", "7", false, "", mOut);
    EXPECT_EQ("myftm -a ", test());
    mShell.clear();
    mSuit.RunRxApJoinHoc("", "");
    EXPECT_EQ("iwconfig wlan0 essid ", mShell.lines()[4]);
    EXPECT_EQ("ifconfig wlan0 ", mShell.lines()[5]);
}

TEST_F(QcaTestSuitTest, ArgumentsReachTheShellAsTheyStand) {
    mSuit.RunTxNStart("6", "20", "7", "\"15", false, "1; $(id)");
    EXPECT_EQ("myftm -a 1; $(id) -M 1 -r 22 -f 2437 -p \"15 -t 3 ", test());
}

TEST_F(QcaTestSuitTest, AFailedLineStopsNothingAndGivesMinusOne) {
    failEachLine(mShell, [&] { return mSuit.RunTxBGStart("6", "54", "", "1"); });
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

TEST_F(QcaTestSuitTest, AFailedReceptionStartSaysFailure) {
    mShell.answer("rmmod", failing());
    EXPECT_EQ(-1, mSuit.RunRxBgStart("6", "54", "1", mOut));
    EXPECT_EQ("failure", mOut);
    mOut.clear();
    EXPECT_EQ(-1, mSuit.RunRxNStart("6", "20", "7", true, "1", mOut));
    EXPECT_EQ("failure", mOut);
    mOut.clear();
    EXPECT_EQ(-1, mSuit.RunRxAxStart("", "", "", "", mOut));
    EXPECT_EQ("failure", mOut);
}

TEST_F(QcaTestSuitTest, TheCountComesFromTheFirstLineAlone) {
    mShell.answer("", {"goodPackets 8\n"});
    mShell.answer("myftm", failing("goodPackets 7\n"));
    EXPECT_EQ(-1, mSuit.RunRxStop("", mOut));
    EXPECT_EQ("Rx: ", mOut);
    mShell.answer("myftm", {"goodPackets"});
    EXPECT_EQ(0, mSuit.RunRxStop("", mOut));
    EXPECT_EQ("Rx: goodPackets", mOut);
}

TEST_F(QcaTestSuitTest, ParsesTheSecondField) {
    EXPECT_EQ("12", mSuit.ParseReceivedPacketNum("x goodPackets 12 13 14"));
    EXPECT_THAT(mShell.log(), ElementsAre(debug(kTag, "received packets: 12")));
    mShell.clear();
    EXPECT_EQ("goodPackets", mSuit.ParseReceivedPacketNum("goodPackets"));
    EXPECT_THAT(mShell.log(), ElementsAre(error(kTag, rangeMessage(1, 1)),
                                          debug(kTag, "received packets: goodPackets")));
}

TEST_F(QcaTestSuitTest, KnowsTheRatesOfTheTool) {
    EXPECT_EQ("12", mSuit.getBgRateIndex("36"));
    EXPECT_EQ("4", mSuit.getAbgProtocalIndex("5.5"));
    EXPECT_EQ("0", mSuit.getAbgProtocalIndex("6"));
}

/** Has a stop of its own, which tells whether another operation uses it. */
class OwnStop : public QcaTestSuit {
  public:
    int RunTxStop(const std::string& channel) override { return channel == "6" ? 42 : 0; }
};

TEST_F(QcaTestSuitTest, OnlyTheToneStopFollowsASubclassStop) {
    OwnStop suit;
    EXPECT_EQ(42, suit.RunTxStStop("6"));
    EXPECT_EQ(0, suit.RunTxAxStart("6", "", "", "", "", ""));
    EXPECT_EQ(3u, mShell.lines().size());
}

} // namespace
} // namespace vendor::korvan::bex::wifi::V1_0::implementation
