// Copyright 2026 The BEX Wi-Fi Authors
// SPDX-License-Identifier: Apache-2.0

#include <gtest/gtest.h>
#include <signal.h>
#include <unistd.h>

#include <thread>

#include "FakeService.h"
#include "Gate.h"
#include "client/Call.h"

namespace vendor::korvan::bex::wifi::client {
namespace {

using ::android::sp;
using namespace std::chrono_literals;

const Progress kNoProgress{1s, nullptr};

class CallTest : public ::testing::Test {
  protected:
    CallTest() {
        std::string problem;
        EXPECT_TRUE(readRequest({"RunTxStop", "6"}, &mRequest, &problem)) << problem;
    }

    FindService find() {
        return [service = mService] { return service; };
    }

    Request mRequest;
    sp<FakeService> mService = new FakeService;
};

TEST_F(CallTest, AnswersWithoutADeadline) {
    const Outcome outcome = callService(mRequest, find(), std::nullopt, kNoProgress);
    EXPECT_EQ(outcome.ending, Ending::answered);
    EXPECT_EQ(outcome.answer.text, "0");
    EXPECT_GT(outcome.duration, 0ns);
}

TEST_F(CallTest, AnswersWithinTheDeadline) {
    const Outcome outcome = callService(mRequest, find(), 60s, kNoProgress);
    EXPECT_EQ(outcome.ending, Ending::answered);
    EXPECT_LT(outcome.duration, 60s);
}

TEST_F(CallTest, AFailedTransportIsNoAnswer) {
    mService->broken = ::android::DEAD_OBJECT;
    const Outcome outcome = callService(mRequest, find(), std::nullopt, kNoProgress);
    EXPECT_EQ(outcome.ending, Ending::transportFailed);
    EXPECT_FALSE(outcome.answer.delivered);
}

TEST_F(CallTest, WithoutAServiceNothingIsCalled) {
    const Outcome outcome = callService(
            mRequest, [] { return nullptr; }, std::nullopt, kNoProgress);
    EXPECT_EQ(outcome.ending, Ending::notFound);
}

TEST_F(CallTest, FindsAndCallsOffTheCallersThread) {
    std::thread::id finder;
    std::thread::id caller;
    mService->onCall = [&] { caller = std::this_thread::get_id(); };
    callService(
            mRequest,
            [&] {
                finder = std::this_thread::get_id();
                return mService;
            },
            std::nullopt, kNoProgress);
    EXPECT_NE(finder, std::this_thread::get_id());
    EXPECT_EQ(finder, caller);
}

TEST_F(CallTest, TheDeadlineEndsTheSearch) {
    Gate gate;
    const Outcome outcome = callService(
            mRequest,
            [&gate] {
                gate.wait();
                return nullptr;
            },
            50ms, kNoProgress);
    EXPECT_EQ(outcome.ending, Ending::late);
    EXPECT_EQ(outcome.stage, Stage::lookup);
    EXPECT_GE(outcome.duration, 50ms);
}

TEST_F(CallTest, TheDeadlineEndsTheCallAndTheWorkerMayEndLater) {
    Gate gate;
    mService->onCall = [&gate] { gate.wait(); };
    const Outcome outcome = callService(mRequest, find(), 2s, kNoProgress);
    EXPECT_EQ(outcome.ending, Ending::late);
    EXPECT_EQ(outcome.stage, Stage::call);
    EXPECT_FALSE(outcome.answer.delivered);
}

TEST_F(CallTest, ASignalEndsTheCall) {
    for (const int number : {SIGINT, SIGTERM}) {
        signal(number, SIG_DFL); // The tests may run in the background of a script.
        Gate gate;
        mService->onCall = [&gate, number] {
            kill(getpid(), number);
            gate.wait();
        };
        const Outcome outcome = callService(mRequest, find(), std::nullopt, kNoProgress);
        EXPECT_EQ(outcome.ending, Ending::interrupted);
        EXPECT_EQ(outcome.number, number);
        EXPECT_EQ(outcome.stage, Stage::call);
    }
}

// As of a job that a script has put into the background.
TEST_F(CallTest, AnIgnoredSignalDoesNot) {
    const auto before = signal(SIGINT, SIG_IGN);
    mService->onCall = [] { kill(getpid(), SIGINT); };
    const Outcome outcome = callService(mRequest, find(), std::nullopt, kNoProgress);
    signal(SIGINT, before);
    EXPECT_EQ(outcome.ending, Ending::answered);
    EXPECT_EQ(outcome.stage, Stage::done);
}

TEST_F(CallTest, TicksAreCountedOnTheCallersThreadUntilTheEnd) {
    Gate gate;
    mService->onCall = [&gate] { gate.wait(); };
    std::vector<long> ticks;
    const auto tick = [&, caller = std::this_thread::get_id()](long number) {
        EXPECT_EQ(std::this_thread::get_id(), caller);
        ticks.push_back(number);
        if (number == 3) gate.open();
    };
    const Outcome outcome = callService(mRequest, find(), std::nullopt, {1ms, tick});
    EXPECT_EQ(outcome.ending, Ending::answered);
    ASSERT_GE(ticks.size(), 3u);
    for (size_t i = 0; i < ticks.size(); ++i) EXPECT_EQ(ticks[i], static_cast<long>(i) + 1);
}

} // namespace
} // namespace vendor::korvan::bex::wifi::client
