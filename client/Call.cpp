// Copyright 2026 The BEX Wi-Fi Authors
// SPDX-License-Identifier: Apache-2.0

#include "client/Call.h"

#include <algorithm>
#include <condition_variable>
#include <memory>
#include <mutex>
#include <thread>

namespace vendor::korvan::bex::wifi::client {
namespace {

using Clock = std::chrono::steady_clock;

struct Shared {
    std::mutex lock;
    std::condition_variable ended;
    // Where the worker is: before its end this says how a deadline would find it.
    Ending ending = Ending::lateFinding;
    Answer answer;
    bool done = false;

    void end(Ending how, Answer what) {
        const std::lock_guard<std::mutex> guard(lock);
        ending = how;
        answer = std::move(what);
        done = true;
        ended.notify_one();
    }
};

void work(const Request& request, const FindService& find, Shared* shared) {
    const ::android::sp<IWifiService> service = find();
    if (service == nullptr) {
        shared->end(Ending::notFound, {});
        return;
    }
    {
        const std::lock_guard<std::mutex> guard(shared->lock);
        shared->ending = Ending::lateCalling;
    }
    Answer answer = request.command->call(*service, request.values);
    const Ending ending = answer.delivered ? Ending::answered : Ending::transportFailed;
    shared->end(ending, std::move(answer));
}

} // namespace

Outcome callService(const Request& request, const FindService& find,
                    std::optional<std::chrono::nanoseconds> timeout, const Progress& progress) {
    const Clock::time_point start = Clock::now();
    const Clock::time_point deadline = timeout ? start + *timeout : Clock::time_point::max();
    const auto shared = std::make_shared<Shared>();
    std::thread worker([request, find, shared] { work(request, find, shared.get()); });

    std::unique_lock<std::mutex> guard(shared->lock);
    for (long tick = 1; !shared->done; ++tick) {
        // Without a timeout the wait still ends at each tick: a wait for time_point::max()
        // overflows in some C++ libraries.
        const Clock::time_point wake = std::min(deadline, start + tick * progress.interval);
        shared->ended.wait_until(guard, wake, [&shared] { return shared->done; });
        if (shared->done || Clock::now() >= deadline) break;
        if (progress.tick) {
            guard.unlock();
            progress.tick(tick);
            guard.lock();
        }
    }
    const bool done = shared->done;
    Outcome outcome{shared->ending, shared->answer, Clock::now() - start};
    guard.unlock();
    if (done) {
        worker.join();
    } else {
        worker.detach();
    }
    return outcome;
}

} // namespace vendor::korvan::bex::wifi::client
