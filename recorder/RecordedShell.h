// Copyright 2026 The BEX Wi-Fi Authors
// SPDX-License-Identifier: Apache-2.0

#pragma once

#include <string>
#include <utility>
#include <vector>

namespace recorder {

/**
 * Stands in for the shell and the log of a whole process: what the process would run is written
 * down and answered as told, and nothing runs.
 *
 * A program that links this library has popen, pclose and __android_log_print of its own in front
 * of the C library's and liblog's. They act on the one RecordedShell alive; while there is none,
 * popen fails and log lines are dropped. Safe to use from several threads.
 *
 *     RecordedShell shell;
 *     shell.answer("wl counters", {"pktengrxdmcast 12\n"});
 *     suite.RunRxStop("6", out);
 *     EXPECT_THAT(shell.lines(), ElementsAre(...));
 */
class RecordedShell {
  public:
    /** What a command line gives when it is run. */
    struct Answer {
        /** Its standard output. */
        std::string output;
        /** What pclose returns: 0, or a wait status such as exited(1). */
        int status = 0;
        /** false: popen itself fails. */
        bool starts = true;
    };

    struct LogLine {
        int priority;
        std::string tag;
        std::string text;
        bool operator==(const LogLine& other) const;
    };

    /** The wait status of a command that ended with an exit status. */
    static constexpr int exited(int status) { return status << 8; }

    RecordedShell();
    ~RecordedShell();
    RecordedShell(const RecordedShell&) = delete;
    RecordedShell& operator=(const RecordedShell&) = delete;

    /**
     * Sets the answer of every line that contains `part`; the rule set last wins. Lines that no
     * rule matches print nothing and succeed.
     */
    void answer(const std::string& part, Answer answer);

    /** The command lines that were run, in order. */
    std::vector<std::string> lines() const;

    /** The log lines that were written, in order. */
    std::vector<LogLine> log() const;

    /** The log lines of one tag, in order. */
    std::vector<LogLine> log(const std::string& tag) const;

    /** Forgets what was run and logged, and keeps the answers. */
    void clear();
};

/** Lets a failed expectation print the line. */
std::ostream& operator<<(std::ostream& stream, const RecordedShell::LogLine& line);

} // namespace recorder
