// Copyright 2026 The BEX Wi-Fi Authors
// SPDX-License-Identifier: Apache-2.0

#include <thread>

#include "ClientTest.h"

namespace vendor::korvan::bex::wifi::client {
namespace {

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
