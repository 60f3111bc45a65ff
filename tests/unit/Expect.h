// Copyright 2026 The BEX Wi-Fi Authors
// SPDX-License-Identifier: Apache-2.0

#pragma once

#include <android/log.h>
#include <gmock/gmock.h>
#include <gtest/gtest.h>

#include <string>

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
