// Copyright 2026 The BEX Wi-Fi Authors
// SPDX-License-Identifier: Apache-2.0

#pragma once

#include <future>

namespace vendor::korvan::bex::wifi::client {

/**
 * Where the thread that a passed deadline leaves behind waits until the end of the test. One thread
 * comes to it.
 */
class Gate {
  public:
    ~Gate() {
        mRelease.set_value();
        mEnded.get_future().wait();
    }

    void wait() {
        mOpen.wait();
        mEnded.set_value_at_thread_exit();
    }

  private:
    std::promise<void> mRelease;
    std::promise<void> mEnded;
    const std::shared_future<void> mOpen = mRelease.get_future().share();
};

} // namespace vendor::korvan::bex::wifi::client
