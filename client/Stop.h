// Copyright 2026 The BEX Wi-Fi Authors
// SPDX-License-Identifier: Apache-2.0

#pragma once

#include <string>
#include <vector>

#include "client/Call.h"

// `bex-wifi-client stop`: ends whatever runs, by the methods that exist, and tells whether the
// radio is off.
//
// A stop proves nothing about a start that is still running, for its commands go on afterwards. The
// service serves two calls at once and takes them in the order in which they come. So, while one of
// our calls runs its commands, a question that needs none is answered at once, unless a third call
// is there: then it waits for the end of ours. The calls are made once to find that out, and made
// again when there is no other.

namespace vendor::korvan::bex::wifi::client {

/** One of the calls that end something. */
struct StopCall {
    const Command* command;
    Answer answer;
};

struct Stopped {
    /** Ending::answered when every call was answered, whatever it was. */
    Outcome outcome;
    /** Whether the service was in no other call any more before these. */
    bool alone = false;
    /** Of the last time that all were made, in order. */
    std::vector<StopCall> calls;
    /** Whether the calls' answers prove that the radio is off. */
    bool off = false;
};

/**
 * The methods whose answer 0, of all of them, proves that the radio is off.
 *
 * @param family The chip family's name; the strictest proof for one that is not known.
 */
std::vector<std::string> proofOf(const std::string& family);

/**
 * Makes the calls until the service is in no other call meanwhile, and then up to three times more,
 * until they prove that the radio is off.
 *
 * @param channel The argument of the calls that take one.
 */
Stopped stopRadio(const std::string& channel, const std::string& family, const FindService& find,
                  std::chrono::nanoseconds timeout, const Progress& progress);

} // namespace vendor::korvan::bex::wifi::client
