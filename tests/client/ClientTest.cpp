// Copyright 2026 The BEX Wi-Fi Authors
// SPDX-License-Identifier: Apache-2.0

#include <gmock/gmock.h>
#include <gtest/gtest.h>
#include <unistd.h>

#include <algorithm>
#include <regex>
#include <sstream>
#include <thread>

#include "FakeService.h"
#include "Gate.h"
#include "client/Client.h"
#include "client/Help.h"

namespace vendor::korvan::bex::wifi::client {
namespace {

using ::android::sp;
using ::testing::AllOf;
using ::testing::ElementsAre;
using ::testing::HasSubstr;
using ::testing::Not;
using ::testing::StartsWith;
using namespace std::chrono_literals;
using Words = std::vector<std::string>;

// One line that names the program and holds the text.
MATCHER_P(IsOneLineWith, text, "") {
    return std::count(arg.begin(), arg.end(), '\n') == 1 && arg.back() == '\n' &&
           arg.rfind("bex-wifi-client: ", 0) == 0 && arg.find(text) != arg.npos;
}

// What tells of the call's course differs from run to run.
std::string withoutCourse(const std::string& json) {
    return std::regex_replace(json,
                              std::regex(R"("radio_may_be_on":(true|false|null),"stage":"[a-z]+",)"
                                         R"("started_at":"[0-9-]+T[0-9:]+\.[0-9]{3}Z",)"
                                         R"("duration_ms":[0-9]+\.[0-9]{3},)"
                                         R"("client_version":"[0-9.]+",)"),
                              "COURSE,");
}

class ClientTest : public ::testing::Test {
  protected:
    int run(const Words& arguments) {
        return runClient(arguments, {mOut, mErr, mTryFind, mAwaitFind, mColumns, mSecond});
    }

    std::string out() const { return mOut.str(); }
    std::string err() const { return mErr.str(); }

