// Copyright 2026 The BEX Wi-Fi Authors
// SPDX-License-Identifier: Apache-2.0

#pragma once

#include <pthread.h>

#include <chrono>
#include <functional>
#include <memory>
#include <optional>

// Work that cannot be interrupted, such as a call of the service, and a wait for it that can:
//
//     auto hash = ask<Reply<Hash>>(deadline, [service] { return servedHash(service); });
//     if (!hash) return tooLate();
//
// Threads: the work runs on a separate thread, and the caller's thread only waits. When the wait
// ends first, the worker goes on. It may be inside the platform's libraries, so the process must
// then end with _exit, which does not destroy their static objects.

namespace vendor::korvan::bex::wifi::client {

using Clock = std::chrono::steady_clock;

/** A deadline that never passes. */
constexpr Clock::time_point kNever = Clock::time_point::max();

/** Work on a separate thread, which goes on by itself unless it is joined. */
class Worker {
  public:
    explicit Worker(std::function<void()> work);
    ~Worker();
    Worker(const Worker&) = delete;
    Worker& operator=(const Worker&) = delete;

    /** 0, or the errno that says why there is no thread: the work has not begun. */
    int error() const { return mError; }
    bool done() const;
    /** Readable when the work is done. */
    int fd() const;
    /** Waits for the end of the thread. */
    void join();

  private:
    struct Task;

    static void* run(void* task);

    std::shared_ptr<Task> mTask;
    pthread_t mThread{};
    int mError = 0;
    bool mRuns = false;
};

/** What happens during a wait, on the caller's thread. */
struct Progress {
    /** The time between two ticks, the first one included. */
    std::chrono::nanoseconds interval = std::chrono::hours(1);
    /** Called at each tick with its number: 1, 2, 3... Null for none. */
    std::function<void(long)> tick = nullptr;
};

/** How a wait ended. */
struct Waited {
    enum class End {
        /** The work is done. */
        done,
        /** The deadline passed. */
        late,
        /** SIGINT or SIGTERM came. */
        interrupted,
        /** There is no thread for the work: it has not begun. */
        notStarted,
    };

    End end;
    /** The signal that came, or the errno that says why there is no thread. */
    int number = 0;
};

/**
 * Does the work on a separate thread, and waits for it.
 *
 * While it waits, SIGINT and SIGTERM do not kill the process but end the wait, except where the
 * process ignores them.
 *
 * @param work Must own everything that it uses: it may still run after the wait has ended.
 */
Waited waitFor(std::function<void()> work, Clock::time_point deadline, const Progress& progress);

/** The answer to a question that may block for ever; nothing when it does not come in time. */
template <typename Result>
std::optional<Result> ask(Clock::time_point deadline, std::function<Result()> question) {
    const auto answer = std::make_shared<std::optional<Result>>();
    const Waited waited =
            waitFor([answer, question = std::move(question)] { *answer = question(); }, deadline,
                    {});
    if (waited.end != Waited::End::done) return std::nullopt;
    return std::move(*answer);
}

} // namespace vendor::korvan::bex::wifi::client
