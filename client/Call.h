// Copyright 2026 The BEX Wi-Fi Authors
// SPDX-License-Identifier: Apache-2.0

#pragma once

#include <chrono>
#include <functional>
#include <optional>

#include "client/Commands.h"
#include "client/base/Service.h"

// Finding the service and calling it, with a deadline.
//
// Threads: neither the search nor a call can be broken off, so both run on a worker thread, and the
// caller's thread only waits. The worker alone touches the service; the two share one state under
// one lock, which each keeps alive. When the deadline passes, the worker is left where it is: it
// may be inside of the platform's libraries, so the process then ends with _exit, which leaves
// their static objects alone.

namespace vendor::korvan::bex::wifi::client {

/** How a call ended. */
enum class Ending {
    /** The service answered. */
    answered,
    /** There is no service. */
    notFound,
    /** The transaction failed: Outcome::answer tells why. */
    transportFailed,
    /** The deadline passed before the service was found. */
    lateFinding,
    /** The deadline passed before the service answered. */
    lateCalling,
};

struct Outcome {
    Ending ending = Ending::notFound;
    Answer answer;
    /** From the begin of the search to the end of the call. */
    std::chrono::nanoseconds duration{};
};

/** What happens while a call is under way, on the caller's thread. */
struct Progress {
    /** The time between two ticks, the first one included. */
    std::chrono::nanoseconds interval;
    /** Called at each tick with its number: 1, 2, 3... Null for none. */
    std::function<void(long)> tick;
};

/**
 * Finds the service and makes the call. Returns when both are done, or, promptly, when the deadline
 * has passed.
 *
 * @param timeout The time for both; without one they may take as long as they like.
 */
Outcome callService(const Request& request, const FindService& find,
                    std::optional<std::chrono::nanoseconds> timeout, const Progress& progress);

} // namespace vendor::korvan::bex::wifi::client
