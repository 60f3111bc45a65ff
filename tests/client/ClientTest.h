// Copyright 2026 The BEX Wi-Fi Authors
// SPDX-License-Identifier: Apache-2.0

#pragma once

#include <gmock/gmock.h>
#include <gtest/gtest.h>

#include <algorithm>
#include <sstream>

#include "FakeService.h"
#include "Gate.h"
#include "client/Client.h"

namespace vendor::korvan::bex::wifi::client {

using namespace std::chrono_literals;
using Words = std::vector<std::string>;

// One line that names the program and holds the text.
MATCHER_P(IsOneLineWith, text, "") {
    return std::count(arg.begin(), arg.end(), '\n') == 1 && arg.back() == '\n' &&
           arg.rfind("bex-wifi-client: ", 0) == 0 && arg.find(text) != arg.npos;
}

/** Runs the client in this process, against a service that answers what a case tells it to. */
class ClientTest : public ::testing::Test {
  protected:
    int run(const Words& arguments) {
        return runClient(arguments, {mOut, mErr, mTryFind, mAwaitFind, mColumns, mSecond});
    }

    std::string out() const { return mOut.str(); }
    std::string err() const { return mErr.str(); }

    ::android::sp<FakeService> mService = new FakeService;
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

/** The service, or the search for it, waits until the end of the case. */
class ClientDeadlineTest : public ClientTest {
  protected:
    void wait() { mGate.wait(); }

    Gate mGate;
};

} // namespace vendor::korvan::bex::wifi::client
