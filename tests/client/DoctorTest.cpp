// Copyright 2026 The BEX Wi-Fi Authors
// SPDX-License-Identifier: Apache-2.0

#include "DoctorTest.h"

#include <sstream>

#include "client/Client.h"
#include "client/Help.h"

namespace vendor::korvan::bex::wifi::client {
namespace {

using namespace std::chrono_literals;
using ::testing::AllOf;
using ::testing::HasSubstr;
using ::testing::StartsWith;

TEST_F(DoctorTest, AHealthyPhoneOfEachFamilyHasNoProblem) {
    for (const ChipFamily& family : chipFamilies()) {
        install(family.vendor, family.partOfName + std::string("-1"));
        for (const Check& check : all()) {
            EXPECT_NE(check.verdict, Verdict::problem) << check.name << ": " << check.found;
            EXPECT_EQ(check.remedy.empty(), check.verdict == Verdict::ok) << check.name;
        }
        expectOk("chip", std::string("taken for the family ") + family.name);
    }
}

class DoctorCommandTest : public DoctorTest {
  protected:
    int run(const std::vector<std::string>& arguments) {
        mOut.str("");
        mErr.str("");
        return runClient(arguments, {mOut,
                                     mErr,
                                     mTryFind,
                                     mTryFind,
                                     nullptr,
                                     1s,
                                     {[this] { return mManager; }, root()}});
    }

    std::ostringstream mOut;
    std::ostringstream mErr;
};

TEST_F(DoctorCommandTest, Text) {
    EXPECT_EQ(run({"doctor"}), 0);
    EXPECT_THAT(mOut.str(), StartsWith("ok       vendor: ro.hardware.wlan.vendor is broadcom\n"));
    EXPECT_THAT(mOut.str(), ::testing::EndsWith("\n24 checks: 21 ok, 0 problem, 3 unknown\n"));
    EXPECT_EQ(mErr.str(), "");

    remove("/vendor/bin/sh");
    EXPECT_EQ(run({"doctor", "--timeout", "9"}), 1);
    EXPECT_THAT(mOut.str(), HasSubstr("\nproblem  shell: /vendor/bin/sh is not there: no command "
                                      "can run\n      -> build the vendor's shell in: "
                                      "PRODUCT_PACKAGES += sh_vendor\nok  "));
    EXPECT_THAT(mOut.str(), ::testing::EndsWith("\n24 checks: 20 ok, 1 problem, 3 unknown\n"));
    EXPECT_EQ(mErr.str(), "bex-wifi-client: the doctor found 1 problem: each names what to do\n");
}

TEST_F(DoctorCommandTest, Json) {
    EXPECT_EQ(run({"doctor", "--json"}), 0);
    EXPECT_THAT(mOut.str(),
                AllOf(StartsWith(R"({"schema_version":1,"ok":true,"checks":[{"name":"vendor",)"
                                 R"("status":"ok","found":"ro.hardware.wlan.vendor is broadcom",)"
                                 R"("remedy":null},{)"),
                      HasSubstr(R"({"name":"matrix","status":"unknown","found":")"),
                      ::testing::EndsWith("}],\"exit_code\":0}\n")));
    remove("/vendor/bin/sh");
    remove("/vendor/bin/wl");
    EXPECT_EQ(run({"--json", "doctor"}), 1);
    EXPECT_THAT(mOut.str(), StartsWith(R"({"schema_version":1,"ok":false,"checks":[)"));
    EXPECT_THAT(mOut.str(), HasSubstr(R"("remedy":"build the vendor's shell in: )"));
    EXPECT_THAT(mOut.str(),
                ::testing::EndsWith(R"(}],"exit_code":1,"error":"the doctor found 2 problems: )"
                                    "each names what to do\"}\n"));
}

TEST_F(DoctorCommandTest, UsageAndHelp) {
    EXPECT_EQ(run({"doctor", "now"}), 2);
    EXPECT_EQ(mOut.str(), "");
    EXPECT_EQ(mErr.str(),
              "bex-wifi-client: doctor takes no arguments; see bex-wifi-client --help\n");
    EXPECT_EQ(run({"doctor", "--help"}), 0);
    EXPECT_EQ(mOut.str(), *helpOnTopic("doctor"));
    EXPECT_THAT(helpText(), HasSubstr("\n  bex-wifi-client doctor [--json] "));
}

} // namespace
} // namespace vendor::korvan::bex::wifi::client
