// Copyright 2026 The BEX Wi-Fi Authors
// SPDX-License-Identifier: Apache-2.0

#include "ClientTest.h"
#include "Matches.h"

namespace vendor::korvan::bex::wifi::client {
namespace {

using ::testing::AllOf;
using ::testing::HasSubstr;
using ::testing::StartsWith;

// What tells of the call's course differs from run to run.
std::string withoutCourse(std::string json) {
    for (const std::string& course :
         matches(json, R"("radio_may_be_on":(true|false|null),"stage":"[a-z]+",)"
                       R"("started_at":"[0-9-]+T[0-9:]+\.[0-9]{3}Z",)"
                       R"("duration_ms":[0-9]+\.[0-9]{3},)"
                       R"("client_version":"[0-9.]+",)")) {
        json.replace(json.find(course), course.size(), "COURSE,");
    }
    return json;
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

TEST_F(ClientTest, JsonTellsHowFarTheCallCameAndWhatMayBeOn) {
    const auto members = [this](const Words& call) {
        mOut.str("");
        run(call);
        return matches(out(), "\"radio_may_be_on\":.*,\"started_at").at(0);
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

TEST_F(ClientTest, JsonHoldsTheWarnings) {
    EXPECT_EQ(run({"RunTxStop", "", "--json"}), 0);
    EXPECT_THAT(out(), HasSubstr(R"("warnings":["channel is empty: )"));
    EXPECT_EQ(err(), "");
    EXPECT_EQ(run({"RunTxStop", "165", "--json"}), 0);
    EXPECT_THAT(out(), ::testing::EndsWith("}\n"));
}

TEST_F(ClientTest, JsonOfALargeTextIsOneLine) {
    mService->text = std::string(300'000, '\n');
    EXPECT_EQ(run({"--json", "RunRxStop", "6"}), 0);
    const std::string json = out();
    EXPECT_EQ(std::count(json.begin(), json.end(), '\n'), 1);
    EXPECT_EQ(std::count(json.begin(), json.end(), '\\'), 300'000);
}

} // namespace
} // namespace vendor::korvan::bex::wifi::client
