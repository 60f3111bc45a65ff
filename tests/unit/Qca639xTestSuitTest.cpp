// Copyright 2026 The BEX Wi-Fi Authors
// SPDX-License-Identifier: Apache-2.0

#include <functional>

#include "suites/Qca639xTestSuit.h"
#include "tests/unit/Expect.h"

namespace vendor::korvan::bex::wifi::V1_0::implementation {
namespace {

constexpr const char* kTag = "wifi@1.0-Qca639xTestSuit.qca639x";

/** A phone with two driver modules, one of them without an ending. */
struct Phone : RecordedShell {
    Phone() { directory("/vendor/lib/modules", {"qca_cld3_b.ko", "wlan.ko", "qca_cld3_a"}); }
};

class Qca639xTestSuitTest : public ::testing::Test {
  protected:
    Qca639xTestSuitTest() { mShell.clear(); }

    /** The test command that the last operation ended with. */
    std::string test() { return mShell.lines().back(); }

    Phone mShell;
    Qca639xTestSuit mSuit;
    std::string mOut = "left over";
};

// clang-format off

TEST_F(Qca639xTestSuitTest, RunTxBGStart) {
    EXPECT_EQ(0, mSuit.RunTxBGStart("6", "54", "15", "1"));
    EXPECT_THAT(mShell.lines(), ElementsAre(
        "rmmod wlan.ko ",
        "insmod /vendor/lib/modules/qca_cld3_b.ko con_mode=5 ",
        "insmod /vendor/lib/modules/qca_cld3_a con_mode=5 ",
        "sleep 1.5 ",
        "ifconfig wlan0 up ",
        "myftm -J -B dbs ",
        "myftm -J -I 1 -a 1 -r 14 -X 00:03:7F:44:55:11 -Y 00:03:7F:44:55:22 "
            "-N 00:03:7F:44:55:33 -M 0 -f 2437 -p 15 --dpdflag enable -t 3 "));
}

TEST_F(Qca639xTestSuitTest, RunTxNStart) {
    EXPECT_EQ(0, mSuit.RunTxNStart("36", "80", "7", "12", true, "2"));
    EXPECT_THAT(mShell.lines(), ElementsAre(
        "rmmod wlan.ko ",
        "insmod /vendor/lib/modules/qca_cld3_b.ko con_mode=5 ",
        "insmod /vendor/lib/modules/qca_cld3_a con_mode=5 ",
        "sleep 1.5 ",
        "ifconfig wlan0 up ",
        "myftm -J -B dbs ",
        "myftm -J -I 0 -a 2 -k 1 -M 8 -X 00:03:7F:44:55:11 -Y 00:03:7F:44:55:22 "
            "-N 00:03:7F:44:55:33 -r 22 -f 5180 -p 12 --dpdflag enable -t 3 "));
}

TEST_F(Qca639xTestSuitTest, RunTxAxStart) {
    EXPECT_EQ(0, mSuit.RunTxAxStart("36", "40", "0", "12", "0.8", "3"));
    EXPECT_THAT(mShell.lines(), ElementsAre(
        "rmmod wlan.ko ",
        "insmod /vendor/lib/modules/qca_cld3_b.ko con_mode=5 ",
        "insmod /vendor/lib/modules/qca_cld3_a con_mode=5 ",
        "sleep 1.5 ",
        "ifconfig wlan0 up ",
        "myftm -J -B dbs ",
        "myftm -J -I 0 --gI 0.8 --rateBw 9 -M 3 -a 3 -k 1 --nss 2 -X 00:03:7F:44:55:11 "
            "-Y 00:03:7F:44:55:22 -N 00:03:7F:44:55:33 -r 15 -f 5180 -p 12 "
            "--dpdflag enable -t 3 "));
}

TEST_F(Qca639xTestSuitTest, RunTxStStart) {
    EXPECT_EQ(0, mSuit.RunTxStStart("14", "ignored", "2"));
    EXPECT_THAT(mShell.lines(), ElementsAre(
        "rmmod wlan.ko ",
        "insmod /vendor/lib/modules/qca_cld3_b.ko con_mode=5 ",
        "insmod /vendor/lib/modules/qca_cld3_a con_mode=5 ",
        "sleep 1.5 ",
        "ifconfig wlan0 up ",
        "myftm -J -B dbs ",
        "myftm -J -I 1 -X 00:03:7F:44:55:11 -Y 00:03:7F:44:55:22 -N 00:03:7F:44:55:33 "
            "-a 2 -k 1 -f 2484 -t 1 "));
}

TEST_F(Qca639xTestSuitTest, RunTxStStop) {
    EXPECT_EQ(0, mSuit.RunTxStStop("36"));
    EXPECT_THAT(mShell.lines(), ElementsAre(
        "myftm -J -I 0 -t 0 ",
        "rmmod wlan.ko ",
        "insmod /vendor/lib/modules/qca_cld3_b.ko ",
        "insmod /vendor/lib/modules/qca_cld3_a "));
}

TEST_F(Qca639xTestSuitTest, RunTxStop) {
    EXPECT_EQ(0, mSuit.RunTxStop("6"));
    EXPECT_THAT(mShell.lines(), ElementsAre(
        "myftm -J -I 1 -t 0 ",
        "rmmod wlan.ko ",
        "insmod /vendor/lib/modules/qca_cld3_b.ko ",
        "insmod /vendor/lib/modules/qca_cld3_a "));
}

TEST_F(Qca639xTestSuitTest, RunRxApJoinHoc) {
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

TEST_F(Qca639xTestSuitTest, RunRxBgStart) {
    EXPECT_EQ(0, mSuit.RunRxBgStart("11", "5.5", "1", mOut));
    EXPECT_EQ("ok", mOut);
    EXPECT_THAT(mShell.lines(), ElementsAre(
        "rmmod wlan.ko ",
        "insmod /vendor/lib/modules/qca_cld3_b.ko con_mode=5 ",
        "insmod /vendor/lib/modules/qca_cld3_a con_mode=5 ",
        "sleep 1.5 ",
        "ifconfig wlan0 up ",
        "myftm -J -B dbs ",
        "myftm -J -I 1 -X 00:03:7F:44:55:11 -Y 00:03:7F:44:55:22 -N 00:03:7F:44:55:44 "
            "-a 1 -f 2462 -r 3 -M 0 -x 1 "));
}

TEST_F(Qca639xTestSuitTest, RunRxNStart) {
    EXPECT_EQ(0, mSuit.RunRxNStart("149", "40", "9", false, "2", mOut));
    EXPECT_EQ("ok", mOut);
    EXPECT_THAT(mShell.lines(), ElementsAre(
        "rmmod wlan.ko ",
        "insmod /vendor/lib/modules/qca_cld3_b.ko con_mode=5 ",
        "insmod /vendor/lib/modules/qca_cld3_a con_mode=5 ",
        "sleep 1.5 ",
        "ifconfig wlan0 up ",
        "myftm -J -B dbs ",
        "myftm -J -I 0 -X 00:03:7F:44:55:11 -Y 00:03:7F:44:55:22 -N 00:03:7F:44:55:44 "
            "-a 2 -f 5745 -M 2 -r 24 -x 1 "));
}

TEST_F(Qca639xTestSuitTest, RunRxAxStart) {
    EXPECT_EQ(0, mSuit.RunRxAxStart("36", "160", "11", "1", mOut));
    EXPECT_EQ("ok", mOut);
    EXPECT_THAT(mShell.lines(), ElementsAre(
        "rmmod wlan.ko ",
        "insmod /vendor/lib/modules/qca_cld3_b.ko con_mode=5 ",
        "insmod /vendor/lib/modules/qca_cld3_a con_mode=5 ",
        "sleep 1.5 ",
        "ifconfig wlan0 up ",
        "myftm -J -B dbs ",
        "myftm -J -I 0 --rateBw 16 -M 29 -X 00:03:7F:44:55:11 -Y 00:03:7F:44:55:22 "
            "-N 00:03:7F:44:55:44 --nss 1 -a 1 -f 5180 -r 26 -x 1 "));
}

TEST_F(Qca639xTestSuitTest, RunRxStop) {
    mShell.answer("myftm", {"goodPackets = 1234\n"});
    EXPECT_EQ(0, mSuit.RunRxStop("6", mOut));
    EXPECT_EQ("Rx: 1234", mOut);
    EXPECT_THAT(mShell.lines(), ElementsAre(
        "myftm -J -I 1 -t 0 ",
        "rmmod wlan.ko ",
        "/vendor/bin/insmod /vendor/lib/modules/qca_cld3_b.ko ",
        "/vendor/bin/insmod /vendor/lib/modules/qca_cld3_a "));
    const std::string base = "wifi@1.0-VendorTestSuit";
    const std::string first = "/vendor/bin/insmod /vendor/lib/modules/qca_cld3_b.ko ";
    const std::string second = "/vendor/bin/insmod /vendor/lib/modules/qca_cld3_a ";
    EXPECT_THAT(mShell.log(), ElementsAre(
        error(kTag, "RunRxStop: myftm -J -I 1 -t 0 "),
        debug(base, "goodPackets = 1234\n"),
        debug(base, "cmd: \"myftm -J -I 1 -t 0 \" successful execution"),
        debug(kTag, "received packets: 1234"),
        error(kTag, "RunRxStop: rmmod wlan.ko "),
        debug(base, "cmd: \"rmmod wlan.ko \" successful execution"),
        error(kTag, "RunRxStop: " + first),
        debug(base, "cmd: \"" + first + "\" successful execution"),
        error(kTag, "RunRxStop: " + second),
        debug(base, "cmd: \"" + second + "\" successful execution")));
}

// clang-format on

TEST_F(Qca639xTestSuitTest, TheBandFlagAndTheFrequencyFollowTheChannel) {
    const std::pair<const char*, const char*> cases[] = {
            {"1", "-I 1 -f 2412 "}, {"14", "-I 1 -f 2484 "}, {"15", "-I 0 -f 5075 "},
            {"0", "-I 1 -f 2412 "}, {"-5", "-I 1 -f 2412 "}, {"abc", "-I 1 -f 2412 "},
    };
    for (const auto& [channel, options] : cases) {
        mSuit.RunTxStStart(channel, "", "1");
        const std::string line = test();
        const std::string flag = line.substr(line.find("-I"), 5);
        EXPECT_EQ(options, flag + line.substr(line.find("-f"), 8)) << channel;
    }
}

TEST_F(Qca639xTestSuitTest, AnEmptyArgumentLeavesItsBlank) {
    mSuit.RunTxBGStart("", "", "", "");
    EXPECT_EQ(
            "myftm -J -I 1 -a  -r 1 -X 00:03:7F:44:55:11 -Y 00:03:7F:44:55:22 "
            "-N 00:03:7F:44:55:33 -M 0 -f 2412 -p  --dpdflag enable -t 3 ",
            test());
    mSuit.RunTxAxStart("36", "320", "x", "12", "2", "1");
    EXPECT_EQ(
            "myftm -J -I 0 --gI 2  -a 1 -k 1 --nss 1 -X 00:03:7F:44:55:11 "
            "-Y 00:03:7F:44:55:22 -N 00:03:7F:44:55:33 -r 15 -f 5180 -p 12 "
            "--dpdflag enable -t 3 ",
            test());
    mSuit.RunRxAxStart("36", "040", "7", "2", mOut);
    EXPECT_EQ(
            "myftm -J -I 0  -X 00:03:7F:44:55:11 -Y 00:03:7F:44:55:22 "
            "-N 00:03:7F:44:55:44 --nss 1 -a 2 -f 5180 -r 22 -x 1 ",
            test());
    mShell.clear();
    mSuit.RunRxApJoinHoc("", "");
    EXPECT_EQ("iwconfig wlan0 essid  ", mShell.lines()[6]);
    EXPECT_EQ("ifconfig wlan0  up ", mShell.lines()[7]);
}

TEST_F(Qca639xTestSuitTest, TheStreamsFollowTheAntenna) {
    const std::pair<const char*, const char*> cases[] = {
            {"1", "1"}, {"2", "1"}, {"3", "2"}, {"4", "2"}, {"", "1"}, {"x", "1"}, {"-3", "1"},
    };
    for (const auto& [antenna, streams] : cases) {
        mSuit.RunTxAxStart("36", "40", "0", "12", "0", antenna);
        EXPECT_NE(std::string::npos, test().find(std::string(" --nss ") + streams + " "))
                << antenna;
        mSuit.RunRxAxStart("36", "40", "0", antenna, mOut);
        EXPECT_NE(std::string::npos, test().find(std::string(" --nss ") + streams + " "))
                << antenna;
    }
}

TEST_F(Qca639xTestSuitTest, ABandwidthErrorComesBeforeTheFirstLine) {
    mSuit.RunTxNStart("6", "20", "7", "12", true, "1");
    EXPECT_NE(std::string::npos, test().find(" -k 1 -M 5 -X "));
    ASSERT_LT(2u, mShell.log(kTag).size());
    EXPECT_EQ(error(kTag, "bandwidth error : 20, use default 20MHz"), mShell.log()[0]);
    EXPECT_EQ(error(kTag, "RunTxNStart: rmmod wlan.ko "), mShell.log()[1]);
    mShell.clear();
    mSuit.RunRxNStart("6", "160", "7", true, "1", mOut);
    EXPECT_NE(std::string::npos, test().find(" -f 2437 --nss 1 --rateBw 20 -M 29 -r 22 "));
    EXPECT_EQ(error(kTag, "RunRxNStart: rmmod wlan.ko "), mShell.log()[0]);
}

TEST_F(Qca639xTestSuitTest, LogsEveryLineUnderItsOperationsName) {
    const std::pair<const char*, std::function<void()>> operations[] = {
            {"RunTxBGStart", [&] { mSuit.RunTxBGStart("6", "54", "15", "1"); }},
            {"RunTxNStart", [&] { mSuit.RunTxNStart("6", "40", "7", "12", true, "1"); }},
            {"RunTxAxStart", [&] { mSuit.RunTxAxStart("6", "40", "7", "12", "0", "1"); }},
            {"RunTxStStart", [&] { mSuit.RunTxStStart("6", "", "1"); }},
            {"RunTxStop", [&] { mSuit.RunTxStStop("6"); }},
            {"RunTxStop", [&] { mSuit.RunTxStop("6"); }},
            {"RunRxApJoinHoc", [&] { mSuit.RunRxApJoinHoc("ap", "192.168.1.7"); }},
            {"RunRxBgStart", [&] { mSuit.RunRxBgStart("6", "54", "1", mOut); }},
            {"RunRxNStart", [&] { mSuit.RunRxNStart("6", "40", "7", true, "1", mOut); }},
            {"RunRxAxStart", [&] { mSuit.RunRxAxStart("6", "40", "7", "1", mOut); }},
    };
    for (const auto& [name, operation] : operations) {
        mShell.clear();
        operation();
        std::vector<RecordedShell::LogLine> log;
        for (const std::string& line : mShell.lines()) {
            log.push_back(error(kTag, std::string(name) + ": " + line));
        }
        EXPECT_EQ(log, mShell.log(kTag));
    }
}

TEST_F(Qca639xTestSuitTest, OnlyAFailedInsmodIsForgiven) {
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

TEST_F(Qca639xTestSuitTest, AReceptionStartSaysHowItWent) {
    mShell.answer("insmod", failing());
    EXPECT_EQ(0, mSuit.RunRxBgStart("6", "54", "1", mOut));
    EXPECT_EQ("ok", mOut);
    mShell.answer("sleep", failing());
    EXPECT_EQ(-1, mSuit.RunRxBgStart("6", "54", "1", mOut));
    EXPECT_EQ("failure", mOut);
    mOut.clear();
    EXPECT_EQ(-1, mSuit.RunRxNStart("6", "40", "7", true, "1", mOut));
    EXPECT_EQ("failure", mOut);
    mOut.clear();
    EXPECT_EQ(-1, mSuit.RunRxAxStart("6", "40", "7", "1", mOut));
    EXPECT_EQ("failure", mOut);
}

TEST_F(Qca639xTestSuitTest, TheCountComesFromTheFirstLineAlone) {
    mShell.answer("", {"goodPackets = 8\n"});
    mShell.answer("myftm", failing("goodPackets = 7\n"));
    EXPECT_EQ(-1, mSuit.RunRxStop("6", mOut));
    EXPECT_EQ("Rx: ", mOut);
    mShell.answer("myftm", {"goodPackets 7"});
    mShell.clear();
    EXPECT_EQ(0, mSuit.RunRxStop("6", mOut));
    EXPECT_EQ("Rx: goodPackets 7", mOut);
    EXPECT_EQ(error(kTag, rangeMessage(2, 2)), mShell.log(kTag)[1]);
    EXPECT_EQ(debug(kTag, "received packets: goodPackets 7"), mShell.log(kTag)[2]);
    mShell.answer("myftm", {"goodPackets = 1\ngoodPackets = 2\n"});
    EXPECT_EQ(0, mSuit.RunRxStop("6", mOut));
    EXPECT_EQ("Rx: 2", mOut);
}

TEST_F(Qca639xTestSuitTest, WorksWithoutADriver) {
    mSuit.driverPaths.clear();
    EXPECT_EQ(0, mSuit.RunTxStop("6"));
    EXPECT_THAT(mShell.lines(), ElementsAre("myftm -J -I 1 -t 0 ", "rmmod wlan.ko "));
    mShell.clear();
    mShell.answer("myftm", {"goodPackets = 5"});
    EXPECT_EQ(0, mSuit.RunRxStop("36", mOut));
    EXPECT_EQ("Rx: 5", mOut);
    EXPECT_THAT(mShell.lines(), ElementsAre("myftm -J -I 0 -t 0 ", "rmmod wlan.ko "));
    mShell.clear();
    EXPECT_EQ(0, mSuit.RunTxBGStart("6", "54", "15", "1"));
    EXPECT_EQ(5u, mShell.lines().size());
}

TEST_F(Qca639xTestSuitTest, KnowsTheWordsOfTheTool) {
    EXPECT_EQ("12", mSuit.getBgRateIndex("36"));
    EXPECT_EQ("--rateBw 8 -M 2", mSuit.getAxbandwidthPara("20"));
    EXPECT_EQ("-M 6", mSuit.bandwidthIndex("40", true));
    EXPECT_THAT(mShell.log(), IsEmpty());
    EXPECT_EQ("-M 1", mSuit.bandwidthIndex("80", false));
    EXPECT_THAT(mShell.log(), ElementsAre(error(kTag, "bandwidth error : 80, use default 20MHz")));
    mShell.clear();
    EXPECT_EQ("3", mSuit.Qca639xParseReceivedPacketNum("goodPackets 2 3 4"));
    EXPECT_THAT(mShell.log(), ElementsAre(debug(kTag, "received packets: 3")));
}

/** Has a stop of its own, which tells whether another operation uses it. */
class OwnStop : public Qca639xTestSuit {
  public:
    int RunTxStop(const std::string& channel) override { return channel == "6" ? 42 : 0; }
};

TEST_F(Qca639xTestSuitTest, TheToneStopFollowsASubclassStop) {
    OwnStop suit;
    EXPECT_EQ(42, suit.RunTxStStop("6"));
}

} // namespace
} // namespace vendor::korvan::bex::wifi::V1_0::implementation