    sp<FakeService> mService = new FakeService;
    int mTried = 0;
    int mAwaited = 0;
    FindService mTryFind = [this] {
        ++mTried;
        return mService;
    };
    FindService mAwaitFind = [this] {
        ++mAwaited;
        return mService;
    };
    std::function<size_t()> mColumns;
    std::chrono::nanoseconds mSecond = 1s;
    std::ostringstream mOut;
    std::ostringstream mErr;
};

TEST_F(ClientTest, PrintsTheNumberAndNothingElse) {
    EXPECT_EQ(run({"RunTxStop", "6"}), 0);
    EXPECT_EQ(out(), "0\n");
    EXPECT_EQ(err(), "");
    EXPECT_THAT(mService->calls, ElementsAre(Words{"RunTxStop", "6"}));
}

TEST_F(ClientTest, PrintsTheFlag) {
    mService->flag = true;
    EXPECT_EQ(run({"isSnifferMode"}), 0);
    mService->flag = false;
    EXPECT_EQ(run({"isMimoSupport"}), 0);
    EXPECT_EQ(out(), "true\nfalse\n");
}

TEST_F(ClientTest, AStartThatFailedSaysWhatMayBeOnAndWhatEndsIt) {
    mService->number = -1;
    EXPECT_EQ(run({"RunTxStStart", "36", "20", "1"}), 1);
    EXPECT_THAT(err(), IsOneLineWith("; the tone may be on, what ends it is: bex-wifi-client stop "
                                     "36\n"));
}

TEST_F(ClientTest, WhatEndsAStartIsACommandLineToCopyWhateverTheChannel) {
    mService->number = -1;
    EXPECT_EQ(run({"snifferStart", "6; reboot", "20"}), 1);
    EXPECT_THAT(err(), ::testing::EndsWith("; monitor mode may be on, what ends it is: "
                                           "bex-wifi-client stop\n"));
}

TEST_F(ClientTest, WhatStartsNothingLeavesNothingOn) {
    mService->number = -1;
    EXPECT_EQ(run({"RunTxStop", "6"}), 1);
    mService = nullptr;
    EXPECT_EQ(run({"RunTxBGStart", "6", "54", "15", "1"}), 3);
    EXPECT_THAT(err(), Not(HasSubstr("may be on")));
}

TEST_F(ClientTest, StopWithoutAServiceDoesNotSayThatTheRadioIsOff) {
    mService = nullptr;
    EXPECT_EQ(run({"stop", "6"}), 3);
    EXPECT_EQ(out(), "the radio may be on\n");
    EXPECT_THAT(err(), IsOneLineWith("; the radio may be on, try again: bex-wifi-client stop 6\n"));
    EXPECT_EQ(run({"stop", "6", "7"}), 2);
}

TEST_F(ClientTest, PrintsTheTextByteForByte) {
    mService->text = std::string("\xFF\0\x1B[0m\r\nx ", 9) + std::string(400'000, '\x80');
    EXPECT_EQ(run({"RunRxStop", "6"}), 0);
    EXPECT_TRUE(out() == mService->text + "\n");
    EXPECT_EQ(err(), "");
}

TEST_F(ClientTest, PassesNegativeNumbersAndWhatFollowsTwoDashes) {
    EXPECT_EQ(run({"RunTxBGStart", "1", "-20", "--", "--json", "-x"}), 0);
    EXPECT_THAT(mService->calls, ElementsAre(Words{"RunTxBGStart", "1", "-20", "--json", "-x"}));
}

TEST_F(ClientTest, LooksOnceWithoutATimeoutAndWaitsWithOne) {
    EXPECT_EQ(run({"snifferStop"}), 0);
    EXPECT_EQ(mTried, 1);
    EXPECT_EQ(mAwaited, 0);
    EXPECT_EQ(run({"snifferStop", "--timeout", "60"}), 0);
    EXPECT_EQ(mTried, 1);
    EXPECT_EQ(mAwaited, 1);
}

TEST_F(ClientTest, ExitCode1StillPrintsTheResult) {
    mService->number = -1;
    EXPECT_EQ(run({"RunTxStop", "6"}), 1);
    EXPECT_EQ(out(), "-1\n");
    EXPECT_EQ(err(),
              "bex-wifi-client: RunTxStop answered -1: which command failed is in the service's "
              "log, tags that begin with \"wifi@1.0-\": logcat (a simulated phone: ./dev log)\n");
}

TEST_F(ClientTest, ExitCode1ForAnUnknownMode) {
    mService->number = -1;
    EXPECT_EQ(run({"getWlanMode"}), 1);
    EXPECT_EQ(out(), "-1\n");
    EXPECT_THAT(err(), IsOneLineWith("getWlanMode answered -1: the driver is in another mode"));
}

TEST_F(ClientTest, ExitCode1ForTheTextFailure) {
    mService->text = "failure";
    EXPECT_EQ(run({"RunRxBgStart", "6", "11", "1"}), 1);
    EXPECT_EQ(out(), "failure\n");
    EXPECT_THAT(err(), IsOneLineWith("RunRxBgStart answered failure: which command failed is in"));
}

TEST_F(ClientTest, ExitCode2AndOneLineForWrongUsage) {
    const std::pair<Words, std::string> cases[] = {
            {{}, "no method given; see bex-wifi-client --help"},
            {{"--json"}, "no method given; see bex-wifi-client --help"},
            {{"RunTx\n", "6"}, "unknown method \"RunTx\\n\"; see bex-wifi-client --help"},
            {{"runtxstop", "6", "--json"}, "perhaps RunTxStop; see bex-wifi-client --help"},
            {{"RunTxStop"},
             "takes 1 argument (channel), not 0; see bex-wifi-client RunTxStop --help"},
            {{"RunTxStop", "6", "7"}, "takes 1 argument (channel), not 2"},
            {{"RunRxNStart", "6", "20", "7", "yes", "1"},
             "vht is true, false, 1 or 0, not \"yes\""},
            {{"RunTxStop", "6", "--timeout", "-3"}, "--timeout takes a decimal number of seconds"},
            {{"RunTxStop", "6", "--timeout"}, "--timeout takes a number of seconds"},
            {{"RunTxStop", "6", "--verbose"}, "unknown option \"--verbose\""},
            {{"RunTxStopp", "--help"}, "unknown method \"RunTxStopp\""},
            {{"list", "all"}, "list takes no arguments; see bex-wifi-client --help"},
    };
    for (const auto& [arguments, message] : cases) {
        mErr.str("");
        EXPECT_EQ(run(arguments), 2);
        EXPECT_THAT(err(), IsOneLineWith(message));
    }
    EXPECT_EQ(out(), "");
    EXPECT_EQ(mTried + mAwaited, 0);
}

TEST_F(ClientTest, ExitCode3WhenThereIsNoService) {
    mService = nullptr;
    for (const Words& arguments :
         {Words{"RunTxStop", "6"}, Words{"RunTxStop", "6", "--timeout", "60"}}) {
        mErr.str("");
        EXPECT_EQ(run(arguments), 3);
        EXPECT_EQ(out(), "");
        EXPECT_EQ(err(),
                  "bex-wifi-client: vendor.korvan.bex.wifi@1.0::IWifiService/default is not "
                  "registered: is vendor.korvan.bex.wifi@1.0-service running, is it in the VINTF "
                  "manifest, and may this user find it?\n");
    }
}

TEST_F(ClientTest, ExitCode4WhenTheTransportFails) {
    mService->broken = ::android::DEAD_OBJECT;
    for (const Words& arguments :
         {Words{"RunTxStop", "6"}, Words{"isMimoSupport"}, Words{"RunRxStop", "6"}}) {
        mErr.str("");
        EXPECT_EQ(run(arguments), 4);
        EXPECT_EQ(out(), "");
        EXPECT_THAT(err(), IsOneLineWith(arguments[0] + " failed in the transport, the service "
                                                        "may have died: see its log; \""));
        EXPECT_THAT(err(), HasSubstr("DEAD_OBJECT"));
    }
}

TEST_F(ClientTest, ExitCode2WhenNoCommandLineCanHoldAnArgument) {
    // The longest with one letter before it, the blanks after both, and the NUL.
    const size_t longest = 32 * static_cast<size_t>(getpagesize()) - 4;
    EXPECT_EQ(run({"RunTxStop", std::string(longest, '6')}), 0);
    mErr.str("");
    EXPECT_EQ(run({"RunTxStop", std::string(longest + 1, '6')}), 2);
    EXPECT_EQ(mService->calls.size(), 1u);
    EXPECT_EQ(err(), "bex-wifi-client: channel has " + std::to_string(longest + 1) +
                             " bytes: a command line may have " +
                             std::to_string(32 * getpagesize() - 1) +
                             ", so none with it can run; see bex-wifi-client RunTxStop --help\n");
}

TEST_F(ClientTest, ExitCode4WhenTheServiceHasTooManyClients) {
    mService->broken = ::android::WOULD_BLOCK;
    for (const Words& arguments :
         {Words{"RunTxBGStart", "6", "11", "20", "1"}, Words{"RunRxStop", "6"}}) {
        mErr.str("");
        EXPECT_EQ(run(arguments), 4);
        EXPECT_EQ(out(), "");
        EXPECT_EQ(err(),
                  "bex-wifi-client: vendor.korvan.bex.wifi@1.0-service has too many clients and "
                  "took no call from this one; see which processes hold its sockets: ss -xp\n");
    }
}

class ClientDeadlineTest : public ClientTest {
  protected:
    void wait() { mGate.wait(); }

    Gate mGate;
};

TEST_F(ClientDeadlineTest, ExitCode5InTheSearch) {
    mAwaitFind = [this]() -> sp<IWifiService> {
        wait();
        return nullptr;
    };
    EXPECT_EQ(run({"RunTxStop", "6", "--timeout", "0.05"}), 5);
    EXPECT_EQ(out(), "");
    EXPECT_EQ(err(),
              "bex-wifi-client: vendor.korvan.bex.wifi@1.0-service has not answered in time: it "
              "may be busy with other calls or not running; nothing was called\n");
}

TEST_F(ClientDeadlineTest, ExitCode5InTheCall) {
    mService->onCall = [this] { wait(); };
    EXPECT_EQ(run({"--timeout", "2", "RunTxStop", "6"}), 5);
    EXPECT_EQ(out(), "");
    EXPECT_EQ(err(),
              "bex-wifi-client: the deadline passed in RunTxStop: the service's commands may still "
              "be running\n");
}

TEST_F(ClientDeadlineTest, JsonAfterTheDeadline) {
    mService->onCall = [this] { wait(); };
    EXPECT_EQ(run({"--timeout", "2", "--json", "RunRxStop", "6"}), 5);
    EXPECT_EQ(withoutCourse(out()),
              R"({"schema_version":1,"method":"RunRxStop","arguments":{"channel":"6"},)"
              R"("ok":false,"value":null,"count":null,COURSE,"exit_code":5,"error":)"
              R"("the deadline passed in RunRxStop: the service's commands may still be running"})"
              "\n");
    EXPECT_THAT(err(), IsOneLineWith("the deadline passed in RunRxStop"));
}

TEST_F(ClientTest, JsonOfSuccess) {
    EXPECT_EQ(run({"RunTxStop", "6", "--json"}), 0);
    EXPECT_EQ(withoutCourse(out()),
              R"({"schema_version":1,"method":"RunTxStop","arguments":{"channel":"6"},)"
              R"("ok":true,"value":0,COURSE,"exit_code":0})"
              "\n");
    EXPECT_EQ(err(), "");
}

TEST_F(ClientTest, JsonNamesEveryArgumentAndWritesFlagsAsFlags) {
    mService->text = "ok";
    EXPECT_EQ(run({"--json", "RunRxNStart", "6", "20", "7", "1", "a\"\n\xFF"}), 0);
    EXPECT_EQ(withoutCourse(out()),
              R"({"schema_version":1,"method":"RunRxNStart","arguments":{"channel":"6",)"
              R"("bandwidth":"20","rate":"7","vht":true,"antenna":"a\"\n)"
              "\uFFFD"
              R"("},"ok":true,"arguments_hex":{"antenna":"61220aff"},)"
              R"("value":"ok","count":null,COURSE,"exit_code":0})"
              "\n");
}

TEST_F(ClientTest, JsonWithoutArgumentsAndWithAFlag) {
    mService->flag = true;
    EXPECT_EQ(run({"--json", "isMimoSupport"}), 0);
    EXPECT_EQ(withoutCourse(out()),
              R"({"schema_version":1,"method":"isMimoSupport","arguments":{},"ok":true,)"
              R"("value":true,COURSE,"exit_code":0})"
              "\n");
}

TEST_F(ClientTest, JsonOfAFailureKeepsTheValue) {
    mService->number = -1;
    EXPECT_EQ(run({"--json", "snifferStop"}), 1);
    EXPECT_EQ(withoutCourse(out()),
              R"({"schema_version":1,"method":"snifferStop","arguments":{},"ok":false,"value":-1,)"
              R"(COURSE,"exit_code":1,"error":"snifferStop answered -1: which command )"
              "failed is in the service's log, tags that begin with \\\"wifi@1.0-\\\": "
              "logcat (a simulated phone: ./dev log)\"}\n");
    EXPECT_THAT(err(), IsOneLineWith("snifferStop answered -1"));
}

