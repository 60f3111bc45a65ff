// Copyright 2026 The BEX Wi-Fi Authors
// SPDX-License-Identifier: Apache-2.0

#pragma once

#include <string>
#include <utility>
#include <vector>

#include "recorder/RecordedShell.h"
#include "tests/fuzz/Input.h"

namespace fuzz {

/** The phone's tools as one input has them: which lines print what, and which fail. */
class Script {
  public:
    /** Up to three rules: a part of the line, what it prints, and how it ends. */
    explicit Script(Input& input);

    /** Makes the recorded shell answer so. */
    void apply(recorder::RecordedShell& shell) const;

    /** Whether a line succeeds. */
    bool succeeds(const std::string& line) const;

    /** What a caller of runCommand gets as the line's output. */
    std::string outputOf(const std::string& line) const;

  private:
    const recorder::RecordedShell::Answer& answerTo(const std::string& line) const;

    std::vector<std::pair<std::string, recorder::RecordedShell::Answer>> mRules;
};

} // namespace fuzz
