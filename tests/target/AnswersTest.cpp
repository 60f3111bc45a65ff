// Copyright 2026 The BEX Wi-Fi Authors
// SPDX-License-Identifier: Apache-2.0

// That every call is answered, in its method's form, whatever its arguments.

#include <set>

#include "tests/target/DisruptiveWifiTest.h"

namespace vendor::korvan::bex::wifi::target {
namespace {

/** Whether an answer tells of success; a count always does. */
bool isSuccess(const std::string& text) {
    return text != "-1" && text != "failure";
}

TEST_P(DisruptiveWifiTest, AnswersEveryMethod) {
    std::set<std::string> methods;
    for (const Call& call : usualCalls()) {
        make(call);
        methods.insert(call.text.substr(0, call.text.find('(')));
    }
    EXPECT_EQ(methods.size(), 16u);
}

// Ahead of the tests whose calls may fail: a service that they spoil would fail here from the
// start.
TEST_P(DisruptiveWifiTest, AFailureLeavesTheNextCallAlone) {
    struct Operation {
        Call good;
        Call bad;
        Call end;
    };
    const Operation operations[] = {
            {kRunTxBGStart("6", "54", "15", "1"), kRunTxBGStart("abc", "abc", "abc", "abc"),
             kRunTxStop("6")},
            {kRunTxStStart("11", "20", "1"), kRunTxStStart("abc", "abc", "abc"),
             kRunTxStStop("11")},
            {kRunRxBgStart("6", "54", "1"), kRunRxBgStart("abc", "abc", "abc"), kRunRxStop("6")},
            {kSnifferStart("36", "20"), kSnifferStart("abc", "abc"), kSnifferStop()},
    };
    for (const Operation& operation : operations) {
        const std::string before = make(operation.good);
        makeAll({operation.end, operation.bad});
        const std::string after = make(operation.good);
        if (isSuccess(before)) {
            EXPECT_TRUE(isSuccess(after)) << operation.good.text << " behind " << operation.bad.text
                                          << " answered \"" << after << '"';
        }
        make(operation.end);
    }
}

TEST_P(DisruptiveWifiTest, AnswersEmptyArguments) {
    makeAll(callsWith(""));
}

TEST_P(DisruptiveWifiTest, AnswersArgumentsThatAreNoNumbers) {
    makeAll(callsWith("abc"));
    makeAll(callsWith("6abc"));
}

TEST_P(DisruptiveWifiTest, AnswersNumbersAtTheEdges) {
    makeAll(edgeCalls());
}

} // namespace
} // namespace vendor::korvan::bex::wifi::target