TEST_F(ClientTest, JsonWithoutAService) {
    mService = nullptr;
    EXPECT_EQ(run({"--json", "snifferStop"}), 3);
    EXPECT_THAT(withoutCourse(out()),
                StartsWith(
                        R"({"schema_version":1,"method":"snifferStop","arguments":{},"ok":false,)"
                        R"("value":null,COURSE,"exit_code":3,"error":")"
                        "vendor.korvan.bex.wifi@1.0::IWifiService/default is not registered"));
    EXPECT_THAT(out(), ::testing::EndsWith("find it?\"}\n"));
    EXPECT_THAT(err(), IsOneLineWith("is not registered"));
}

TEST_F(ClientTest, JsonOfAFailedTransport) {
    mService->broken = ::android::DEAD_OBJECT;
    EXPECT_EQ(run({"--json", "RunRxStop", "6"}), 4);
    EXPECT_THAT(withoutCourse(out()),
                AllOf(StartsWith(
                              R"({"schema_version":1,"method":"RunRxStop",)"
                              R"("arguments":{"channel":"6"},"ok":false,"value":null,)"
                              R"("count":null,COURSE,"exit_code":4,"error":"RunRxStop failed in )"),
                      ::testing::EndsWith("\\\"\"}\n")));
    EXPECT_THAT(err(), IsOneLineWith("RunRxStop failed in the transport"));
}

