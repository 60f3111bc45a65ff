// Copyright 2026 The BEX Wi-Fi Authors
// SPDX-License-Identifier: Apache-2.0

#include "tests/target/DisruptiveWifiTest.h"

#include <hidl/GtestPrinter.h>
#include <hidl/ServiceManagement.h>

#include <future>

#include "tests/target/Watchdog.h"

namespace vendor::korvan::bex::wifi::target {

using ::android::sp;

void DisruptiveWifiTest::SetUp() {
    wifi = find();
    ASSERT_NE(wifi, nullptr) << "nobody serves the instance";
}

void DisruptiveWifiTest::TearDown() {
    if (!mRadioTouched && !mCaptureTouched) return;
    // One that died may be back already; waiting for it is the next test's business.
    if (!wifi->ping().isOk()) wifi = IWifiService::tryGetService(GetParam());
    ASSERT_NE(wifi, nullptr) << "the service is gone: the radio stays as it is";
    restore();
}

void DisruptiveWifiTest::restore() {
    if (mCaptureTouched) make(kSnifferStop());
    makeAll({
            kRunTxStop("6"),
            kRunTxStStop("6"),
            // On every chip the end of a reception brings the driver or the firmware of daily use
            // back.
            kRunRxStop("6"),
    });
}

sp<IWifiService> DisruptiveWifiTest::find() {
    const Watchdog watchdog(std::string("getService(\"") + GetParam() +
                            "\") for a declared instance");
    return IWifiService::getService(GetParam());
}

std::string DisruptiveWifiTest::make(IWifiService& service, const Call& call) {
    if (call.effect == Effect::radio) mRadioTouched = true;
    if (call.effect == Effect::capture) mCaptureTouched = true;
    const Watchdog watchdog(call.text);
    const Answer answer = call.run(service);
    EXPECT_EQ(answer.problem, "") << call.text;
    if (answer.problem.empty()) {
        EXPECT_TRUE(call.form->fits(answer.text))
                << call.text << " answered \"" << answer.text << "\", not " << call.form->words;
    }
    return answer.text;
}

void DisruptiveWifiTest::makeAll(const std::vector<Call>& calls) {
    for (const Call& call : calls) make(call);
}

void DisruptiveWifiTest::makeTogether(const std::vector<std::vector<Call>>& lists) {
    std::promise<void> everybodyIsThere;
    const std::shared_future<void> go = everybodyIsThere.get_future().share();
    std::vector<std::future<void>> clients;
    for (const std::vector<Call>& list : lists) {
        clients.push_back(std::async(std::launch::async, [this, &list, go, client = find()] {
            ASSERT_NE(client, nullptr);
            go.wait();
            for (const Call& call : list) make(*client, call);
        }));
    }
    everybodyIsThere.set_value();
    for (std::future<void>& client : clients) client.get();
}

INSTANTIATE_TEST_SUITE_P(
        PerInstance, DisruptiveWifiTest,
        ::testing::ValuesIn(::android::hardware::getAllHalInstanceNames(IWifiService::descriptor)),
        ::android::hardware::PrintInstanceNameToString);

} // namespace vendor::korvan::bex::wifi::target
