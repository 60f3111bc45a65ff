// Copyright 2026 The BEX Wi-Fi Authors
// SPDX-License-Identifier: Apache-2.0

#pragma once

#include <android/log.h>

#include <functional>
#include <string>
#include <vector>

namespace vendor::korvan::bex::wifi::V1_0::implementation {

/** The words of one command. They may hold blanks, quotes and redirections: nothing is quoted. */
using Command = std::vector<std::string>;

/** Commands in the order in which they run. */
using CommandTable = std::vector<Command>;

/**
 * The command line of the words before the first empty one, each followed by one blank. So an empty
 * argument cuts off the words after it, which is what the tools' users rely on.
 */
std::string lineUpToEmptyWord(const Command& command);

/** The command line of all words, each followed by one blank: an empty word leaves its blank. */
std::string lineOfEveryWord(const Command& command);

/** Whether a driver may refuse the line: it may be loaded already, or not fit the chip. */
bool isInsmod(const std::string& line);

/** Hands on the output of one row of a table, counted from 1, as soon as that row has run. */
struct AfterRow {
    size_t row = 0;
    std::function<void(const std::string& output)> take;
};

/**
 * Runs every command of a table in order, also after a failure; a line ends at its first empty
 * word.
 *
 *     return runTable(*this, {{"ifconfig", "wlan0", "down"}, {"wl", "counters"}},
 *                     AfterRow{2, [&](const std::string& output) { out = output; }});
 *
 * @param runner The suite or sniffer controller whose runCmdCom runs the lines.
 * @return 0 when all succeeded, else -1.
 */
template <typename Runner>
int runTable(Runner& runner, const CommandTable& table, const AfterRow& after = {}) {
    int status = 0;
    typename Runner::CmdRunResult result;
    for (size_t row = 1; row <= table.size(); ++row) {
        runner.runCmdCom(lineUpToEmptyWord(table[row - 1]), result);
        if (result.status != 0) status = -1;
        if (row == after.row) after.take(result.output);
    }
    return status;
}

/**
 * The same with every word in the line, and with each line in the log before it runs, as "<method>:
 * <line>". The priority is error, so that a log which keeps errors only has the line.
 *
 * A line that begins with "insmod" may fail. A line that begins with a path, such as
 * "/vendor/bin/insmod", may not.
 *
 * @param tag The runner's log tag.
 * @param method The operation's name, for the log.
 */
template <typename Runner>
int runLoggedTable(Runner& runner, const char* tag, const std::string& method,
                   const CommandTable& table, const AfterRow& after = {}) {
    const std::string format = method + ": %s";
    int status = 0;
    typename Runner::CmdRunResult result;
    for (size_t row = 1; row <= table.size(); ++row) {
        const std::string line = lineOfEveryWord(table[row - 1]);
        __android_log_print(ANDROID_LOG_ERROR, tag, format.c_str(), line.c_str());
        runner.runCmdCom(line, result);
        if (result.status != 0 && !isInsmod(line)) status = -1;
        if (row == after.row) after.take(result.output);
    }
    return status;
}

} // namespace vendor::korvan::bex::wifi::V1_0::implementation
