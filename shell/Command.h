// Copyright 2026 The BEX Wi-Fi Authors
// SPDX-License-Identifier: Apache-2.0

#pragma once

#include <optional>
#include <string>

namespace vendor::korvan::bex::wifi::V1_0::implementation {

/**
 * Runs one command line in the shell, waits for its end and collects its standard output.
 *
 * Logs under `tag` each piece of output as it arrives (debug; a line of more than 255 bytes comes
 * in several pieces), then the command line with "successful" (debug) or "unsuccessful" (error). A
 * shell that cannot be started is not logged.
 *
 * @param cmd The command line. The shell gets it unchanged, up to its first NUL.
 * @param tag The log tag of the caller.
 * @return The output; nothing when the command did not run or did not end with exit status 0.
 */
std::optional<std::string> runCommand(const std::string& cmd, const char* tag);

} // namespace vendor::korvan::bex::wifi::V1_0::implementation
