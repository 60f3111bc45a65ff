// Copyright 2026 The BEX Wi-Fi Authors
// SPDX-License-Identifier: Apache-2.0

#pragma once

#include <array>
#include <functional>
#include <initializer_list>
#include <string>
#include <string_view>

#include "shell/Command.h"

namespace vendor::korvan::bex::wifi::V1_0::implementation {

/**
 * One command of a table: up to 25 words, the first empty one ends it. So an empty argument cuts
 * off the words behind it, which is what the tools' users rely on.
 *
 * Words may hold blanks, quotes and redirections; the shell sees them as they stand. A row does not
 * own its words: a word made for the occasion needs a variable that outlives the run.
 */
using Row = std::array<std::string_view, 25>;

/**
 * Commands in the order in which they run. Written where it is used, as in the example below: it
 * ends with the expression that it stands in, which spares the rows a way through the heap.
 */
using Table = std::initializer_list<Row>;

/** A command line of words: each followed by one blank, the last one too. */
template <typename Iterator>
std::string lineOfWords(Iterator first, Iterator last) {
    size_t length = 0;
    for (Iterator word = first; word != last; ++word) length += word->size() + 1;
    std::string line(length, ' ');
    char* end = line.data();
    for (Iterator word = first; word != last; ++word) end += word->copy(end, word->size()) + 1;
    return line;
}

/** The command line of a row: each word followed by one blank, the last one too. */
std::string commandLine(const Row& row);

/** Runs one command line, as runCmdCom of the suites and of the sniffer controller does. */
using LineRunner = std::function<void(const std::string& cmd, CommandResult& result)>;

/**
 * Runs every command of a table in order, whatever became of the ones before.
 *
 *     CommandResult result;
 *     int status = runTable({{"ifconfig", "wlan0", "down"}, {"wl", "counters"}}, run, result);
 *
 * @param table The commands.
 * @param run Runs each command line.
 * @param result Used for every command in turn: holds the last one's result afterwards.
 * @return 0 when all succeeded, -1 when at least one failed.
 */
int runTable(const Table& table, const LineRunner& run, CommandResult& result);

} // namespace vendor::korvan::bex::wifi::V1_0::implementation
