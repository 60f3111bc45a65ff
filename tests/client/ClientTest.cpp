// Copyright 2026 The BEX Wi-Fi Authors
// SPDX-License-Identifier: Apache-2.0

#include "ClientTest.h"

#include "client/Help.h"

namespace vendor::korvan::bex::wifi::client {
namespace {

using ::android::sp;
using ::testing::AllOf;
using ::testing::ElementsAre;
using ::testing::HasSubstr;
using ::testing::Not;

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

} // namespace
} // namespace vendor::korvan::bex::wifi::client