TEST_F(ClientTest, JsonOfATextThatIsNotUtf8AddsItsBytes) {
    mService->text = "a\xFF\x01";
    EXPECT_EQ(run({"--json", "RunRxStop", "6"}), 0);
    EXPECT_EQ(withoutCourse(out()),
              R"({"schema_version":1,"method":"RunRxStop","arguments":{"channel":"6"},"ok":true,)"
              "\"value\":\"a\uFFFD\\u0001\",\"value_hex\":\"61ff01\",\"count\":null,"
              R"(COURSE,"exit_code":0})"
              "\n");
}

TEST_F(ClientTest, JsonHoldsTheCountAsANumber) {
    for (const auto& [text, count] :
         std::vector<std::pair<std::string, std::string>>{{"48", "48"},
                                                          {"Rx: 041", "41"},
                                                          {"Rx: 0\n", "0"},
                                                          {"ok", "null"},
                                                          {"Rx: ", "null"},
                                                          {"Rx: goodPackets", "null"},
                                                          {"", "null"},
                                                          {" ", "null"},
                                                          {"-1", "null"}}) {
        mOut.str("");
        mService->text = text;
        EXPECT_EQ(run({"RunRxStop", "6", "--json"}), 0);
        EXPECT_THAT(out(), HasSubstr("\"count\":" + count + ",")) << text;
    }
}

