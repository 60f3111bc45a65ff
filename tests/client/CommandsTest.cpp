// Copyright 2026 The BEX Wi-Fi Authors
// SPDX-License-Identifier: Apache-2.0

#include <gmock/gmock.h>
#include <gtest/gtest.h>

#include "FakeService.h"
#include "client/Commands.h"

namespace vendor::korvan::bex::wifi::client {
namespace {

using ::android::sp;
using ::testing::ElementsAre;
using ::testing::HasSubstr;
using ::testing::Not;
using Words = std::vector<std::string>;

std::string problemOf(const Words& words) {
    Request request;
    std::string problem;
    return readRequest(words, &request, &problem) ? "none" : problem;
}

Answer callWith(const Words& words, FakeService& service) {
    Request request;
    std::string problem;
    EXPECT_TRUE(readRequest(words, &request, &problem)) << problem;
    return request.command->call(service, request.values);
}

struct Example {
    Words words;
    /** As FakeService notes it. */
    Words call;
    const char* answer;
};

// In the interface's order.
const std::vector<Example> kExamples = {
        {{"snifferStart", "36", "80"}, {"snifferStart", "36", "80"}, "7"},
        {{"snifferStop"}, {"snifferStop"}, "7"},
        {{"isSnifferMode"}, {"isSnifferMode"}, "true"},
        {{"getWlanMode"}, {"getWlanMode"}, "7"},
        {{"isMimoSupport"}, {"isMimoSupport"}, "true"},
        {{"RunTxBGStart", "1", "5.5", "20", "3"}, {"RunTxBGStart", "1", "5.5", "20", "3"}, "7"},
        {{"RunTxNStart", "6", "40", "7", "15", "true", "1"},
         {"RunTxNStart", "6", "40", "7", "15", "yes", "1"},
         "7"},
        {{"RunTxAxStart", "100", "160", "11", "14", "800", "2"},
         {"RunTxAxStart", "100", "160", "11", "14", "800", "2"},
         "7"},
        {{"RunTxStop", "6"}, {"RunTxStop", "6"}, "7"},
        {{"RunTxStStart", "6", "20", "1"}, {"RunTxStStart", "6", "20", "1"}, "7"},
        {{"RunTxStStop", "6"}, {"RunTxStStop", "6"}, "7"},
        {{"RunRxApJoinHoc", "lab net", "10.0.0.2"}, {"RunRxApJoinHoc", "lab net", "10.0.0.2"}, "7"},
        {{"RunRxBgStart", "6", "11", "1"}, {"RunRxBgStart", "6", "11", "1"}, "Rx: 12"},
        {{"RunRxNStart", "6", "20", "7", "false", "1"},
         {"RunRxNStart", "6", "20", "7", "no", "1"},
         "Rx: 12"},
        {{"RunRxAxStart", "6", "20", "7", "1"}, {"RunRxAxStart", "6", "20", "7", "1"}, "Rx: 12"},
        {{"RunRxStop", "6"}, {"RunRxStop", "6"}, "Rx: 12"},
};

class CommandsTest : public ::testing::Test {
  protected:
    CommandsTest() {
        mService->number = 7;
        mService->flag = true;
        mService->text = "Rx: 12";
    }

