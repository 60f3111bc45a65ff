// Copyright 2026 The BEX Wi-Fi Authors
// SPDX-License-Identifier: Apache-2.0

#pragma once

#include <android-base/unique_fd.h>

#include <cstdint>
#include <functional>
#include <map>
#include <mutex>

namespace android::hardware::host {

/** One thread that waits for sockets to hang up. It starts with the first watch(). */
class DeathWatch {
  public:
    static DeathWatch& get();

    /** Calls the function once, on the watcher's thread, when the socket hangs up. */
    uint64_t watch(int socket, std::function<void()> onHangup);
    /**
     * Call it before the socket is closed. It does not wait for a function that is already
     * running.
     */
    void unwatch(uint64_t id, int socket);

  private:
    DeathWatch();
    void run();

    const base::unique_fd mEpoll;
    std::mutex mMutex;
    uint64_t mNextId = 1;
    std::map<uint64_t, std::function<void()>> mWatches;
};

} // namespace android::hardware::host
