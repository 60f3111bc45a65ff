// Copyright 2026 The BEX Wi-Fi Authors
// SPDX-License-Identifier: Apache-2.0

#include <android-base/strings.h>
#include <gmock/gmock.h>
#include <gtest/gtest.h>

#include <algorithm>

#include "FakeService.h"
#include "Matches.h"
#include "client/Help.h"
#include "client/base/Json.h"

namespace vendor::korvan::bex::wifi::client {
namespace {

using ::testing::HasSubstr;
using ::testing::StartsWith;

// As it was before it was wrapped.
std::string inOneLine(const std::string& text) {
    std::string line;
    for (const std::string& word : matches(text, "[^[:space:]]+")) {
        line += (line.empty() ? "" : " ") + word;
    }
    return line;
}

TEST(HelpTest, FitsIntoEightyColumns) {
    std::string all = helpText() + versionText() + listText();
    for (const char* topic : {"list", "doctor", "stop"}) all += helpOnTopic(topic).value();
    for (const Command& command : commands()) all += helpText(command);
    for (const std::string& line : ::android::base::Split(all, "\n")) {
        EXPECT_LE(line.size(), 80u) << line;
        EXPECT_FALSE(::android::base::EndsWith(line, " ")) << line;
    }
}

TEST(HelpTest, AnExampleIsACallThatTheClientTakes) {
    for (const Command& command : commands()) {
        const std::string help = helpText(command);
        const size_t at = help.find("Example: bex-wifi-client ");
        ASSERT_NE(at, std::string::npos);
        Request request;
        std::string problem;
        const std::string words = ::android::base::Trim(help.substr(at + 25));
        EXPECT_TRUE(readRequest(::android::base::Split(words, " "), &request, &problem)) << problem;
    }
}

TEST(HelpTest, TheVersionNamesTheInterfacesHash) {
    const ::android::sp<FakeService> service = new FakeService;
    std::string hash;
    service->IWifiService::getHashChain([&hash](const auto& chain) {
        hash = hexDigits({reinterpret_cast<const char*>(chain[0].data()), chain[0].size()});
    });
    EXPECT_THAT(versionText(), HasSubstr("\n" + hash + "\n"));
    EXPECT_THAT(versionText(),
                HasSubstr(std::string("\n") + V1_0::IWifiService::descriptor + "\n"));
}

TEST(HelpTest, NamesEveryMethodOptionAndExitCode) {
    const std::string help = helpText();
    for (const Command& command : commands()) {
        EXPECT_THAT(help, HasSubstr("\n  " + std::string(command.name) + " "));
        EXPECT_THAT(inOneLine(help), HasSubstr(command.summary));
    }
    for (const char* option :
         {"--json", "--require-count", "--strict", "--timeout SECONDS", "--help, -h", "--version",
          "list [--json]", "doctor [--json]", "stop [--json] [CHANNEL]", "  -- "}) {
        EXPECT_THAT(help, HasSubstr(option));
    }
    for (int exitCode = 0; exitCode <= 7; ++exitCode) {
        EXPECT_THAT(help, HasSubstr("\n  " + std::to_string(exitCode) + "  "));
    }
}

TEST(HelpTest, EveryMethodExplainsEachArgumentAndItsResult) {
    for (const Command& command : commands()) {
        SCOPED_TRACE(command.name);
        const std::string help = inOneLine(helpText(command));
        std::string usage = "Usage: bex-wifi-client [OPTION]... " + std::string(command.name);
        for (const ArgumentKind* argument : command.arguments) {
            usage += " " + std::string(argument->name);
            EXPECT_THAT(help, HasSubstr(" " + std::string(argument->name) + " "));
            EXPECT_THAT(help, HasSubstr(argument->meaning));
            EXPECT_THAT(help, HasSubstr(argument->accepted));
            EXPECT_THAT(help, HasSubstr(argument->unit));
        }
        EXPECT_THAT(help, StartsWith(usage + " " + command.summary + " "));
        EXPECT_THAT(help, HasSubstr(command.result->meaning));
    }
}

TEST(HelpTest, AMethodsHelpReadsLikeThis) {
    EXPECT_EQ(helpText(*findCommand("snifferStop")),
              "Usage: bex-wifi-client [OPTION]... snifferStop\n"
              "Ends the packet capture and monitor mode; leaves the interface down.\n"
              "\n"
              "Result (int32): 0 when every command succeeded, -1 when at least one failed;\n"
              "  some chip families tolerate an insmod that fails\n"
              "Example: bex-wifi-client snifferStop\n");
    EXPECT_EQ(helpText(*findCommand("RunRxNStart")),
              "Usage: bex-wifi-client [OPTION]... RunRxNStart channel bandwidth rate vht\n"
              "    antenna\n"
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
              "Result (string): \"ok\" or \"failure\", or the packet count at the start, as the\n"
              "  chip family defines\n"
              "Example: bex-wifi-client RunRxNStart 6 20 7 false 1\n");
}

TEST(HelpTest, TheListHasEachMethodAndItsSummary) {
    const std::string list = listText();
    EXPECT_THAT(list,
                StartsWith("snifferStart    Puts the driver into monitor mode on a channel and "
                           "starts the\n"
                           "                packet capture.\n"
                           "snifferStop     Ends the packet capture"));
    for (const Command& command : commands()) {
        EXPECT_THAT("\n" + list, HasSubstr("\n" + std::string(command.name) + " "));
        EXPECT_THAT(inOneLine(list), HasSubstr(command.summary));
    }
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
