// Copyright 2026 The BEX Wi-Fi Authors
// SPDX-License-Identifier: Apache-2.0

#include <memory>
#include <typeinfo>

#include "chips/ChipFamily.h"
#include "service/ChipChoice.h"
#include "sniffer/Qca639xSnifferTool.h"
#include "sniffer/Wcn685xSnifferTool.h"
#include "suites/BrcmTestSuit.h"
#include "suites/Qca639xTestSuit.h"
#include "suites/QcaTestSuit.h"
#include "suites/Wcn39xxTestSuit.h"
#include "suites/Wcn6750TestSuit.h"
#include "suites/WcnTestSuit.h"
#include "tests/unit/Expect.h"

namespace vendor::korvan::bex::wifi::V1_0::implementation {
namespace {

// clang-format off

TEST(ChipChoiceTest, EveryFamilyGetsItsSuitAndItsSniffer) {
    const struct {
        const char *vendor, *chip;
        const std::type_info &suit, &sniffer;
    } cases[] = {
        {"broadcom", "",          typeid(BrcmTestSuit),    typeid(SnifferTool)},
        {"broadcom", "WCN3990",   typeid(BrcmTestSuit),    typeid(SnifferTool)},
        {"qcom",     "WCN3990",   typeid(WcnTestSuit),     typeid(SnifferTool)},
        {"qcom",     "xWCN",      typeid(WcnTestSuit),     typeid(SnifferTool)},
        {"qcom",     "QCA-WCN",   typeid(WcnTestSuit),     typeid(SnifferTool)},
        {"qcom",     "WCN6750",   typeid(WcnTestSuit),     typeid(SnifferTool)},
        {"qcom",     "QCA6174",   typeid(QcaTestSuit),     typeid(SnifferTool)},
        {"qcom",     "QCA639X",   typeid(QcaTestSuit),     typeid(SnifferTool)},
        {"qcom",     "QCA639x",   typeid(QcaTestSuit),     typeid(SnifferTool)},
        {"qcom",     "qca639x",   typeid(Qca639xTestSuit), typeid(Qca639xSnifferTool)},
        {"qcom",     "639x",      typeid(Qca639xTestSuit), typeid(Qca639xSnifferTool)},
        {"qcom",     "685x-639x", typeid(Qca639xTestSuit), typeid(Qca639xSnifferTool)},
        {"qcom",     "wcn685x",   typeid(Qca639xTestSuit), typeid(Wcn685xSnifferTool)},
        {"qcom",     "6750685x",  typeid(Qca639xTestSuit), typeid(Wcn685xSnifferTool)},
        {"qcom",     "wcn6750",   typeid(Wcn6750TestSuit), typeid(Wcn685xSnifferTool)},
        {"qcom",     "",          typeid(Wcn39xxTestSuit), typeid(SnifferTool)},
        {"qcom",     "WC",        typeid(Wcn39xxTestSuit), typeid(SnifferTool)},
        {"qcom",     "wcn3990",   typeid(Wcn39xxTestSuit), typeid(SnifferTool)},
        {"qcom",     "qca639X",   typeid(Wcn39xxTestSuit), typeid(SnifferTool)},
        {"qcom",     "39x",       typeid(Wcn39xxTestSuit), typeid(SnifferTool)},
        {"qcom",     "bcm4375",   typeid(Wcn39xxTestSuit), typeid(SnifferTool)},
        // A part of a part is not enough.
        {"qcom",     "CN3990",    typeid(Wcn39xxTestSuit), typeid(SnifferTool)},
        {"qcom",     "QC6174",    typeid(Wcn39xxTestSuit), typeid(SnifferTool)},
        {"qcom",     "CA6174",    typeid(Wcn39xxTestSuit), typeid(SnifferTool)},
        {"qcom",     "qca639",    typeid(Wcn39xxTestSuit), typeid(SnifferTool)},
        {"qcom",     "wcn685",    typeid(Wcn39xxTestSuit), typeid(SnifferTool)},
        {"qcom",     "wcn85x",    typeid(Wcn39xxTestSuit), typeid(SnifferTool)},
        {"qcom",     "wcn675",    typeid(Wcn39xxTestSuit), typeid(SnifferTool)},
        {"qcom",     "wcn750",    typeid(Wcn39xxTestSuit), typeid(SnifferTool)},
    };
    const RecordedShell shell;
    for (const auto& [vendor, chip, suitType, snifferType] : cases) {
        const ChipChoice* choice = chooseChip(vendor, chip);
        ASSERT_NE(nullptr, choice) << chip;
        const std::unique_ptr<const VendorTestSuit> suit(choice->makeSuit());
        const std::unique_ptr<const SnifferTool> sniffer(choice->makeSniffer());
        const VendorTestSuit& madeSuit = *suit;
        const SnifferTool& madeSniffer = *sniffer;
        EXPECT_EQ(suitType, typeid(madeSuit)) << chip;
        EXPECT_EQ(snifferType, typeid(madeSniffer)) << chip;
    }
}

// clang-format on

TEST(ChipChoiceTest, EveryFamilyHasARow) {
    for (const ChipFamily& family : chipFamilies()) {
        EXPECT_EQ(&family, findChipFamily(family.vendor, family.partOfName)) << family.name;
        EXPECT_NE(nullptr, chooseChip(family.vendor, family.partOfName)) << family.name;
    }
}

TEST(ChipChoiceTest, UnknownVendorsGetNothing) {
    for (const char* vendor : {"", "Broadcom", "broadcom ", "broadco", "roadcom", "qcom ", "Qcom",
                               "qco", "com", "other"}) {
        EXPECT_EQ(nullptr, chooseChip(vendor, "WCN3990")) << vendor;
    }
}

TEST(ChipChoiceTest, ChoosingMakesNothing) {
    const RecordedShell shell;
    chooseChip("qcom", "WCN3990");
    EXPECT_THAT(shell.log(), IsEmpty());
    EXPECT_THAT(shell.probed(), IsEmpty());
}

} // namespace
} // namespace vendor::korvan::bex::wifi::V1_0::implementation
