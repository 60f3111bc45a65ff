// Copyright 2026 The BEX Wi-Fi Authors
// SPDX-License-Identifier: Apache-2.0

#pragma once

#include <initializer_list>
#include <string>
#include <string_view>

#include "shell/CommandTable.h"

namespace vendor::korvan::bex::wifi::V1_0::implementation {

/**
 * One command of a list: any number of tokens. Unlike in a Row an empty one does not end it: it
 * leaves its blank in the line. Like a Row it does not own its words.
 */
using Tokens = std::initializer_list<std::string_view>;

/**
 * Commands in the order in which they run. Written where it is used, as in runList(..., {{"rmmod",
 * "wlan.ko"}, {"insmod", path}}, ...): it ends with the expression that it stands in.
 */
using CommandList = std::initializer_list<Tokens>;

/** The command line of a token list: each token followed by one blank, empty ones too. */
std::string tokenLine(const Tokens& tokens);

/**
 * Runs every command of a list in order, whatever became of the ones before. Logs each line at
 * error priority before it runs, so that it shows in a log that keeps nothing less: "<method>:
 * <line>".
 *
 * A command whose line begins with "insmod" may fail: a driver may be loaded already or may not fit
 * the chip. A path in front of the word, as in "/vendor/bin/insmod", takes that licence away.
 *
 * @param method The operation's name, for the log.
 * @param tag The log tag of the caller.
 * @param list The commands.
 * @param run Runs each command line.
 * @param result Used for every command in turn: holds the last one's result afterwards.
 * @return 0 when all succeeded that may not fail, else -1.
 */
int runList(const char* method, const char* tag, const CommandList& list, const LineRunner& run,
            CommandResult& result);

} // namespace vendor::korvan::bex::wifi::V1_0::implementation
