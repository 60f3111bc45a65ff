// Copyright 2026 The BEX Wi-Fi Authors
// SPDX-License-Identifier: Apache-2.0

#pragma once

#include <gtest/gtest.h>

#include <atomic>
#include <string>
#include <vector>

#include "tests/target/Calls.h"

namespace vendor::korvan::bex::wifi::target {

/** A test of one declared instance. Ends what it started on the phone. */
class DisruptiveWifiTest : public ::testing::TestWithParam<std::string> {
  protected:
    void SetUp() override;
    void TearDown() override;

    /** Makes the call and expects that it is answered, in its method's form; the answer's text. */
    std::string make(const Call& call) { return make(*wifi, call); }
    void makeAll(const std::vector<Call>& calls);
    /** Each list by a thread and a client of its own, all of them at once. */
    void makeTogether(const std::vector<std::vector<Call>>& lists);

    ::android::sp<IWifiService> wifi;

  private:
    ::android::sp<IWifiService> find();
    std::string make(IWifiService& service, const Call& call);
    void restore();

    std::atomic<bool> mRadioTouched{false};
    std::atomic<bool> mCaptureTouched{false};
};

} // namespace vendor::korvan::bex::wifi::target
