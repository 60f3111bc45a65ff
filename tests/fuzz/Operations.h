// Copyright 2026 The BEX Wi-Fi Authors
// SPDX-License-Identifier: Apache-2.0

#pragma once

#include <array>
#include <memory>
#include <optional>
#include <string>
#include <vector>

#include "recorder/RecordedShell.h"
#include "suites/VendorTestSuit.h"
#include "tests/fuzz/Input.h"
#include "tests/fuzz/Script.h"

namespace fuzz {

using vendor::korvan::bex::wifi::V1_0::implementation::VendorTestSuit;

/** What a suite does with its tools' output, in the words of its header. */
struct Suite {
    /** Makes one that knows its driver, where that is one module file. */
    std::unique_ptr<VendorTestSuit> (*make)();
    /** What its counter prints before the count, which a start gives too. Null: myftm counts,
     * and a start says how it went. */
    const char* label;
    /** The field of myftm's statistics that is the count. */
    size_t field;
    /** Whether a line that begins with insmod may fail. */
    bool insmodMayFail;
    /** Whether the end of a reception has the result of its first line alone. */
    bool firstLineDecides;
    /** What the start of an 802.11ax reception says; null: how it went. */
    const char* axText;
};

/** Chooses the suite that the input has. */
const Suite& readSuite(Input& input);

/** The driver's module files, as one input has them: one that is the driver, and a folder. */
void readModules(Input& input, recorder::RecordedShell& shell);

/** The packet count in the output of a suite's counter; nothing when the model finds no end. */
std::optional<std::string> countOf(const Suite& suite, const std::string& output);

/** The arguments of any operation: as many texts as the longest list has. */
struct Arguments {
    std::array<std::string, 6> texts;
    bool vht = false;
};

/** Reads the first `count` texts, and the bool after them. */
Arguments readArguments(Input& input, size_t count);

struct Operation {
    enum class Kind { kTransmission, kStart, kAxStart, kStop };

    /** How many of the texts it takes. */
    size_t texts;
    /** What it leaves in `out`; transmissions leave nothing. */
    Kind kind;
    int (*run)(VendorTestSuit& suite, const Arguments& arguments, std::string& out);
};

/** In the order of IWifiService. */
extern const std::array<Operation, 11> kOperations;

/** What an operation should have left behind, by the lines that it ran. */
struct Outcome {
    int status;
    /** Nothing: the model finds no end for it. */
    std::optional<std::string> out;
};

/** The outcome of an operation that ran these lines, on tools that answer as the script says. */
Outcome outcomeOf(const Suite& suite, const Operation& operation, const Script& script,
                  const std::vector<std::string>& lines, const std::string& outBefore);

} // namespace fuzz
