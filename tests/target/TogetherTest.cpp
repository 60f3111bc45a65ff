// Copyright 2026 The BEX Wi-Fi Authors
// SPDX-License-Identifier: Apache-2.0

// Calls that overlap are all answered; what their tools do to one radio at once is not judged.

#include <future>

#include "tests/target/DisruptiveWifiTest.h"

namespace vendor::korvan::bex::wifi::target {
namespace {

TEST_P(DisruptiveWifiTest, AnswersTwoClientsAtOnce) {
    makeTogether({
            {kRunTxBGStart("6", "54", "15", "1"), kRunTxStop("6")},
            {kRunRxBgStart("6", "54", "1"), kRunRxStop("6")},
    });
}

TEST_P(DisruptiveWifiTest, AnswersMoreClientsThanItHasThreads) {
    makeTogether({
            {kRunTxNStart("36", "80", "9", "12", true, "3"), kRunTxStop("36")},
            {kRunRxNStart("149", "40", "7", false, "2"), kRunRxStop("149")},
            {kRunTxStStart("11", "20", "1"), kRunTxStStop("11")},
            {kSnifferStart("36", "40"), kSnifferStop()},
            {kIsMimoSupport(), kGetWlanMode(), kIsSnifferMode()},
    });
}

TEST_P(DisruptiveWifiTest, AnswersAShortCallBesideALongOne) {
    const std::string mimo = make(kIsMimoSupport());
    const auto longCall =
            std::async(std::launch::async, [this] { make(kRunTxBGStart("6", "54", "15", "1")); });
    for (int i = 0; i < 10; ++i) EXPECT_EQ(make(kIsMimoSupport()), mimo);
}

} // namespace
} // namespace vendor::korvan::bex::wifi::target
