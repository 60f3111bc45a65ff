// Copyright 2026 The BEX Wi-Fi Authors
// SPDX-License-Identifier: Apache-2.0

#pragma once

#include <chrono>
#include <condition_variable>
#include <mutex>
#include <string>
#include <thread>

namespace vendor::korvan::bex::wifi::target {

/** The program's name, which stands in front of what it says itself. */
constexpr const char* kProgram = "vendor.korvan.bex.wifi@1.0-disruptive-target-test";

/**
 * Ends the process, with one line and exit code 1, when the object lives longer than the deadline.
 * A call that hangs cannot be broken off in any other way.
 *
 *     {
 *         const Watchdog watchdog("RunTxStop(\"6\")");
 *         service->RunTxStop("6");
 *     }
 */
class Watchdog {
  public:
    /** For all that are made from then on; three minutes when never set. */
    static void setDeadline(std::chrono::seconds deadline);

    /** @param what What is waited for, as the line is to name it. */
    explicit Watchdog(std::string what);
    ~Watchdog();
    Watchdog(const Watchdog&) = delete;
    Watchdog& operator=(const Watchdog&) = delete;

  private:
    void watch();

    const std::string mWhat;
    std::mutex mLock;
    std::condition_variable mEnded;
    bool mDone = false;
    std::thread mThread;
};

} // namespace vendor::korvan::bex::wifi::target
