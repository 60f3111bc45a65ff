// Copyright 2026 The BEX Wi-Fi Authors
// SPDX-License-Identifier: Apache-2.0

#pragma once

#include <android/hidl/manager/1.0/IServiceManager.h>

#include <chrono>
#include <functional>
#include <future>
#include <optional>
#include <string>
#include <thread>

#include "client/base/Service.h"

// What the doctor asks the service manager and the service. All but ownHash() may block for ever:
//
//     auto hash = ask<Reply<Hash>>(deadline, [service] { return servedHash(service); });
//     if (!hash) return tooLate();

namespace vendor::korvan::bex::wifi::client {

using Clock = std::chrono::steady_clock;
using Transport = ::android::hidl::manager::V1_0::IServiceManager::Transport;

constexpr char kInstance[] = "default";

/**
 * The answer to a question, which is put on a thread of its own; nothing when it has not come in
 * time. The thread is then left behind, so the question owns what it uses.
 */
template <typename Result>
std::optional<Result> ask(Clock::time_point deadline, std::function<Result()> question) {
    std::packaged_task<Result()> task(std::move(question));
    std::future<Result> answer = task.get_future();
    std::thread worker(std::move(task));
    if (answer.wait_until(deadline) != std::future_status::ready) {
        worker.detach();
        return std::nullopt;
    }
    worker.join();
    return answer.get();
}

/** What came of one transaction. */
template <typename Value>
struct Reply {
    /** Why there is no value; empty when there is one. */
    std::string error;
    Value value{};
};

/** The bytes of an interface's own hash; empty when there is none. */
using Hash = std::string;

/** How the VINTF manifest lets clients reach the service. */
Reply<Transport> declaredTransport(
        const ::android::sp<::android::hidl::manager::V1_0::IServiceManager>& manager);

/** Pings the service: empty when it answers, else why it does not. */
std::string pingError(const ::android::sp<IWifiService>& service);

/** The hash that the service was built with. */
Reply<Hash> servedHash(const ::android::sp<IWifiService>& service);

/** The hash that this client was built with. */
Hash ownHash(const ::android::sp<IWifiService>& service);

/** The service's process id, -1 when the build keeps it private. */
Reply<int> servedPid(const ::android::sp<IWifiService>& service);

} // namespace vendor::korvan::bex::wifi::client
