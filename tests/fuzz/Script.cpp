// Copyright 2026 The BEX Wi-Fi Authors
// SPDX-License-Identifier: Apache-2.0

#include "tests/fuzz/Script.h"

#include <signal.h>

#include "tests/fuzz/Model.h"

namespace fuzz {

using Answer = recorder::RecordedShell::Answer;

namespace {

// Null: the input spells the part out. The empty one is in every line.
constexpr const char* kParts[] = {nullptr,        "",         "myftm",    "iwpriv",
                                  "get_rxpktcnt", "counters", "ifconfig", "rmmod",
                                  "insmod",       "con_mode", "cat",      "setprop"};

Answer readAnswer(Input& input) {
    const int statuses[] = {0, recorder::RecordedShell::exited(1), SIGKILL, -1};
    Answer answer;
    answer.status = input.oneOf(statuses);
    answer.starts = input.number(8) != 7;
    answer.output = input.text();
    return answer;
}

} // namespace

Script::Script(Input& input) {
    for (size_t count = input.number(4); count > 0; --count) {
        const char* known = input.oneOf(kParts);
        const std::string part = known == nullptr ? input.text() : known;
        mRules.emplace_back(part, readAnswer(input));
    }
}

void Script::apply(recorder::RecordedShell& shell) const {
    for (const auto& [part, answer] : mRules) shell.answer(part, answer);
}

bool Script::succeeds(const std::string& line) const {
    const Answer& answer = answerTo(line);
    return answer.starts && answer.status == 0;
}

std::string Script::outputOf(const std::string& line) const {
    return succeeds(line) ? keptOutput(answerTo(line).output) : "";
}

const Answer& Script::answerTo(const std::string& line) const {
    static const Answer kNone;
    for (auto rule = mRules.rbegin(); rule != mRules.rend(); ++rule) {
        if (line.find(rule->first) != std::string::npos) return rule->second;
    }
    return kNone;
}

} // namespace fuzz
