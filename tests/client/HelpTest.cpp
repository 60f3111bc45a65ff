// Copyright 2026 The BEX Wi-Fi Authors
// SPDX-License-Identifier: Apache-2.0

#include <gmock/gmock.h>
#include <gtest/gtest.h>

#include <algorithm>

#include "client/Help.h"

namespace vendor::korvan::bex::wifi::client {
namespace {

using ::testing::HasSubstr;
using ::testing::StartsWith;

TEST(HelpTest, NamesEveryMethodOptionAndExitCode) {
    const std::string help = helpText();
    for (const Command& command : commands()) {
        EXPECT_THAT(help, HasSubstr("\n  " + std::string(command.name) + " "));
        EXPECT_THAT(help, HasSubstr(command.summary));
    }
    for (const char* option :
         {"--json", "--require-count", "--timeout SECONDS", "--help", "list [--json]",
          "doctor [--json]", "stop [--json] [CHANNEL]", "  -- "}) {
        EXPECT_THAT(help, HasSubstr(option));
    }
    for (int exitCode = 0; exitCode <= 7; ++exitCode) {
        EXPECT_THAT(help, HasSubstr("\n  " + std::to_string(exitCode) + "  "));
    }
}

TEST(HelpTest, EveryMethodExplainsEachArgumentAndItsResult) {
    for (const Command& command : commands()) {
        SCOPED_TRACE(command.name);
        const std::string help = helpText(command);
        std::string usage = "Usage: bex-wifi-client [OPTION]... " + std::string(command.name);
        for (const ArgumentKind* argument : command.arguments) {
            usage += " " + std::string(argument->name);
            EXPECT_THAT(help, HasSubstr("\n  " + std::string(argument->name) + " "));
            EXPECT_THAT(help, HasSubstr(argument->meaning));
            EXPECT_THAT(help, HasSubstr(argument->accepted));
            EXPECT_THAT(help, HasSubstr(argument->unit));
        }
        EXPECT_THAT(help, StartsWith(usage + "\n" + command.summary + "\n"));
        EXPECT_THAT(help, HasSubstr(command.result->meaning));
    }
}

TEST(HelpTest, AMethodsHelpReadsLikeThis) {
    EXPECT_EQ(helpText(*findCommand("snifferStop")),
              "Usage: bex-wifi-client [OPTION]... snifferStop\n"
              "Ends the packet capture and monitor mode; leaves the interface down.\n"
              "\n"
              "Result (int32): 0 when every command succeeded, -1 when at least one failed; some "
              "chip "
              "families tolerate an insmod that fails\n");
    EXPECT_EQ(helpText(*findCommand("RunRxNStart")),
              "Usage: bex-wifi-client [OPTION]... RunRxNStart channel bandwidth rate vht antenna\n"
              "Starts 802.11n or 802.11ac reception with a packet count, until RunRxStop.\n"
              "\n"
              "Arguments (text reaches the chip's tool as it stands, unchecked):\n"
              "  channel         the IEEE 802.11 channel number\n"
              "                  decimal: 1 to 14 (2.4 GHz), 36 and up (5 GHz)\n"
              "  bandwidth       the channel width; unit: MHz\n"
              "                  20, 40 or 80\n"
              "  rate            the MCS index\n"
              "                  decimal, such as 0 or 7\n"
              "  vht             802.11ac (VHT) rates when true, 802.11n (HT) rates when false\n"
              "                  true, false, 1 or 0\n"
              "  antenna         the receive chain or chain mask\n"
              "                  as the chip's tool expects\n"
              "\n"
              "Result (string): \"ok\" or \"failure\", or the packet count at the start, as the "
              "chip family defines\n");
}

TEST(HelpTest, TheListHasALineForEachMethod) {
    const std::string list = listText();
    EXPECT_EQ(std::count(list.begin(), list.end(), '\n'), 16);
    EXPECT_THAT(list, StartsWith("snifferStart    Puts the driver into monitor mode"));
    EXPECT_THAT(list, HasSubstr("\nRunRxStop       Ends the reception and reads its packet "
                                "count.\n"));
}

TEST(HelpTest, TheJsonListIsOneLineWithTypes) {
    const std::string list = listJson();
    EXPECT_EQ(std::count(list.begin(), list.end(), '\n'), 1);
    EXPECT_THAT(list, StartsWith("{\"schema_version\":1,\"methods\":[{\"name\":\"snifferStart\","));
    EXPECT_THAT(list, ::testing::EndsWith("}]}\n"));
    EXPECT_THAT(list, HasSubstr(R"({"name":"isMimoSupport",)"
                                R"("summary":"Tells whether the device declares MIMO support.",)"
                                R"("arguments":[],"result":{"type":"bool",)"
                                R"("meaning":"true when the device declares MIMO support"}})"));
    EXPECT_THAT(list, HasSubstr(R"({"name":"bandwidth","type":"string",)"
                                R"("meaning":"the channel width","unit":"MHz",)"
                                R"("accepted":"20, 40, 80 or 160"})"));
    EXPECT_THAT(list, HasSubstr(R"({"name":"vht","type":"bool",)"));
    EXPECT_THAT(list, HasSubstr(R"("result":{"type":"int32",)"));
    EXPECT_THAT(list, HasSubstr(R"("result":{"type":"string",)"));
}

} // namespace
} // namespace vendor::korvan::bex::wifi::client