TEST_F(ClientTest, ARequiredCountThatIsMissingIsAFailureOfItsOwn) {
    mService->text = "Rx: ";
    EXPECT_EQ(run({"RunRxStop", "6", "--require-count"}), 7);
    EXPECT_EQ(out(), "Rx: \n");
    EXPECT_THAT(err(), IsOneLineWith("RunRxStop answered no count: \"Rx: \""));
    mService->text = "Rx: 12";
    EXPECT_EQ(run({"RunRxStop", "6", "--require-count"}), 0);
    mService->text = "failure";
    EXPECT_EQ(run({"RunRxStop", "6", "--require-count"}), 1);
    EXPECT_EQ(run({"RunTxStop", "6", "--require-count"}), 2);
}

TEST_F(ClientTest, JsonTellsHowFarTheCallCameAndWhatMayBeOn) {
    const auto members = [this](const Words& call) {
        mOut.str("");
        run(call);
        std::smatch found;
        const std::string json = out();
        std::regex_search(json, found, std::regex("\"radio_may_be_on\":.*?,\"started_at"));
        return found.str();
    };
    EXPECT_THAT(members({"--json", "RunTxStStart", "6", "20", "1"}),
                StartsWith(R"("radio_may_be_on":true,"stage":"done",)"));
    EXPECT_THAT(members({"--json", "RunTxStop", "6"}),
                StartsWith(R"("radio_may_be_on":null,"stage":"done",)"));
    mService->broken = true;
    EXPECT_THAT(members({"--json", "RunTxStStart", "6", "20", "1"}),
                StartsWith(R"("radio_may_be_on":true,"stage":"call",)"));
    mService = nullptr;
    EXPECT_THAT(members({"--json", "RunTxStStart", "6", "20", "1"}),
                StartsWith(R"("radio_may_be_on":null,"stage":"lookup",)"));
    EXPECT_THAT(members({"--json", "stop"}),
                StartsWith(R"("radio_may_be_on":true,"stage":"lookup",)"));
}

TEST_F(ClientTest, AValueThatNoChipKnowsIsAWarningAndTheCallIsMade) {
    const Words call = {"RunRxBgStart", "999", "13", ""};
    mService->text = "ok";
    EXPECT_EQ(run(call), 0);
    EXPECT_EQ(out(), "ok\n");
    EXPECT_THAT(err(), IsOneLineWith("warning: channel \"999\" is none that a chip knows (decimal: "
                                     "1 to 14 (2.4 GHz), 36 and up (5 GHz)); "));
    EXPECT_THAT(err(), AllOf(HasSubstr("; rate \"13\" is none"), HasSubstr("; antenna is empty")));
    EXPECT_THAT(mService->calls, ElementsAre(call));
}

