// Copyright 2026 The BEX Wi-Fi Authors
// SPDX-License-Identifier: Apache-2.0

#include "suites/Wcn6750TestSuit.h"
#include "tests/unit/Expect.h"

namespace vendor::korvan::bex::wifi::V1_0::implementation {
namespace {

constexpr const char* kTag = "wifi@1.0-Wcn6750TestSuit.wcn6750";

class Wcn6750TestSuitTest : public ::testing::Test {
  protected:
    Wcn6750TestSuitTest() {
        mSuit.driverPaths = {"/vendor/lib/modules/qca_cld3_b.ko", "/vendor/lib/modules/qca_cld3_a"};
        mShell.clear();
    }

    RecordedShell mShell;
    Wcn6750TestSuit mSuit;
    std::string mOut = "left over";
};

// clang-format off

TEST_F(Wcn6750TestSuitTest, RunTxBGStart) {
    EXPECT_EQ(0, mSuit.RunTxBGStart("6", "54", "15", "1"));
    EXPECT_THAT(mShell.lines(), ElementsAre(
        "rmmod wlan.ko ",
        "insmod /vendor/lib/modules/qca_cld3_b.ko con_mode=5 ",
        "insmod /vendor/lib/modules/qca_cld3_a con_mode=5 ",
        "sleep 1.5 ",
        "ifconfig wlan0 up ",
        "myftm -J -B phya ",
        "myftm -J -I 0 -a 1 -r 14 -X 00:03:7F:44:55:11 -Y 00:03:7F:44:55:22 "
            "-N 00:03:7F:44:55:33 -M 0 -f 2437 -p 15 --dpdflag enable -t 3 "));
}

TEST_F(Wcn6750TestSuitTest, RunTxNStart) {
    EXPECT_EQ(0, mSuit.RunTxNStart("36", "80", "7", "12", true, "2"));
    EXPECT_THAT(mShell.lines(), ElementsAre(
        "rmmod wlan.ko ",
        "insmod /vendor/lib/modules/qca_cld3_b.ko con_mode=5 ",
        "insmod /vendor/lib/modules/qca_cld3_a con_mode=5 ",
        "sleep 1.5 ",
        "ifconfig wlan0 up ",
        "myftm -J -B phya ",
        "myftm -J -I 0 -a 2 -k 1 -M 8 -X 00:03:7F:44:55:11 -Y 00:03:7F:44:55:22 "
            "-N 00:03:7F:44:55:33 -r 22 -f 5180 -p 12 --dpdflag enable -t 3 "));
}

TEST_F(Wcn6750TestSuitTest, RunTxAxStart) {
    EXPECT_EQ(0, mSuit.RunTxAxStart("36", "40", "0", "12", "0.8", "3"));
    EXPECT_THAT(mShell.lines(), ElementsAre(
        "rmmod wlan.ko ",
        "insmod /vendor/lib/modules/qca_cld3_b.ko con_mode=5 ",
        "insmod /vendor/lib/modules/qca_cld3_a con_mode=5 ",
        "sleep 1.5 ",
        "ifconfig wlan0 up ",
        "myftm -J -B phya ",
        "myftm -J -I 0 --gI 0.8 --rateBw 9 -M 3 -a 3 -k 1 --nss 2 -X 00:03:7F:44:55:11 "
            "-Y 00:03:7F:44:55:22 -N 00:03:7F:44:55:33 -r 15 -f 5180 -p 12 "
            "--dpdflag enable -t 3 "));
}

TEST_F(Wcn6750TestSuitTest, RunTxStStart) {
    EXPECT_EQ(0, mSuit.RunTxStStart("14", "ignored", "2"));
    EXPECT_THAT(mShell.lines(), ElementsAre(
        "rmmod wlan.ko ",
        "insmod /vendor/lib/modules/qca_cld3_b.ko con_mode=5 ",
        "insmod /vendor/lib/modules/qca_cld3_a con_mode=5 ",
        "sleep 1.5 ",
        "ifconfig wlan0 up ",
        "myftm -J -B phya ",
        "myftm -J -I 0 -X 00:03:7F:44:55:11 -Y 00:03:7F:44:55:22 -N 00:03:7F:44:55:33 "
            "-a 2 -k 1 -f 2484 -t 1 "));
}

TEST_F(Wcn6750TestSuitTest, RunTxStStop) {
    EXPECT_EQ(0, mSuit.RunTxStStop("36"));
    EXPECT_THAT(mShell.lines(), ElementsAre(
        "myftm -J -I 0 -t 0 ",
        "rmmod wlan.ko ",
        "insmod /vendor/lib/modules/qca_cld3_b.ko ",
        "insmod /vendor/lib/modules/qca_cld3_a "));
}

TEST_F(Wcn6750TestSuitTest, RunTxStop) {
    EXPECT_EQ(0, mSuit.RunTxStop("6"));
    EXPECT_THAT(mShell.lines(), ElementsAre(
        "myftm -J -I 0 -t 0 ",
        "rmmod wlan.ko ",
        "insmod /vendor/lib/modules/qca_cld3_b.ko ",
        "insmod /vendor/lib/modules/qca_cld3_a "));
}

TEST_F(Wcn6750TestSuitTest, RunRxApJoinHoc) {
    EXPECT_EQ(0, mSuit.RunRxApJoinHoc("test ap", "192.168.1.7"));
    EXPECT_THAT(mShell.lines(), ElementsAre(
        "rmmod wlan.ko ",
        "insmod /vendor/lib/modules/qca_cld3_b.ko con_mode=5 ",
        "insmod /vendor/lib/modules/qca_cld3_a con_mode=5 ",
        "sleep 1.5 ",
        "ifconfig wlan0 up ",
        "iwlist wlan0 scan ",
        "iwconfig wlan0 essid test ap ",
        "ifconfig wlan0 192.168.1.7 up ",
        "ping -c 4 192.168.1.1 "));
}

TEST_F(Wcn6750TestSuitTest, RunRxBgStart) {
    EXPECT_EQ(0, mSuit.RunRxBgStart("11", "5.5", "1", mOut));
    EXPECT_EQ("ok", mOut);
    EXPECT_THAT(mShell.lines(), ElementsAre(
        "rmmod wlan.ko ",
        "insmod /vendor/lib/modules/qca_cld3_b.ko con_mode=5 ",
        "insmod /vendor/lib/modules/qca_cld3_a con_mode=5 ",
        "sleep 1.5 ",
        "ifconfig wlan0 up ",
        "myftm -J -B phya ",
        "myftm -J -I 0 -X 00:03:7F:44:55:11 -Y 00:03:7F:44:55:22 -N 00:03:7F:44:55:44 "
            "-a 1 -f 2462 -r 3 -M 0 -x 1 "));
}

TEST_F(Wcn6750TestSuitTest, RunRxNStart) {
    EXPECT_EQ(0, mSuit.RunRxNStart("149", "40", "9", false, "2", mOut));
    EXPECT_EQ("ok", mOut);
    EXPECT_THAT(mShell.lines(), ElementsAre(
        "rmmod wlan.ko ",
        "insmod /vendor/lib/modules/qca_cld3_b.ko con_mode=5 ",
        "insmod /vendor/lib/modules/qca_cld3_a con_mode=5 ",
        "sleep 1.5 ",
        "ifconfig wlan0 up ",
        "myftm -J -B phya ",
        "myftm -J -I 0 -X 00:03:7F:44:55:11 -Y 00:03:7F:44:55:22 -N 00:03:7F:44:55:44 "
            "-a 2 -f 5745 -M 2 -r 24 -x 1 "));
}

TEST_F(Wcn6750TestSuitTest, RunRxAxStart) {
    EXPECT_EQ(0, mSuit.RunRxAxStart("36", "160", "11", "1", mOut));
    EXPECT_EQ("ok", mOut);
    EXPECT_THAT(mShell.lines(), ElementsAre(
        "rmmod wlan.ko ",
        "insmod /vendor/lib/modules/qca_cld3_b.ko con_mode=5 ",
        "insmod /vendor/lib/modules/qca_cld3_a con_mode=5 ",
        "sleep 1.5 ",
        "ifconfig wlan0 up ",
        "myftm -J -B phya ",
        "myftm -J -I 0 --rateBw 16 -M 29 -X 00:03:7F:44:55:11 -Y 00:03:7F:44:55:22 "
            "-N 00:03:7F:44:55:44 --nss 1 -a 1 -f 5180 -r 26 -x 1 "));
}

TEST_F(Wcn6750TestSuitTest, RunRxStop) {
    mShell.answer("myftm", {"goodPackets = 1234\n"});
    EXPECT_EQ(0, mSuit.RunRxStop("6", mOut));
    EXPECT_EQ("Rx: 1234", mOut);
    EXPECT_THAT(mShell.lines(), ElementsAre(
        "myftm -J -I 0 -x 0 ",
        "rmmod wlan.ko ",
        "/vendor/bin/insmod /vendor/lib/modules/qca_cld3_b.ko ",
        "/vendor/bin/insmod /vendor/lib/modules/qca_cld3_a "));
    const std::string base = "wifi@1.0-VendorTestSuit";
    const std::string first = "/vendor/bin/insmod /vendor/lib/modules/qca_cld3_b.ko ";
    const std::string second = "/vendor/bin/insmod /vendor/lib/modules/qca_cld3_a ";
    EXPECT_THAT(mShell.log(), ElementsAre(
        error(kTag, "RunRxStop: myftm -J -I 0 -x 0 "),
        debug(base, "goodPackets = 1234\n"),
        debug(base, "cmd: \"myftm -J -I 0 -x 0 \" successful execution"),
        debug(kTag, "received packets: 1234"),
        error(kTag, "RunRxStop: rmmod wlan.ko "),
        debug(base, "cmd: \"rmmod wlan.ko \" successful execution"),
        error(kTag, "RunRxStop: " + first),
        debug(base, "cmd: \"" + first + "\" successful execution"),
        error(kTag, "RunRxStop: " + second),
        debug(base, "cmd: \"" + second + "\" successful execution")));
}

// clang-format on

TEST_F(Wcn6750TestSuitTest, TheBandFlagIsAlways0) {
    for (const char* channel : {"1", "14", "15", "36", "0", "abc"}) {
        mShell.clear();
        mSuit.RunTxBGStart(channel, "54", "15", "1");
        mSuit.RunRxBgStart(channel, "54", "1", mOut);
        mSuit.RunTxStop(channel);
        mSuit.RunRxStop(channel, mOut);
        for (const std::string& line : mShell.lines()) {
            const size_t flag = line.find("-I ");
            if (flag == std::string::npos) continue;
            EXPECT_EQ("-I 0 ", line.substr(flag, 5)) << channel;
        }
    }
}

TEST_F(Wcn6750TestSuitTest, TheFrequencyFollowsTheChannel) {
    mSuit.RunTxStStart("1", "", "1");
    EXPECT_NE(std::string::npos, mShell.lines().back().find("-I 0 "));
    EXPECT_NE(std::string::npos, mShell.lines().back().find("-f 2412 "));
}

TEST_F(Wcn6750TestSuitTest, OnlyAFailedInsmodIsForgiven) {
    const auto insmod = [](const std::string& line) { return line.rfind("insmod", 0) == 0; };
    failEachLine(
            mShell, [&] { return mSuit.RunTxBGStart("6", "54", "15", "1"); }, insmod);
    failEachLine(
            mShell, [&] { return mSuit.RunTxNStart("6", "40", "7", "9", true, "1"); }, insmod);
    failEachLine(
            mShell, [&] { return mSuit.RunTxAxStart("6", "", "", "", "", "1"); }, insmod);
    failEachLine(
            mShell, [&] { return mSuit.RunTxStStart("6", "", "1"); }, insmod);
    failEachLine(
            mShell, [&] { return mSuit.RunTxStStop("6"); }, insmod);
    failEachLine(
            mShell, [&] { return mSuit.RunTxStop("6"); }, insmod);
    failEachLine(
            mShell, [&] { return mSuit.RunRxApJoinHoc("ap", "192.168.1.7"); }, insmod);
    failEachLine(
            mShell, [&] { return mSuit.RunRxBgStart("6", "54", "1", mOut); }, insmod);
    failEachLine(
            mShell, [&] { return mSuit.RunRxNStart("6", "40", "7", true, "1", mOut); }, insmod);
    failEachLine(
            mShell, [&] { return mSuit.RunRxAxStart("6", "", "", "1", mOut); }, insmod);
    // Here it has its folder in front.
    failEachLine(mShell, [&] { return mSuit.RunRxStop("6", mOut); });
}

TEST_F(Wcn6750TestSuitTest, TheCountComesFromTheFirstLineAlone) {
    mShell.answer("", {"goodPackets = 8\n"});
    mShell.answer("myftm", failing("goodPackets = 7\n"));
    EXPECT_EQ(-1, mSuit.RunRxStop("6", mOut));
    EXPECT_EQ("Rx: ", mOut);
    EXPECT_EQ(error(kTag, rangeMessage(2, 0)), mShell.log(kTag)[1]);
}

TEST_F(Wcn6750TestSuitTest, KnowsTheWordsOfTheTool) {
    EXPECT_EQ("12", mSuit.getBgRateIndex("36"));
    EXPECT_EQ("--rateBw 8 -M 2", mSuit.getAxbandwidthPara("20"));
    EXPECT_EQ("-M 6", mSuit.bandwidthIndex("40", true));
    EXPECT_THAT(mShell.log(), IsEmpty());
    EXPECT_EQ("-M 1", mSuit.bandwidthIndex("80", false));
    EXPECT_THAT(mShell.log(), ElementsAre(error(kTag, "bandwidth error : 80, use default 20MHz")));
    mShell.clear();
    EXPECT_EQ("3", mSuit.Wcn6750ParseReceivedPacketNum("goodPackets 2 3 4"));
    EXPECT_THAT(mShell.log(), ElementsAre(debug(kTag, "received packets: 3")));
}

/** Has a stop of its own, which tells whether another operation uses it. */
class OwnStop : public Wcn6750TestSuit {
  public:
    int RunTxStop(const std::string& channel) override { return channel == "6" ? 42 : 0; }
};

TEST_F(Wcn6750TestSuitTest, TheToneStopFollowsASubclassStop) {
    OwnStop suit;
    EXPECT_EQ(42, suit.RunTxStStop("6"));
}

} // namespace
} // namespace vendor::korvan::bex::wifi::V1_0::implementation
