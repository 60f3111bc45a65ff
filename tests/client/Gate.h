// Copyright 2026 The BEX Wi-Fi Authors
// SPDX-License-Identifier: Apache-2.0

#pragma once

#include <condition_variable>
#include <mutex>

namespace vendor::korvan::bex::wifi::client {

/**
 * Where one thread waits until it is let through, at the latest at the end of the test, which waits
 * for the thread to end: a passed deadline leaves such a thread behind.
 */
class Gate {
  public:
    ~Gate() {
        std::unique_lock<std::mutex> lock(mLock);
        mOpen = true;
        mChanged.notify_all();
        mChanged.wait(lock, [this] { return mLeft; });
    }

    void open() {
        const std::lock_guard<std::mutex> guard(mLock);
        mOpen = true;
        mChanged.notify_all();
    }

    void wait() {
        std::unique_lock<std::mutex> lock(mLock);
        mChanged.wait(lock, [this] { return mOpen; });
        static thread_local AtThreadExit atExit;
        atExit.gate = this;
    }

  private:
    // The standard library's own way is one that ThreadSanitizer cannot follow.
    struct AtThreadExit {
        Gate* gate = nullptr;
        ~AtThreadExit() {
            if (gate != nullptr) gate->leave();
        }
    };

    void leave() {
        const std::lock_guard<std::mutex> guard(mLock);
        mLeft = true;
        mChanged.notify_all();
    }

    std::mutex mLock;
    std::condition_variable mChanged;
    bool mOpen = false;
    bool mLeft = false;
};

} // namespace vendor::korvan::bex::wifi::client
