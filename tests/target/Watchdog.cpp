// Copyright 2026 The BEX Wi-Fi Authors
// SPDX-License-Identifier: Apache-2.0

#include "tests/target/Watchdog.h"

#include <stdio.h>
#include <unistd.h>

#include <utility>

namespace vendor::korvan::bex::wifi::target {

namespace {
// A chip's tools take seconds, an access point that never comes half a minute, and a call waits for
// the ones ahead of it.
std::chrono::seconds gDeadline{180};
} // namespace

void Watchdog::setDeadline(std::chrono::seconds deadline) {
    gDeadline = deadline;
}

Watchdog::Watchdog(std::string what) : mWhat(std::move(what)), mThread([this] { watch(); }) {}

Watchdog::~Watchdog() {
    {
        const std::lock_guard<std::mutex> guard(mLock);
        mDone = true;
    }
    mEnded.notify_one();
    mThread.join();
}

void Watchdog::watch() {
    std::unique_lock<std::mutex> guard(mLock);
    if (mEnded.wait_for(guard, gDeadline, [this] { return mDone; })) return;
    fprintf(stderr, "%s: gave up: %s has not answered for %lld s\n", kProgram, mWhat.c_str(),
            static_cast<long long>(gDeadline.count()));
    // Other threads may be anywhere in the platform's libraries.
    _exit(1);
}

} // namespace vendor::korvan::bex::wifi::target
