// Copyright 2026 The BEX Wi-Fi Authors
// SPDX-License-Identifier: Apache-2.0

#include <gmock/gmock.h>
#include <gtest/gtest.h>

#include <sstream>

#include "chips/MethodUse.h"
#include "client/FamilyHelp.h"

namespace vendor::korvan::bex::wifi::client {
namespace {

using ::testing::AnyOfArray;
using ::testing::Each;
using ::testing::SizeIs;

std::string helpOn(const char* vendor, const char* chip, const char* method) {
    return familyHelp(findChipFamily(vendor, chip), *findCommand(method));
}

TEST(FamilyHelpTest, NamesTheFamilyWhatItIgnoresAndWhatSurprises) {
    EXPECT_EQ(helpOn("qcom", "QCA6174", "RunTxBGStart"),
              "\n"
              "Chip family of this phone: qca\n"
              "  ignored: power\n"
              "  Its test command is that of a reception.\n");
}

TEST(FamilyHelpTest, SaysWhereNothingIsTransmitted) {
    EXPECT_EQ(helpOn("broadcom", "bcm4375", "RunTxAxStart"),
              "\n"
              "Chip family of this phone: broadcom\n"
              "  ignored: channel, bandwidth, rate, power, guardInterval, antenna\n"
              "  Transmits nothing: no test command follows what sets the chip up.\n");
}

TEST(FamilyHelpTest, GoesByTheCaseOfTheChipsName) {
    EXPECT_EQ(helpOn("qcom", "WCN3990", "RunTxBGStart"),
              "\nChip family of this phone: wcn\n  ignored: antenna\n");
    EXPECT_EQ(helpOn("qcom", "wcn3990", "RunTxBGStart"), "\nChip family of this phone: wcn39xx\n");
}

TEST(FamilyHelpTest, IsEmptyWithoutAKnownVendor) {
    EXPECT_EQ(helpOn("acme", "WCN3990", "RunTxBGStart"), "");
}

TEST(FamilyHelpTest, EveryEntryIsOfAKnownFamilyMethodAndArgument) {
    std::vector<std::string_view> families;
    for (const ChipFamily& family : chipFamilies()) families.emplace_back(family.name);
    EXPECT_THAT(methodUses(), ::testing::Not(::testing::IsEmpty()));
    for (const MethodUse& use : methodUses()) {
        SCOPED_TRACE(use.method);
        EXPECT_THAT(use.families, Each(AnyOfArray(families)));
        const Command* command = findCommand(std::string(use.method));
        ASSERT_NE(command, nullptr);
        std::vector<std::string_view> arguments;
        for (const ArgumentKind* argument : command->arguments)
            arguments.emplace_back(argument->name);
        EXPECT_THAT(use.ignored, Each(AnyOfArray(arguments)));
        EXPECT_FALSE(use.ignored.empty() && use.remarks.empty());
    }
}

TEST(FamilyHelpTest, FitsInEightyColumns) {
    for (const ChipFamily& family : chipFamilies()) {
        for (const Command& command : commands()) {
            std::istringstream help(familyHelp(&family, command));
            for (std::string line; std::getline(help, line);) {
                EXPECT_THAT(line, SizeIs(::testing::Le(80u)));
            }
        }
    }
}

TEST(FamilyHelpTest, LongLinesAreWrapped) {
    EXPECT_EQ(useHelp({"RunTxNStart",
                       {},
                       {"channel", "bandwidth", "rate", "power", "vht", "guardInterval", "antenna",
                        "address", "ssid"},
                       {"Transmits nothing: no test command follows what sets the chip up, and the "
                        "rest of it."}}),
              "  ignored: channel, bandwidth, rate, power, vht, guardInterval, antenna,\n"
              "    address, ssid\n"
              "  Transmits nothing: no test command follows what sets the chip up, and the rest\n"
              "    of it.\n");
}

} // namespace
} // namespace vendor::korvan::bex::wifi::client
