// Copyright 2026 The BEX Wi-Fi Authors
// SPDX-License-Identifier: Apache-2.0

#pragma once

#include <string>
#include <utility>
#include <vector>

namespace recorder {

/**
 * Stands in for the shell, the log and the files of a whole process. Nothing runs: each command
 * line is recorded, and its answer is the one that was set. The only files are those that were set.
 *
 * A program that links this library has popen, pclose, access, opendir, readdir, closedir and
 * __android_log_print of its own in front of the C library's and liblog's. They act on the one
 * RecordedShell alive. While there is none, popen fails, log lines are dropped and the file
 * functions are the C library's. Safe to use from several threads.
 *
 *     RecordedShell shell;
 *     shell.answer("wl counters", {"pktengrxdmcast 12\n"});
 *     shell.readable("/vendor/lib/modules/wlan.ko");
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
        /** What the text was made from. Comparisons ignore it. */
        std::string format = {};
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

    /** Lets access find a file that can be read; it finds no other one and knows no other right. */
    void readable(const std::string& path);

    /** Lets access find the file no longer. */
    void unreadable(const std::string& path);

    /** Lets opendir open a directory with these entries, in this order; it opens no other one. */
    void directory(const std::string& path, std::vector<std::string> names);

    /** The files that access was asked for, in order. */
    std::vector<std::string> probed() const;

    /** The command lines that were run, in order. */
    std::vector<std::string> lines() const;

    /** The log lines that were written, in order. */
    std::vector<LogLine> log() const;

    /** Tells whether every command has been closed by pclose and every directory by closedir. */
    bool allClosed() const;

    /** The log lines of one tag, in order. */
    std::vector<LogLine> log(const std::string& tag) const;

    /** Forgets what was run, logged and probed, and keeps the answers and the files. */
    void clear();
};

/** Lets a failed expectation print the line. */
std::ostream& operator<<(std::ostream& stream, const RecordedShell::LogLine& line);

} // namespace recorder
