// Copyright 2026 The BEX Wi-Fi Authors
// SPDX-License-Identifier: Apache-2.0

#include "suites/BrcmTestSuit.h"
#include "tests/unit/Expect.h"

namespace vendor::korvan::bex::wifi::V1_0::implementation {
namespace {

constexpr const char* kCounterLine =
        "wl counters  | busybox grep pktengrxdmcast | busybox awk '{for(i = 1;i <= NF;i++) "
        "{if(\"pktengrxdmcast\" == $i) print $(i + 1)} }' ";

class BrcmTestSuitTest : public ::testing::Test {
  protected:
    /** The one line of the last operation that begins with `start`. */
    std::string lineOf(const std::string& start) {
        std::string found;
        for (const std::string& line : mShell.lines()) {
            if (line.rfind(start, 0) == 0) found += line;
        }
        mShell.clear();
        return found;
    }

    RecordedShell mShell;
    BrcmTestSuit mSuit;
    std::string mOut = "left over";
};

TEST_F(BrcmTestSuitTest, LogsItsLife) {
    const std::string tag = "wifi@1.0-BrcmTestSuit-brcm";
    const std::string base = "wifi@1.0-VendorTestSuit";
    mShell.clear();
    delete static_cast<VendorTestSuit*>(new BrcmTestSuit());
    EXPECT_THAT(mShell.log(), ElementsAre(debug(base, "function at: VendorTestSuit"),
                                          debug(tag, "function at: BrcmTestSuit"),
                                          debug(tag, "function at: ~BrcmTestSuit"),
                                          debug(base, "function at: ~VendorTestSuit")));
}

// clang-format off

TEST_F(BrcmTestSuitTest, RunTxBGStart) {
    EXPECT_EQ(0, mSuit.RunTxBGStart("6", "54", "15", "1"));
    EXPECT_THAT(mShell.lines(), ElementsAre(
        "ifconfig wlan0 down ",
        "echo -n \"/etc/firmware/fw_bcmdhd_mfg.bin\" > /sys/module/bcmdhd/parameters/firmware_path ",
        "ifconfig wlan0 up ",
        "wl mpc 0 ",
        "wl phy_watchdog 0 ",
        "wl up ",
        "wl country ALL ",
        "wl band b ",
        "wl 2g_rate -r 54 -b 20 ",
        "wl channel 6 ",
        "wl phy_forcecal 1 ",
        "wl scansuppress 1 ",
        "wl phy_txpwrctrl 1 ",
        "wl txpwr1 -o -d 15 ",
        "wl pkteng_stop tx ",
        "wl txchain 1 ",
        "wl pkteng_start 00:11:22:33:44:55 tx 100 1024 0 "));
}

TEST_F(BrcmTestSuitTest, RunTxNStart) {
    EXPECT_EQ(0, mSuit.RunTxNStart("36", "80", "9", "12", true, "3"));
    EXPECT_THAT(mShell.lines(), ElementsAre(
        "ifconfig wlan0 down ",
        "echo -n \"/etc/firmware/fw_bcmdhd_mfg.bin\" > /sys/module/bcmdhd/parameters/firmware_path ",
        "ifconfig wlan0 up ",
        "wl down ",
        "wl mpc 0 ",
        "wl phy_watchdog 0 ",
        "wl bw_cap 2g 3 ",
        "wl up ",
        "wl country ALL ",
        "wl band a ",
        "wl 5g_rate -v 9 -b 80 -s 2 ",
        "wl chanspec 36/80 ",
        "wl chanspec -s 0 -c 36 -w 80 -b 5 ",
        "wl phy_forcecal 1 ",
        "wl scansuppress 1 ",
        "wl phy_txpwrctrl 1 ",
        "wl txpwr1 -o -d 12 ",
        "wl pkteng_stop tx ",
        "wl txchain 3 ",
        "wl pkteng_start 00:11:22:33:44:55 tx 100 1024 0 "));
}

TEST_F(BrcmTestSuitTest, RunTxAxStart) {
    EXPECT_EQ(0, mSuit.RunTxAxStart("36", "80", "9", "12", "0", "1"));
    EXPECT_THAT(mShell.lines(), ElementsAre(
        "ifconfig wlan0 down ",
        "echo -n \"/etc/firmware/fw_bcmdhd_mfg.bin\" > /sys/module/bcmdhd/parameters/firmware_path ",
        "ifconfig wlan0 up ",
        "wl down ",
        "wl mpc 0 ",
        "wl phy_watchdog 0 ",
        "wl bw_cap 2g 3 ",
        "wl up "));
}

TEST_F(BrcmTestSuitTest, RunTxStStart) {
    EXPECT_EQ(0, mSuit.RunTxStStart("11", "ignored", "2"));
    EXPECT_THAT(mShell.lines(), ElementsAre(
        "ifconfig wlan0 down ",
        "echo -n \"/etc/firmware/fw_bcmdhd_mfg.bin\" > /sys/module/bcmdhd/parameters/firmware_path ",
        "ifconfig wlan0 up ",
        "wl band b ",
        "wl txchain 2 ",
        "wl out ",
        "wl fqacurcy 11 "));
}

TEST_F(BrcmTestSuitTest, RunTxStStop) {
    EXPECT_EQ(0, mSuit.RunTxStStop("11"));
    EXPECT_THAT(mShell.lines(), ElementsAre(
        "wl fqacurcy 0 ",
        "ifconfig wlan0 down ",
        "echo -n \"/etc/firmware/fw_bcmdhd.bin\" > /sys/module/bcmdhd/parameters/firmware_path "));
}

TEST_F(BrcmTestSuitTest, RunTxStop) {
    EXPECT_EQ(0, mSuit.RunTxStop("6"));
    EXPECT_THAT(mShell.lines(), ElementsAre(
        "wl pkteng_stop tx ",
        "ifconfig wlan0 down ",
        "echo -n \"/etc/firmware/fw_bcmdhd.bin\" > /sys/module/bcmdhd/parameters/firmware_path "));
}

TEST_F(BrcmTestSuitTest, RunRxApJoinHoc) {
    EXPECT_EQ(0, mSuit.RunRxApJoinHoc("test ap", "192.168.1.7"));
    EXPECT_THAT(mShell.lines(), ElementsAre(
        "ifconfig wlan0 down ",
        "echo -n \"/etc/firmware/fw_bcmdhd_mfg.bin\" > /sys/module/bcmdhd/parameters/firmware_path ",
        "ifconfig wlan0 192.168.1.7 up ",
        "wl join test ap imode bss ",
        "wl mpc 0 ",
        "wl PM 0 ",
        "wl scansuppress 1 ",
        "wl frameburst 1 ",
        "wl roam_off 1 "));
}

TEST_F(BrcmTestSuitTest, RunRxBgStart) {
    mShell.answer("counters", {"7\n"});
    EXPECT_EQ(0, mSuit.RunRxBgStart("6", "ignored", "2", mOut));
    EXPECT_EQ("7", mOut);
    EXPECT_THAT(mShell.lines(), ElementsAre(
        "ifconfig wlan0 down ",
        "echo -n \"/etc/firmware/fw_bcmdhd_mfg.bin\" > /sys/module/bcmdhd/parameters/firmware_path ",
        "ifconfig wlan0 up ",
        "wl mpc 0 ",
        "wl phy_watchdog 0 ",
        "wl up ",
        "wl country ALL ",
        "wl band b ",
        "wl channel 6 ",
        "wl phy_forcecal 1 ",
        "wl scansuppress 1 ",
        "wl rxchain 2 ",
        "wl pkteng_start 00:11:22:33:44:55 rx ",
        kCounterLine));
}

TEST_F(BrcmTestSuitTest, RunRxNStart) {
    mShell.answer("counters", {"8\n"});
    EXPECT_EQ(0, mSuit.RunRxNStart("36", "80", "ignored", true, "3", mOut));
    EXPECT_EQ("8", mOut);
    EXPECT_THAT(mShell.lines(), ElementsAre(
        "ifconfig wlan0 down ",
        "echo -n \"/etc/firmware/fw_bcmdhd_mfg.bin\" > /sys/module/bcmdhd/parameters/firmware_path ",
        "ifconfig wlan0 up ",
        "wl mpc 0 ",
        "wl phy_watchdog 0 ",
        "wl up ",
        "wl country ALL ",
        "wl band a ",
        "wl chanspec 36/80 ",
        "wl phy_forcecal 1 ",
        "wl scansuppress 1 ",
        "wl rxchain 3 ",
        "wl pkteng_start 00:11:22:33:44:55 rx ",
        kCounterLine));
}

TEST_F(BrcmTestSuitTest, RunRxAxStart) {
    EXPECT_EQ(0, mSuit.RunRxAxStart("36", "80", "9", "1", mOut));
    EXPECT_EQ("ok", mOut);
    EXPECT_THAT(mShell.lines(), ElementsAre(
        "ifconfig wlan0 down ",
        "echo -n \"/etc/firmware/fw_bcmdhd_mfg.bin\" > /sys/module/bcmdhd/parameters/firmware_path ",
        "ifconfig wlan0 up ",
        "wl down ",
        "wl mpc 0 ",
        "wl phy_watchdog 0 ",
        "wl up "));
}

TEST_F(BrcmTestSuitTest, RunRxStop) {
    mShell.answer("counters", {"123\n"});
    EXPECT_EQ(0, mSuit.RunRxStop("6", mOut));
    EXPECT_EQ("123", mOut);
    EXPECT_THAT(mShell.lines(), ElementsAre(
        kCounterLine,
        "ifconfig wlan0 down ",
        "echo -n \"/etc/firmware/fw_bcmdhd.bin\" > /sys/module/bcmdhd/parameters/firmware_path "));
}

TEST_F(BrcmTestSuitTest, RunStopDriver) {
    EXPECT_EQ(0, mSuit.RunStopDriver());
    EXPECT_THAT(mShell.lines(), ElementsAre(
        "ifconfig wlan0 down ",
        "echo -n \"/etc/firmware/fw_bcmdhd.bin\" > /sys/module/bcmdhd/parameters/firmware_path "));
}

// clang-format on

TEST_F(BrcmTestSuitTest, Channel14IsTheLastOf24GHz) {
    mSuit.RunTxBGStart("14", "54", "15", "1");
    EXPECT_EQ("wl band b ", lineOf("wl band"));
    mSuit.RunTxBGStart("14", "54", "15", "1");
    EXPECT_EQ("wl 2g_rate -r 54 -b 20 ", lineOf("wl 2g_rate"));
    mSuit.RunTxNStart("14", "20", "7", "15", false, "1");
    EXPECT_EQ("wl chanspec 14/20 wl chanspec -s 0 -c 14 -w 20 -b 2 ", lineOf("wl chanspec"));
}

TEST_F(BrcmTestSuitTest, Channel15IsTheFirstOf5GHz) {
    mSuit.RunTxBGStart("15", "54", "15", "1");
    EXPECT_EQ("wl band a ", lineOf("wl band"));
    mSuit.RunTxBGStart("15", "54", "15", "1");
    EXPECT_EQ("wl 5g_rate -r 54 -b 20 ", lineOf("wl 5g_rate"));
    mSuit.RunTxStStart("36", "", "1");
    EXPECT_EQ("wl band a ", lineOf("wl band"));
}

TEST_F(BrcmTestSuitTest, HtRatesFollowTheBandAndNameNoStreams) {
    mSuit.RunTxNStart("14", "20", "7", "15", false, "3");
    EXPECT_EQ("wl 2g_rate -h 7 -b 20 ", lineOf("wl 2g_rate"));
    mSuit.RunTxNStart("15", "40", "7", "15", false, "3");
    EXPECT_EQ("wl 5g_rate -h 7 -b 40 ", lineOf("wl 5g_rate"));
}

TEST_F(BrcmTestSuitTest, VhtRatesAre5GHzRatesOnEveryChannel) {
    mSuit.RunTxNStart("1", "20", "7", "15", true, "1");
    EXPECT_EQ("wl 5g_rate -v 7 -b 20 -s 1 ", lineOf("wl 5g_rate"));
}

TEST_F(BrcmTestSuitTest, VhtStreamsFollowTheChain) {
    for (const char* chain : {"1", "2", "", "x", "-3"}) {
        mSuit.RunTxNStart("36", "20", "7", "15", true, chain);
        EXPECT_EQ("wl 5g_rate -v 7 -b 20 -s 1 ", lineOf("wl 5g_rate")) << chain;
    }
    mSuit.RunTxNStart("36", "20", "7", "15", true, "3");
    EXPECT_EQ("wl 5g_rate -v 7 -b 20 -s 2 ", lineOf("wl 5g_rate"));
}

TEST_F(BrcmTestSuitTest, AnEmptyArgumentEndsItsLine) {
    mSuit.RunTxBGStart("", "", "", "");
    const std::vector<std::string> lines = mShell.lines();
    ASSERT_EQ(17u, lines.size());
    EXPECT_EQ("wl band b ", lines[7]);
    EXPECT_EQ("wl 2g_rate -r ", lines[8]);
    EXPECT_EQ("wl channel ", lines[9]);
    EXPECT_EQ("wl txpwr1 -o -d ", lines[13]);
    EXPECT_EQ("wl txchain ", lines[15]);
}

TEST_F(BrcmTestSuitTest, AnEmptyArgumentEndsItsLineInNAndJoin) {
    mSuit.RunTxNStart("", "", "", "", true, "");
    EXPECT_EQ("wl chanspec / wl chanspec -s 0 -c ", lineOf("wl chanspec"));
    mSuit.RunTxNStart("36", "", "7", "", true, "3");
    EXPECT_EQ("wl 5g_rate -v 7 -b ", lineOf("wl 5g_rate"));
    mSuit.RunRxApJoinHoc("", "");
    EXPECT_EQ("wl join ", lineOf("wl join"));
    mSuit.RunRxApJoinHoc("", "");
    EXPECT_EQ("ifconfig wlan0 down ifconfig wlan0 ", lineOf("ifconfig"));
}

TEST_F(BrcmTestSuitTest, ArgumentsReachTheShellAsTheyStand) {
    mSuit.RunTxBGStart("6; reboot", "$(id)", "\"15", "1 2");
    const std::vector<std::string> lines = mShell.lines();
    EXPECT_EQ("wl 2g_rate -r $(id) -b 20 ", lines[8]);
    EXPECT_EQ("wl channel 6; reboot ", lines[9]);
    EXPECT_EQ("wl txpwr1 -o -d \"15 ", lines[13]);
    EXPECT_EQ("wl txchain 1 2 ", lines[15]);
}

TEST_F(BrcmTestSuitTest, AFailedLineStopsNothingAndGivesMinusOne) {
    failEachLine(mShell, [&] { return mSuit.RunTxBGStart("6", "54", "15", "1"); });
    failEachLine(mShell, [&] { return mSuit.RunTxNStart("36", "80", "9", "12", true, "3"); });
    failEachLine(mShell, [&] { return mSuit.RunTxAxStart("", "", "", "", "", ""); });
    failEachLine(mShell, [&] { return mSuit.RunTxStStart("6", "", "1"); });
    failEachLine(mShell, [&] { return mSuit.RunTxStStop("6"); });
    failEachLine(mShell, [&] { return mSuit.RunTxStop("6"); });
    failEachLine(mShell, [&] { return mSuit.RunRxApJoinHoc("ap", "192.168.1.7"); });
    failEachLine(mShell, [&] { return mSuit.RunRxBgStart("6", "", "1", mOut); });
    failEachLine(mShell, [&] { return mSuit.RunRxNStart("6", "20", "", false, "1", mOut); });
    failEachLine(mShell, [&] { return mSuit.RunRxAxStart("", "", "", "", mOut); });
    failEachLine(mShell, [&] { return mSuit.RunStopDriver(); });
}

TEST_F(BrcmTestSuitTest, TheReceptionStopAnswersForItsCounterAlone) {
    mShell.answer("counters", {"5\n"});
    mShell.answer("ifconfig", failing());
    mShell.answer("echo", failing());
    EXPECT_EQ(0, mSuit.RunRxStop("6", mOut));
    EXPECT_EQ("5", mOut);
    EXPECT_EQ(3u, mShell.lines().size());

    mShell.answer("counters", failing("5\n"));
    EXPECT_EQ(-1, mSuit.RunRxStop("6", mOut));
    EXPECT_EQ("", mOut);
}

TEST_F(BrcmTestSuitTest, AFailedAxReceptionSaysFailure) {
    mShell.answer("wl mpc", failing());
    EXPECT_EQ(-1, mSuit.RunRxAxStart("", "", "", "", mOut));
    EXPECT_EQ("failure", mOut);
}

TEST_F(BrcmTestSuitTest, AStartHandsOverTheCountAlsoAfterAFailure) {
    mShell.answer("wl band", failing());
    mShell.answer("counters", {"9\n"});
    EXPECT_EQ(-1, mSuit.RunRxBgStart("6", "", "1", mOut));
    EXPECT_EQ("9", mOut);
}

TEST_F(BrcmTestSuitTest, TheCountIsWhatTheCounterCommandPrints) {
    const std::pair<const char*, const char*> cases[] = {
            {"123\n", "123"},
            {"", ""},
            {"1\n2\n", "12"},
            {"pktengrxdmcast 4\n", " 4"},
            {"no number\n", "no number"},
            {"pkteng\nrxdmcast5\n", "5"},
    };
    for (const auto& [output, count] : cases) {
        mShell.answer("counters", {output});
        mSuit.RunRxStop("6", mOut);
        EXPECT_EQ(count, mOut) << output;
    }
}

} // namespace
} // namespace vendor::korvan::bex::wifi::V1_0::implementation
