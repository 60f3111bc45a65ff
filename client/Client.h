// Copyright 2026 The BEX Wi-Fi Authors
// SPDX-License-Identifier: Apache-2.0

#pragma once

#include <chrono>
#include <functional>
#include <ostream>
#include <string>
#include <vector>

#include "client/Call.h"
#include "client/Report.h"
#include "client/doctor/Doctor.h"

// The command line client, without a process around it.

namespace vendor::korvan::bex::wifi::client {

/** What the client needs from its surroundings. */
struct Surroundings {
    /** Gets the result and nothing else. */
    std::ostream& out;
    /** Gets one line for each exit code except 0. */
    std::ostream& err;
    /** Looks for the service once. */
    FindService tryFind;
    /** Waits for a service that is declared but does not run yet. */
    FindService awaitFind;
    /**
     * The columns of the terminal where somebody watches err, at the moment: then a slow call shows
     * there how long it takes. Null without a terminal.
     */
    std::function<size_t()> columns = nullptr;
    /** How often that display counts one second more; only tests change it. */
    std::chrono::nanoseconds second = std::chrono::seconds(1);
    /** Where the doctor looks. */
    PhoneView phone = {};
};

/**
 * Runs one command line.
 *
 * After kTooLate a thread may still be in the call (see base/Worker.h): end the process with _exit.
 *
 * @param arguments The command line without the program's name.
 * @return an ExitCode.
 */
int runClient(const std::vector<std::string>& arguments, const Surroundings& surroundings);

} // namespace vendor::korvan::bex::wifi::client
