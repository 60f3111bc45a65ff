// Copyright 2026 The BEX Wi-Fi Authors
// SPDX-License-Identifier: Apache-2.0

#pragma once

#include <string>
#include <vector>

#include "client/Call.h"

// `bex-wifi-client stop`: ends whatever runs, by calls of the interface's methods, and says whether
// the radio is off.
//
// A stop proves nothing about a start that is still running, for its commands go on afterwards. The
// service serves two calls at once and takes them in the order in which they come. So, while one of
// our calls runs its commands, the service answers a question that needs no command at once. Only
// when there is a third call does it wait for the end of ours. We make the calls once to
// find that out, and again when there is no other call.

namespace vendor::korvan::bex::wifi::client {

/** One of the calls that end something. */
struct StopCall {
    const Command* command;
    Answer answer;
};

struct Stopped {
    /** Ending::answered when every call was answered, whatever it was. */
    Outcome outcome;
    /** Whether the service had finished all other calls before these. */
    bool alone = false;
    /** The last round of calls, in order. */
    std::vector<StopCall> calls;
    /** Whether the calls' answers prove that the radio is off. */
    bool off = false;
};

/**
 * The methods that prove the radio off when all of them answer 0.
 *
 * @param family The chip family's name; an unknown one needs the strictest proof.
 */
std::vector<std::string> proofOf(const std::string& family);

/**
 * Makes the calls until the service is in no other call at the same time. Then makes them up to
 * three times more, until they prove that the radio is off.
 *
 * @param channel The argument of the calls that take one.
 */
Stopped stopRadio(const std::string& channel, const std::string& family, const FindService& find,
                  std::chrono::nanoseconds timeout, const Progress& progress);

} // namespace vendor::korvan::bex::wifi::client
