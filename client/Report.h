// Copyright 2026 The BEX Wi-Fi Authors
// SPDX-License-Identifier: Apache-2.0

#pragma once

#include <optional>
#include <string>

#include "client/Call.h"
#include "client/base/Json.h"

// What the user is told of a finished call.

namespace vendor::korvan::bex::wifi::client {

/**
 * The client's exit codes. Its own are below 126, so that none looks like one of the shell's.
 */
enum ExitCode {
    kSuccess = 0,
    /** The service answered -1 or "failure", the doctor found a problem, the radio may be on. */
    kFailed = 1,
    kWrongUsage = 2,
    /** The service cannot be found. */
    kNoService = 3,
    /** The transport failed in the call, or there was no thread for it. */
    kTransportFailed = 4,
    /** The deadline passed. */
    kTooLate = 5,
    /** The result could not be written. */
    kNotWritten = 6,
    /** The answer holds no count of packets, and one was required. */
    kNoCount = 7,
    /** Plus the number of the signal that ended the wait for an answer, as shells count it. */
    kSignalled = 128,
};

struct Report {
    int exitCode = kSuccess;
    /** Why it is not kSuccess, on one line; empty when it is. */
    std::string error;
};

/** The failure of a call that has no answer. `doing` says what it was, such as a method's name. */
Report judgeUnanswered(const std::string& doing, const Outcome& outcome);

/** The failure of a method's call. */
Report judge(const Request& request, const Outcome& outcome);

/** Whether the call may have started something that goes on. */
bool mayHaveStarted(const Request& request, const Outcome& outcome);

/** "stop" with the channel where it is a plain number, as a command line to copy. */
std::string stopCommandLine(const std::string& channel);

/** The object that --json prints for a call, with a newline. */
std::string jsonReport(const Request& request, const Outcome& outcome, const Report& report);

/** The members that begin the JSON objects of all calls. */
JsonObject jsonHead(const std::string& method, const JsonObject& arguments, const Report& report);

/**
 * The members that say how the call went.
 *
 * @param mayBeOn Whether the radio may be on; nothing when the call does not show it.
 */
void addCourse(const Outcome& outcome, std::optional<bool> mayBeOn, JsonObject* object);

/** The object with the members that end every report, and a newline. */
std::string withEnding(JsonObject object, const Report& report);

} // namespace vendor::korvan::bex::wifi::client
