// Copyright 2026 The BEX Wi-Fi Authors
// SPDX-License-Identifier: Apache-2.0

#pragma once

#include <android/log.h>
#include <gmock/gmock.h>
#include <gtest/gtest.h>
#include <stdlib.h>

#include <stdexcept>
#include <string>
#include <vector>

#include "recorder/RecordedShell.h"

// What the unit tests say again and again about log lines and commands.

using recorder::RecordedShell;
using ::testing::ElementsAre;
using ::testing::IsEmpty;

inline RecordedShell::LogLine debug(const std::string& tag, const std::string& text) {
    return {ANDROID_LOG_DEBUG, tag, text};
}

inline RecordedShell::LogLine error(const std::string& tag, const std::string& text) {
    return {ANDROID_LOG_ERROR, tag, text};
}

/** A command that ran, printed nothing of use and ended with exit status 1. */
inline RecordedShell::Answer failing(const std::string& output = "") {
    return {output, RecordedShell::exited(1)};
}

/** Every line of `operation` fails once: the others still run, and it gives -1, or 0 if `mayFail`.
 */
template <typename Operation>
void failEachLine(
        RecordedShell& shell, Operation operation,
        bool (*mayFail)(const std::string&) = [](const std::string&) { return false; }) {
    shell.clear();
    ASSERT_EQ(0, operation());
    const std::vector<std::string> lines = shell.lines();
    for (const std::string& line : lines) {
        shell.clear();
        shell.answer(line, failing());
        EXPECT_EQ(mayFail(line) ? 0 : -1, operation()) << line;
        EXPECT_EQ(lines, shell.lines()) << line;
        shell.answer(line, {});
    }
}

/** What a vector of `size` elements says when it is asked for the element at `index`. */
inline std::string rangeMessage(size_t index, size_t size) {
    try {
        std::vector<int>(size).at(index) = 0;
    } catch (const std::out_of_range& error) {
        return error.what();
    }
    return "";
}

/**
 * Runs `code` in a process of its own, where no suite has found a driver yet: in a test whose class
 * is called ...DeathTest, since those run before all others and the process is a fork of theirs.
 */
template <typename Code>
void inFreshProcess(Code code) {
    EXPECT_EXIT(
            {
                code();
                exit(::testing::Test::HasFailure() ? 1 : 0);
            },
            ::testing::ExitedWithCode(0), "");
}
