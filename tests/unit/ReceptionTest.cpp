// Copyright 2026 The BEX Wi-Fi Authors
// SPDX-License-Identifier: Apache-2.0

#include "suites/BrcmTestSuit.h"
#include "suites/Reception.h"
#include "tests/unit/Expect.h"

namespace vendor::korvan::bex::wifi::V1_0::implementation {
namespace {

class ReceptionTest : public ::testing::Test {
  protected:
    ReceptionTest() { mShell.clear(); }

    RecordedShell mShell;
    BrcmTestSuit mSuit;
};

TEST_F(ReceptionTest, SaysHowAStartWent) {
    EXPECT_EQ("ok", startWord(0));
    EXPECT_EQ("failure", startWord(-1));
}

TEST_F(ReceptionTest, TakesTheLabelOffACount) {
    EXPECT_EQ("1234", countWithout(mSuit, "wlan0  n:", "wlan0  n:1234\n"));
    EXPECT_EQ("wlan0 n:1234", countWithout(mSuit, "wlan0  n:", "wlan0 n:1234\n"));
    EXPECT_EQ("12", countWithout(mSuit, "n:", "n:1\nn:2\n"));
    EXPECT_EQ("", countWithout(mSuit, "n:", ""));
}

// clang-format off

TEST_F(ReceptionTest, FindsTheGoodPackets) {
    // Without the field, the text from the last label on; pieces counts that text's fields.
    const struct { size_t field; const char *output, *count; size_t pieces; } cases[] = {
        {1, "x goodPackets 1234 badPackets 5", "1234",         4},
        {1, "goodPackets 5 goodPackets 77 ",   "77",           2},
        {1, "goodPackets: 1234",               "1234",         2},
        {1, "goodPackets = 1234",              "=",            3},
        {1, "goodPackets  9",                  "",             3},
        {1, "goodPackets",                     "goodPackets",  1},
        {1, "goodPackets ",                    "goodPackets ", 1},
        {1, "3 goodPackets:7",                 "goodPackets:7", 1},
        {1, "goodPackets 5 goodPackets",       "goodPackets",  1},
        {1, "badgoodPacketsx 6",               "6",            2},
        {1, "no label here",                   "",             0},
        {1, "GoodPackets 1 2 3",               "",             0},
        {1, "goodPacket 1 2 3",                "",             0},
        {1, "oodPackets 1 2 3",                "",             0},
        {1, "",                                "",             0},
        {2, "goodPackets : 1234 x",            "1234",         4},
        {2, "goodPackets = 5 goodPackets = 6", "6",            3},
        {2, "goodPackets  9",                  "9",            3},
        {2, "goodPackets 7",                   "goodPackets 7", 2},
        {2, "goodPackets 7 ",                  "goodPackets 7 ", 2},
        {2, "goodPackets",                     "goodPackets",  1},
        {2, "no label",                        "",             0},
    };
    for (const auto& [field, output, count, pieces] : cases) {
        mShell.clear();
        EXPECT_EQ(count, goodPackets(mSuit, "tag", field, output)) << output;
        const auto received = debug("tag", std::string("received packets: ") + count);
        if (pieces > field) {
            EXPECT_THAT(mShell.log(), ElementsAre(received)) << output;
        } else {
            EXPECT_THAT(mShell.log(),
                        ElementsAre(error("tag", rangeMessage(field, pieces)), received)) << output;
        }
    }
}

// clang-format on

TEST_F(ReceptionTest, SplitsNoFieldsAfterTheCount) {
    class SplittingSuit : public BrcmTestSuit {
      public:
        std::vector<std::string> splitString(const std::string& str,
                                             const std::string& sep) override {
            mSplit.push_back(str);
            return BrcmTestSuit::splitString(str, sep);
        }
        std::vector<std::string> mSplit;
    } suit;
    EXPECT_EQ("12", goodPackets(suit, "tag", 1, "x goodPackets 12 badPackets 3 y"));
    EXPECT_THAT(suit.mSplit, ElementsAre("goodPackets 12 "));
}

TEST_F(ReceptionTest, ReadsTheStatisticsLineByLine) {
    EXPECT_EQ("Rx: 100", receivedText(mSuit, "tag", 1, "goodPackets 100\nbadPackets 2\n"));
    EXPECT_EQ("Rx: 77", receivedText(mSuit, "tag", 1, "goodPackets 5\nx\ngoodPackets 77\n"));
    EXPECT_EQ("Rx: 2", receivedText(mSuit, "tag", 2, "goodPackets:\n1\n2\n3"));
    EXPECT_EQ("Rx: goodPackets ", receivedText(mSuit, "tag", 1, "goodPackets\n"));
    EXPECT_EQ("Rx: ", receivedText(mSuit, "tag", 1, ""));
}

} // namespace
} // namespace vendor::korvan::bex::wifi::V1_0::implementation
