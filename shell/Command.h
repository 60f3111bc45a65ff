// Copyright 2026 The BEX Wi-Fi Authors
// SPDX-License-Identifier: Apache-2.0

#pragma once

#include <cstdint>
#include <string>

namespace vendor::korvan::bex::wifi::V1_0::implementation {

/** What one command left behind. */
struct CommandResult {
    /** 0 when the command ran and ended with exit status 0, else -1. */
    int32_t status = -1;
    /** What the command wrote to its standard output when status is 0, else empty. */
    std::string output;
};

/**
 * Runs one command line in the shell, waits for its end and collects its standard output.
 *
 * Logs under `tag` each piece of output as it arrives (debug; a line of more than 255 bytes comes
 * in several pieces), then the command line with "successful" (debug) or "unsuccessful" (error). A
 * shell that cannot be started is not logged.
 *
 *     CommandResult result;
 *     runCommand("wl ver ", "wifi@1.0-example", result);
 *     if (result.status == 0) use(result.output);
 *
 * @param cmd The command line. The shell gets it as it stands, up to its first NUL.
 * @param tag The log tag of the caller.
 * @param result Overwritten, also when the shell cannot be started.
 */
void runCommand(const std::string& cmd, const char* tag, CommandResult& result);

} // namespace vendor::korvan::bex::wifi::V1_0::implementation
