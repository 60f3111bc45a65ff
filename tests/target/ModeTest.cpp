// Copyright 2026 The BEX Wi-Fi Authors
// SPDX-License-Identifier: Apache-2.0

// What the phone is and which mode its driver is in.

#include "tests/target/DisruptiveWifiTest.h"

namespace vendor::korvan::bex::wifi::target {
namespace {

TEST_P(DisruptiveWifiTest, AlwaysSaysTheSameOfMimo) {
    const std::string mimo = make(kIsMimoSupport());
    for (const Call& between : {kIsMimoSupport(), kRunTxNStart("36", "80", "9", "12", true, "3"),
                                kRunTxStop("36"), kSnifferStart("36", "40"), kSnifferStop()}) {
        make(between);
        EXPECT_EQ(make(kIsMimoSupport()), mimo) << "behind " << between.text;
    }
}

TEST_P(DisruptiveWifiTest, TellsOneModeByBothMethods) {
    for (const Call& before : {kGetWlanMode(), kRunTxBGStart("6", "54", "15", "1"), kRunTxStop("6"),
                               kRunRxBgStart("6", "54", "1"), kRunRxStop("6"),
                               kSnifferStart("6", "20"), kSnifferStop()}) {
        make(before);
        const std::string mode = make(kGetWlanMode());
        const std::string sniffer = make(kIsSnifferMode());
        // Of a mode that cannot be read isSnifferMode says true, of an unknown one false: both are
        // -1 here.
        if (mode == "-1") continue;
        EXPECT_EQ(sniffer, mode == "4" ? "true" : "false")
                << "in mode " << mode << ", behind " << before.text;
    }
}

TEST_P(DisruptiveWifiTest, EntersAndLeavesMonitorMode) {
    if (make(kSnifferStart("6", "20")) == "0") {
        EXPECT_EQ(make(kGetWlanMode()), "4");
        EXPECT_EQ(make(kIsSnifferMode()), "true");
    }
    if (make(kSnifferStop()) == "0") {
        EXPECT_EQ(make(kGetWlanMode()), "0");
        EXPECT_EQ(make(kIsSnifferMode()), "false");
    }
}

} // namespace
} // namespace vendor::korvan::bex::wifi::target
