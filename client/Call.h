// Copyright 2026 The BEX Wi-Fi Authors
// SPDX-License-Identifier: Apache-2.0

#pragma once

#include <chrono>
#include <optional>

#include "client/Commands.h"
#include "client/base/Service.h"
#include "client/base/Worker.h"

// Finding the service and calling it, with a deadline. Both happen on one worker thread, which
// alone touches the service (see base/Worker.h).

namespace vendor::korvan::bex::wifi::client {

/** How far a call has come. */
enum class Stage {
    /** The service has not been found: nothing was called. */
    lookup,
    /** The service was called, and has not answered. */
    call,
    /** The service answered. */
    done,
};

/** How a call ended. */
enum class Ending {
    /** The service answered. */
    answered,
    /** There is no service. */
    notFound,
    /** The transaction failed: Outcome::answer tells why. */
    transportFailed,
    /** The deadline passed; Outcome::stage tells where. */
    late,
    /** A signal came: Outcome::number. */
    interrupted,
    /** The process cannot start a thread: Outcome::number is the errno. */
    notStarted,
};

struct Outcome {
    Ending ending = Ending::notFound;
    Stage stage = Stage::lookup;
    Answer answer;
    int number = 0;
    /** When the search began. */
    std::chrono::system_clock::time_point started{};
    /** From the start of the search to the end of the call. */
    std::chrono::nanoseconds duration{};
};

/** Sets the ending of a call that was not waited for. */
void applyWait(const Waited& waited, Outcome* outcome);

/**
 * Finds the service and makes the call. Returns when both are done, or, promptly, when the deadline
 * has passed or a signal has come.
 *
 * @param timeout The time for both; without it they may take any time.
 */
Outcome callService(const Request& request, const FindService& find,
                    std::optional<std::chrono::nanoseconds> timeout, const Progress& progress);

} // namespace vendor::korvan::bex::wifi::client
