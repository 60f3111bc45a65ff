// Copyright 2026 The BEX Wi-Fi Authors
// SPDX-License-Identifier: Apache-2.0

#include "suites/WcnTestSuit.h"
#include "tests/unit/Expect.h"

namespace vendor::korvan::bex::wifi::V1_0::implementation {
namespace {

class WcnTestSuitTest : public ::testing::Test {
  protected:
    WcnTestSuitTest() {
        mShell.readable("/system/lib/modules/wlan.ko");
        mSuit.getFwPath();
        mShell.clear();
    }

    /** The words after a private command in the last operation. */
    std::string wordsOf(const std::string& command) {
        const std::string start = "iwpriv wlan0 " + command + " ";
        std::string words;
        for (const std::string& line : mShell.lines()) {
            if (line.rfind(start, 0) == 0) words += line.substr(start.size());
        }
        mShell.clear();
        return words;
    }

    RecordedShell mShell;
    WcnTestSuit mSuit;
    std::string mOut = "left over";
};

// clang-format off

TEST_F(WcnTestSuitTest, RunTxBGStart) {
    EXPECT_EQ(0, mSuit.RunTxBGStart("11", "5.5", "12", ""));
    EXPECT_THAT(mShell.lines(), ElementsAre(
        "iwpriv wlan0 ftm 0 ",
        "rmmod wlan.ko ",
        "insmod /system/lib/modules/wlan.ko con_mode=5 ",
        "iwpriv wlan0 ftm 1 ",
        "iwpriv wlan0 ena_chain 2 ",
        "iwpriv wlan0 set_channel 11 ",
        "iwpriv wlan0 pwr_cntl_mode 2 ",
        "iwpriv wlan0 set_txpower 12 ",
        "iwpriv wlan0 set_txrate 11B_LONG_5_5_MBPS ",
        "iwpriv wlan0 tx 1 "));
}

TEST_F(WcnTestSuitTest, RunTxNStart) {
    EXPECT_EQ(0, mSuit.RunTxNStart("36", "80", "9", "15", true, "x"));
    EXPECT_THAT(mShell.lines(), ElementsAre(
        "iwpriv wlan0 ftm 0 ",
        "rmmod wlan.ko ",
        "insmod /system/lib/modules/wlan.ko con_mode=5 ",
        "iwpriv wlan0 ftm 1 ",
        "iwpriv wlan0 ena_chain 2 ",
        "iwpriv wlan0 set_cb 4 ",
        "iwpriv wlan0 set_channel 36 ",
        "iwpriv wlan0 pwr_cntl_mode 2 ",
        "iwpriv wlan0 set_txpower 15 ",
        "iwpriv wlan0 set_txrate MCS_VHT80_NGI_CB_390_MBPS ",
        "iwpriv wlan0 tx 1 "));
}

TEST_F(WcnTestSuitTest, RunTxAxStart) {
    EXPECT_EQ(0, mSuit.RunTxAxStart("36", "80", "9", "12", "0", "1"));
    EXPECT_THAT(mShell.lines(), ElementsAre(
        "iwpriv wlan0 ftm 0 ",
        "rmmod wlan.ko ",
        "insmod /system/lib/modules/wlan.ko con_mode=5 ",
        "iwpriv wlan0 ftm 1 "));
}

TEST_F(WcnTestSuitTest, RunTxStStart) {
    EXPECT_EQ(0, mSuit.RunTxStStart("36", "80", "ignored"));
    EXPECT_THAT(mShell.lines(), ElementsAre(
        "rmmod wlan ",
        "insmod /system/lib/modules/wlan.ko con_mode=5 ",
        "iwpriv wlan0 ftm 1 ",
        "iwpriv wlan0 set_cb 4 ",
        "iwpriv wlan0 set_channel 36 ",
        "iwpriv wlan0 ena_chain 2 ",
        "iwpriv wlan0 set_tx_wf_gain 0 1 ",
        "iwpriv wlan0 tx_cw_rf_gen 1 "));
}

TEST_F(WcnTestSuitTest, RunTxStStop) {
    EXPECT_EQ(0, mSuit.RunTxStStop("6"));
    EXPECT_THAT(mShell.lines(), ElementsAre(
        "iwpriv wlan0 tx_cw_rf_gen 0 ",
        "iwpriv wlan0 ftm 0 ",
        "rmmod wlan ",
        "insmod /system/lib/modules/wlan.ko "));
}

TEST_F(WcnTestSuitTest, RunTxStop) {
    EXPECT_EQ(0, mSuit.RunTxStop("6"));
    EXPECT_THAT(mShell.lines(), ElementsAre("iwpriv wlan0 tx 0 "));
}

TEST_F(WcnTestSuitTest, RunRxApJoinHoc) {
    EXPECT_EQ(0, mSuit.RunRxApJoinHoc("test ap", "192.168.1.7"));
    EXPECT_THAT(mShell.lines(), ElementsAre(
        "iwpriv wlan0 ftm 0 ",
        "rmmod wlan.ko ",
        "insmod /system/lib/modules/wlan.ko ",
        "iwlist wlan0 scan ",
        "iwconfig wlan0 essid test ap ",
        "iwpriv wlan0 setPower 2 ",
        "iwpriv wlan0 setPower 10 ",
        "iwpriv wlan0 setPower 0 ",
        "ifconfig wlan0 192.168.1.7 ",
        "ping -c 4 192.168.1.1 "));
}

TEST_F(WcnTestSuitTest, RunRxBgStart) {
    mShell.answer("get_rxpktcnt", {"wlan0     get_rxpktcnt:0\n"});
    EXPECT_EQ(0, mSuit.RunRxBgStart("6", "ignored", "ignored", mOut));
    EXPECT_EQ("0", mOut);
    EXPECT_THAT(mShell.lines(), ElementsAre(
        "iwpriv wlan0 ftm 0 ",
        "rmmod wlan.ko ",
        "insmod /system/lib/modules/wlan.ko con_mode=5 ",
        "iwpriv wlan0 ftm 1 ",
        "iwpriv wlan0 ena_chain 1 ",
        "iwpriv wlan0 set_channel 6 ",
        "iwpriv wlan0 rx 0 ",
        "iwpriv wlan0 clr_rxpktcnt 1 ",
        "iwpriv wlan0 rx 1 ",
        "iwpriv wlan0 get_rxpktcnt "));
}

TEST_F(WcnTestSuitTest, RunRxNStart) {
    mShell.answer("get_rxpktcnt", {"wlan0     get_rxpktcnt:3\n"});
    EXPECT_EQ(0, mSuit.RunRxNStart("36", "80", "9", true, "3", mOut));
    EXPECT_EQ("3", mOut);
    EXPECT_THAT(mShell.lines(), ElementsAre(
        "iwpriv wlan0 ftm 0 ",
        "rmmod wlan.ko ",
        "insmod /system/lib/modules/wlan.ko con_mode=5 ",
        "iwpriv wlan0 ftm 1 ",
        "iwpriv wlan0 ena_chain 1 ",
        "iwpriv wlan0 set_channel 36 ",
        "iwpriv wlan0 rx 0 ",
        "iwpriv wlan0 clr_rxpktcnt 1 ",
        "iwpriv wlan0 rx 1 ",
        "iwpriv wlan0 get_rxpktcnt "));
}

TEST_F(WcnTestSuitTest, RunRxAxStart) {
    EXPECT_EQ(0, mSuit.RunRxAxStart("36", "80", "9", "1", mOut));
    EXPECT_EQ(" ", mOut);
    EXPECT_THAT(mShell.lines(), ElementsAre(
        "iwpriv wlan0 ftm 0 ",
        "rmmod wlan.ko ",
        "insmod /system/lib/modules/wlan.ko con_mode=5 ",
        "iwpriv wlan0 ftm 1 "));
}

TEST_F(WcnTestSuitTest, RunRxStop) {
    mShell.answer("get_rxpktcnt", {"wlan0     get_rxpktcnt:1234\n"});
    EXPECT_EQ(0, mSuit.RunRxStop("6", mOut));
    EXPECT_EQ("1234", mOut);
    EXPECT_THAT(mShell.lines(), ElementsAre(
        "iwpriv wlan0 get_rxpktcnt ",
        "iwpriv wlan0 ftm 0 ",
        "rmmod wlan.ko ",
        "insmod /system/lib/modules/wlan.ko "));
}

TEST_F(WcnTestSuitTest, BondingAndRateFollowStandardAndBandwidth) {
    const struct { bool vht; const char *bandwidth, *mcs, *bonding, *rate; } cases[] = {
        {false, "20",  "7",  "0 ", "MCS_65_MBPS "},
        {false, "20",  "8",  "0 ", "MCS_72_2_MBPS "},
        {false, "40",  "0",  "2 ", "MCS_CB_13_5_MBPS "},
        {false, "40",  "7",  "2 ", "MCS_CB_135_MBPS "},
        {false, "80",  "0",  "0 ", "MCS_6_5_MBPS "},
        {false, "",    "1",  "0 ", "MCS_13_MBPS "},
        {true,  "20",  "8",  "0 ", "MCS_VHT20_NGI_78_MBPS "},
        {true,  "40",  "9",  "1 ", "MCS_VHT40_NGI_CB_180_MBPS "},
        {true,  "80",  "x",  "4 ", "MCS_VHT80_NGI_CB_29_3_MBPS "},
        {true,  "160", "2",  "0 ", "MCS_19_5_MBPS "},
        {true,  "abc", "2",  "0 ", "MCS_19_5_MBPS "},
        {true,  "40x", "0",  "1 ", "MCS_VHT40_NGI_CB_13_5_MBPS "},
        // No such rate: the line ends.
        {false, "20",  "9",  "0 ", ""},
        {false, "40",  "8",  "2 ", ""},
        {true,  "20",  "9",  "0 ", ""},
        {true,  "80",  "10", "4 ", ""},
        {true,  "80",  "-1", "4 ", ""},
    };
    for (const auto& [vht, bandwidth, mcs, bonding, rate] : cases) {
        mSuit.RunTxNStart("6", bandwidth, mcs, "10", vht, "");
        EXPECT_EQ(bonding, wordsOf("set_cb")) << bandwidth;
        mSuit.RunTxNStart("6", bandwidth, mcs, "10", vht, "");
        EXPECT_EQ(rate, wordsOf("set_txrate")) << mcs;
    }
}

TEST_F(WcnTestSuitTest, TheToneIsBondedByBandwidthAlone) {
    const std::pair<const char*, const char*> cases[] = {
        {"20", "0 "}, {"40", "1 "}, {"80", "4 "}, {"160", "0 "}, {"", "0 "}, {"80x", "4 "},
    };
    for (const auto& [bandwidth, bonding] : cases) {
        mSuit.RunTxStStart("6", bandwidth, "");
        EXPECT_EQ(bonding, wordsOf("set_cb")) << bandwidth;
    }
}

// clang-format on

TEST_F(WcnTestSuitTest, AToneWithoutChannelIsOnChannel1) {
    mSuit.RunTxStStart("", "20", "");
    EXPECT_EQ("1 ", wordsOf("set_channel"));
}

TEST_F(WcnTestSuitTest, AnEmptyArgumentEndsItsLine) {
    mSuit.RunTxBGStart("", "", "", "");
    EXPECT_EQ("", wordsOf("set_channel"));
    mSuit.RunTxBGStart("", "", "", "");
    EXPECT_EQ("", wordsOf("set_txpower"));
    mSuit.RunTxBGStart("", "", "", "");
    EXPECT_EQ("11B_LONG_1_MBPS ", wordsOf("set_txrate"));
    mSuit.RunRxApJoinHoc("", "");
    EXPECT_EQ("iwconfig wlan0 essid ", mShell.lines()[4]);
    EXPECT_EQ("ifconfig wlan0 ", mShell.lines()[8]);
}

TEST_F(WcnTestSuitTest, AFailedLineStopsNothingAndGivesMinusOne) {
    failEachLine(mShell, [&] { return mSuit.RunTxBGStart("6", "54", "15", ""); });
    failEachLine(mShell, [&] { return mSuit.RunTxNStart("6", "20", "7", "15", true, ""); });
    failEachLine(mShell, [&] { return mSuit.RunTxAxStart("", "", "", "", "", ""); });
    failEachLine(mShell, [&] { return mSuit.RunTxStStart("6", "", ""); });
    failEachLine(mShell, [&] { return mSuit.RunTxStStop(""); });
    failEachLine(mShell, [&] { return mSuit.RunTxStop(""); });
    failEachLine(mShell, [&] { return mSuit.RunRxApJoinHoc("ap", "192.168.1.7"); });
    failEachLine(mShell, [&] { return mSuit.RunRxBgStart("6", "", "", mOut); });
    failEachLine(mShell, [&] { return mSuit.RunRxNStart("6", "", "", true, "", mOut); });
    failEachLine(mShell, [&] { return mSuit.RunRxAxStart("", "", "", "", mOut); });
    EXPECT_EQ(" ", mOut);
    failEachLine(mShell, [&] { return mSuit.RunRxStop("", mOut); });
}

TEST_F(WcnTestSuitTest, TheCountComesFromTheCounterAlone) {
    mShell.answer("", {"wlan0     get_rxpktcnt:8\n"});
    mShell.answer("get_rxpktcnt", failing("wlan0     get_rxpktcnt:7\n"));
    EXPECT_EQ(-1, mSuit.RunRxStop("", mOut));
    EXPECT_EQ("", mOut);
    mOut = "left over";
    EXPECT_EQ(-1, mSuit.RunRxBgStart("6", "", "", mOut));
    EXPECT_EQ("", mOut);
    mShell.answer("get_rxpktcnt", {"wlan0 get_rxpktcnt:7\n"});
    EXPECT_EQ(0, mSuit.RunRxStop("", mOut));
    EXPECT_EQ("wlan0 get_rxpktcnt:7", mOut);
}

/** Writes down what its RunRxBgStart is given. */
class OwnReception : public WcnTestSuit {
  public:
    int RunRxBgStart(const std::string& channel, const std::string& rate,
                     const std::string& antenna, std::string& out) override {
        out = channel + "," + rate + "," + antenna;
        return 42;
    }
    int RunTxStop(const std::string&) override { return 42; }
};

TEST_F(WcnTestSuitTest, TheNReceptionIsASubclassBgReception) {
    OwnReception suit;
    EXPECT_EQ(42, suit.RunRxNStart("36", "80", "9", true, "3", mOut));
    EXPECT_EQ("36,9,3", mOut);
}

TEST_F(WcnTestSuitTest, TheToneStopIsItsOwn) {
    OwnReception suit;
    EXPECT_EQ(0, suit.RunTxStStop("6"));
    EXPECT_EQ(4u, mShell.lines().size());
}

} // namespace
} // namespace vendor::korvan::bex::wifi::V1_0::implementation