TEST_F(ClientTest, JsonHoldsTheWarnings) {
    EXPECT_EQ(run({"RunTxStop", "", "--json"}), 0);
    EXPECT_THAT(out(), HasSubstr(R"("warnings":["channel is empty: )"));
    EXPECT_EQ(err(), "");
    EXPECT_EQ(run({"RunTxStop", "165", "--json"}), 0);
    EXPECT_THAT(out(), ::testing::EndsWith("}\n"));
}

TEST_F(ClientTest, StrictRefusesWhatNoChipKnows) {
    EXPECT_EQ(run({"--strict", "RunTxNStart", "6", "30", "7", "15", "true", "1"}), 2);
    EXPECT_THAT(err(), IsOneLineWith("bandwidth \"30\" is none that a chip knows"));
    EXPECT_THAT(mService->calls, ::testing::IsEmpty());
    EXPECT_EQ(run({"--strict", "RunTxNStart", "14", "80", "15", "any", "true", "any"}), 0);
}

TEST_F(ClientTest, AMessageQuotesOnlyTheBeginOfALongText) {
    const std::string tooLong(100'000, '6');
    const std::string quote = "\"" + tooLong.substr(0, 40) + "\"... (100000 bytes)";
    const auto errorOf = [this](const Words& arguments, int exitCode) {
        mErr.str("");
        EXPECT_EQ(run(arguments), exitCode);
        return err();
    };
    EXPECT_THAT(errorOf({"RunTxStop", tooLong}, 0),
                IsOneLineWith("warning: channel " + quote + " is none that a chip knows"));
    EXPECT_THAT(mService->calls, ElementsAre(Words{"RunTxStop", tooLong}));
    EXPECT_THAT(errorOf({"--strict", "RunTxStop", tooLong}, 2),
                IsOneLineWith("channel " + quote + " is none that a chip knows"));
    EXPECT_THAT(errorOf({"RunRxNStart", "6", "20", "7", tooLong, "1"}, 2),
                IsOneLineWith("vht is true, false, 1 or 0, not " + quote));
    EXPECT_THAT(errorOf({tooLong}, 2), IsOneLineWith("unknown method " + quote));
    EXPECT_THAT(errorOf({"--" + tooLong}, 2), IsOneLineWith("\"... (100002 bytes) (an argument"));
    EXPECT_THAT(errorOf({"--timeout", tooLong, "list"}, 2), IsOneLineWith(", not " + quote));
    mService->text = tooLong + " packets";
    EXPECT_THAT(errorOf({"--require-count", "RunRxStop", "6"}, 7),
                IsOneLineWith("answered no count: \"" + tooLong.substr(0, 40) + "\"... ("));
}

TEST_F(ClientTest, JsonOfALargeTextIsOneLine) {
    mService->text = std::string(300'000, '\n');
    EXPECT_EQ(run({"--json", "RunRxStop", "6"}), 0);
    const std::string json = out();
    EXPECT_EQ(std::count(json.begin(), json.end(), '\n'), 1);
    EXPECT_EQ(std::count(json.begin(), json.end(), '\\'), 300'000);
}

TEST_F(ClientTest, ListsAndExplainsWithoutTheService) {
    const std::pair<Words, std::string> cases[] = {
            {{"list"}, listText()},
            {{"list", "--json"}, listJson()},
            {{"--help"}, helpText()},
            {{"-h"}, helpText()},
            {{"help"}, helpText()},
            {{"list", "--help"}, *helpOnTopic("list")},
            {{"help", "doctor"}, *helpOnTopic("doctor")},
            {{"stop", "-h"}, *helpOnTopic("stop")},
            {{"help", "RunTxStop"}, helpText(*findCommand("RunTxStop"))},
            {{"--version"}, versionText()},
            {{"RunTxStop", "--help"}, helpText(*findCommand("RunTxStop"))},
            {{"--help", "RunRxStop", "6", "7"}, helpText(*findCommand("RunRxStop"))},
    };
    for (const auto& [arguments, text] : cases) {
        mOut.str("");
        EXPECT_EQ(run(arguments), 0);
        EXPECT_EQ(out(), text);
    }
    EXPECT_EQ(err(), "");
    EXPECT_EQ(mTried + mAwaited, 0);
}

// A stream whose device is full.
class FullBuffer : public std::streambuf {
    int overflow(int) override {
        errno = ENOSPC;
        return traits_type::eof();
    }
};

TEST_F(ClientTest, ExitCode6WhenTheResultCannotBeWritten) {
    mService->number = -1;
    for (const Words& arguments : {Words{"RunTxStop", "6"}, Words{"RunTxStop", "6", "--json"},
                                   Words{"list"}, Words{"--help"}}) {
        mErr.str("");
        FullBuffer full;
        std::ostream out(&full);
        EXPECT_EQ(runClient(arguments, {out, mErr, mTryFind, mAwaitFind}), 6);
        EXPECT_EQ(err(),
                  "bex-wifi-client: cannot write the result to stdout: No space left on device\n");
    }
}

// Opens a gate as soon as a text has been written and flushed.
class WatchedBuffer : public std::stringbuf {
  public:
    WatchedBuffer(std::string text, Gate* gate) : mText(std::move(text)), mGate(gate) {}

  private:
    int sync() override {
        if (mGate != nullptr && str().find(mText) != std::string::npos) {
            mGate->open();
            mGate = nullptr;
        }
        return 0;
    }

    const std::string mText;
    Gate* mGate;
};

TEST_F(ClientTest, ATerminalShowsTheSecondsInPlaceAndErasesThemBeforeTheResult) {
    Gate gate;
    mService->onCall = [&gate] { gate.wait(); };
    WatchedBuffer buffer(": 3 s", &gate);
    std::ostream screen(&buffer); // Both streams, as a terminal shows them.
    EXPECT_EQ(runClient({"RunTxStop", "6"},
                        {screen, screen, mTryFind, mAwaitFind, [] { return 80; }, 50ms}),
              0);
    EXPECT_THAT(buffer.str(), ::testing::MatchesRegex("\rRunTxStop: 1 s\rRunTxStop: 2 s"
                                                      "\rRunTxStop: 3 s(\rRunTxStop: [0-9]+ s)*"
                                                      "\r {14,}\r0\n"));
}

// The last column stays free, since some terminals begin a new line once it is filled.
TEST_F(ClientTest, ANarrowTerminalShowsWhatFitsWhateverItsWidthBecomes) {
    Gate gate;
    mService->onCall = [&gate] { gate.wait(); };
    std::ostringstream screen;
    size_t ticks = 0;
    const auto columns = [&ticks, &gate]() -> size_t {
        constexpr size_t kWidths[] = {14, 13, 5, 1};
        if (ticks == 4) gate.open();
        return kWidths[std::min<size_t>(ticks++, 3)];
    };
    EXPECT_EQ(runClient({"RunTxStop", "6"}, {screen, screen, mTryFind, mAwaitFind, columns, 50ms}),
              0);
    EXPECT_THAT(screen.str(), ::testing::MatchesRegex("\rRunTxStop: 1 \rRunTxStop: 2\rRunT\r+"
                                                      "0\n"));
}

TEST_F(ClientTest, ATerminalShowsNothingOfAShortCall) {
    mColumns = [] { return 80; };
    mSecond = 1h;
    EXPECT_EQ(run({"RunTxStop", "6"}), 0);
    EXPECT_EQ(err(), "");
}

TEST_F(ClientTest, WithoutATerminalASlowCallShowsNothing) {
    mSecond = 1ms;
    mService->onCall = [] { std::this_thread::sleep_for(50ms); }; // Fifty of these seconds.
    EXPECT_EQ(run({"RunTxStop", "6"}), 0);
    EXPECT_EQ(out(), "0\n");
    EXPECT_EQ(err(), "");
}

} // namespace
} // namespace vendor::korvan::bex::wifi::client