    const sp<FakeService> mService = new FakeService;
};

TEST_F(CommandsTest, HasTheSixteenMethodsInTheInterfacesOrder) {
    ASSERT_EQ(commands().size(), kExamples.size());
    for (size_t i = 0; i < kExamples.size(); ++i) {
        EXPECT_EQ(commands()[i].name, kExamples[i].words[0]);
        EXPECT_EQ(findCommand(kExamples[i].words[0]), &commands()[i]);
    }
}

TEST_F(CommandsTest, EveryMethodGetsItsArgumentsInOrderAndPrintsItsAnswer) {
    for (const Example& example : kExamples) {
        SCOPED_TRACE(example.words[0]);
        mService->calls.clear();
        const Answer answer = callWith(example.words, *mService);
        EXPECT_THAT(mService->calls, ElementsAre(example.call));
        EXPECT_TRUE(answer.delivered);
        EXPECT_EQ(answer.text, example.answer);
        EXPECT_EQ(answer.transportError, "");
    }
}

TEST_F(CommandsTest, EveryMethodTellsOfAFailedTransport) {
    mService->broken = ::android::DEAD_OBJECT;
    for (const Example& example : kExamples) {
        SCOPED_TRACE(example.words[0]);
        const Answer answer = callWith(example.words, *mService);
        EXPECT_FALSE(answer.delivered);
        EXPECT_EQ(answer.text, "");
        EXPECT_THAT(answer.transportError, HasSubstr("DEAD_OBJECT"));
    }
}

TEST_F(CommandsTest, AnswersTheOtherFlagAndNegativeNumbers) {
    mService->flag = false;
    mService->number = -1;
    EXPECT_EQ(callWith({"isSnifferMode"}, *mService).text, "false");
    EXPECT_EQ(callWith({"isMimoSupport"}, *mService).text, "false");
    EXPECT_EQ(callWith({"getWlanMode"}, *mService).text, "-1");
}

TEST_F(CommandsTest, AMethodThatNeverAnswersHasNotDelivered) {
    mService->silent = true;
    const Answer answer = callWith({"RunRxStop", "6"}, *mService);
    EXPECT_FALSE(answer.delivered);
    EXPECT_EQ(answer.transportError, "the method returned without an answer");
}

TEST_F(CommandsTest, AMethodThatAnswersTwiceHasNotDelivered) {
    mService->doubled = true;
    const Answer answer = callWith({"RunRxStop", "6"}, *mService);
    EXPECT_FALSE(answer.delivered);
    EXPECT_EQ(answer.transportError, "the method answered more than once");
}

TEST_F(CommandsTest, ArgumentsAndTextsPassByteForByte) {
    std::string everyByte;
    for (int byte = 0; byte < 256; ++byte) everyByte += static_cast<char>(byte);
    const std::string large(100'000, '\xFE');
    mService->text = everyByte + large;

    const Answer answer = callWith({"RunRxBgStart", everyByte, "", large}, *mService);
    EXPECT_THAT(mService->calls, ElementsAre(Words{"RunRxBgStart", everyByte, "", large}));
    EXPECT_TRUE(answer.text == everyByte + large);
}

TEST_F(CommandsTest, ABooleanIsAnyOfFourTexts) {
    const auto vhtFor = [this](const std::string& text) {
        mService->calls.clear();
        callWith({"RunTxNStart", "6", "40", "7", "15", text, "1"}, *mService);
        return mService->calls.at(0).at(5);
    };
    EXPECT_EQ(vhtFor("true"), "yes");
    EXPECT_EQ(vhtFor("1"), "yes");
    EXPECT_EQ(vhtFor("false"), "no");
    EXPECT_EQ(vhtFor("0"), "no");
    for (const char* text : {"", "TRUE", "yes", "2", "true ", "01", "-1"}) {
        EXPECT_EQ(problemOf({"RunRxNStart", "6", "20", "7", text, "1"}),
                  "vht is true, false, 1 or 0, not \"" + std::string(text) + "\"");
    }
}

TEST_F(CommandsTest, TellsWhichArgumentsAreExpected) {
    EXPECT_EQ(problemOf({}), "no method given");
    EXPECT_EQ(problemOf({"snifferStop", "6"}), "snifferStop takes no arguments, not 1");
    EXPECT_EQ(problemOf({"RunTxStop"}), "RunTxStop takes 1 argument (channel), not 0");
    EXPECT_EQ(problemOf({"RunTxBGStart", "1", "2", "3"}),
              "RunTxBGStart takes 4 arguments (channel rate power antenna), not 3");
    EXPECT_EQ(problemOf({"RunTxBGStart", "1", "2", "3", "4", "5"}),
              "RunTxBGStart takes 4 arguments (channel rate power antenna), not 5");
}

TEST_F(CommandsTest, TellsOfAnUnknownMethodOnOneLine) {
    EXPECT_EQ(problemOf({"RunTx\nStop", "6"}),
              "unknown method \"RunTx\\nStop\", perhaps RunTxStop");
    EXPECT_EQ(problemOf({"", "6"}), "unknown method \"\"");
    EXPECT_EQ(problemOf({"runtxstop", "6"}), "unknown method \"runtxstop\", perhaps RunTxStop");
    EXPECT_EQ(findCommand("runtxstop"), nullptr);
    EXPECT_THAT(unknownCommand("RunRxBStrat"), HasSubstr("perhaps RunRxBgStart"));
    EXPECT_THAT(unknownCommand("wlanMode"), HasSubstr("perhaps getWlanMode"));
    EXPECT_THAT(unknownCommand("start"), Not(HasSubstr("perhaps")));
    EXPECT_THAT(unknownCommand(std::string(100'000, 'x')), Not(HasSubstr("perhaps")));
}

TEST_F(CommandsTest, OnlyTheFailureOfTheResultsKindIsAFailure) {
    const auto fails = [](const char* method, const char* answer) {
        return findCommand(method)->tellsFailure({true, answer, ""});
    };
    EXPECT_TRUE(fails("RunTxStop", "-1"));
    EXPECT_TRUE(fails("getWlanMode", "-1"));
    EXPECT_FALSE(fails("getWlanMode", "4"));
    EXPECT_TRUE(fails("RunRxBgStart", "failure"));
    EXPECT_TRUE(fails("RunRxNStart", "failure"));
    EXPECT_TRUE(fails("RunRxAxStart", "failure"));
    EXPECT_TRUE(fails("RunRxStop", "failure"));
    EXPECT_FALSE(fails("RunRxStop", "-1"));
    EXPECT_FALSE(fails("RunRxStop", ""));
    EXPECT_FALSE(fails("RunRxStop", "Rx: failure"));
    EXPECT_FALSE(fails("isSnifferMode", "false"));
    EXPECT_FALSE(fails("isMimoSupport", ""));
}

} // namespace
} // namespace vendor::korvan::bex::wifi::client
