// Copyright 2026 The BEX Wi-Fi Authors
// SPDX-License-Identifier: Apache-2.0

// The string tools and the packet counts, compared with the model of their contracts. See
// tests/fuzz/README.md.

#include <memory>
#include <optional>
#include <string>
#include <vector>

#include "suites/BrcmTestSuit.h"
#include "suites/Reception.h"
#include "tests/fuzz/Check.h"
#include "tests/fuzz/Input.h"
#include "tests/fuzz/Model.h"
#include "tests/fuzz/Operations.h"

namespace fuzz {
namespace {

namespace suites = vendor::korvan::bex::wifi::V1_0::implementation;

std::string joined(const std::vector<std::string>& texts) {
    std::string all;
    for (const std::string& text : texts) all += quoted(text) + ',';
    return all;
}

void fuzzReplace(Input& input, VendorTestSuit& suite) {
    const std::string text = input.text();
    const std::string from = input.text();
    const std::string to = input.text();
    // Without an end there is nothing to compare, and the tool would not come back.
    const std::optional<std::string> expected = replaced(text, from, to);
    if (expected) {
        checkEqual(*expected, suite.replaceSubString(text, from, to), "replaceSubString");
    }
}

void fuzzSplit(Input& input, VendorTestSuit& suite) {
    const std::string text = input.text();
    const std::string separator = input.text();
    if (separator.empty()) return; // has no end
    checkEqual(joined(pieces(text, separator)), joined(suite.splitString(text, separator)),
               "splitString");
}

void fuzzCountWithout(Input& input, VendorTestSuit& suite) {
    const std::string label = input.text();
    const std::string output = input.text();
    const std::optional<std::string> expected = countWithoutLabel(label, output);
    if (expected) {
        checkEqual(*expected, suites::countWithout(suite, label, output), "countWithout");
    }
}

void fuzzGoodPackets(Input& input, VendorTestSuit& suite) {
    const size_t field = input.number(4);
    const std::string output = input.text();
    checkEqual(goodPacketsField(field, output), suites::goodPackets(suite, "tag", field, output),
               "goodPackets");
}

void fuzzReceivedText(Input& input, VendorTestSuit& suite) {
    const size_t field = input.number(4);
    const std::string output = input.text();
    const std::optional<std::string> expected = received(field, output);
    if (expected) {
        checkEqual(*expected, suites::receivedText(suite, "tag", field, output), "receivedText");
    }
}

/** What a client gets when a reception ends and every tool prints the same. */
void fuzzStop(Input& input, recorder::RecordedShell& shell) {
    const Suite& suite = readSuite(input);
    const std::string printed = input.text();
    shell.readable("/vendor/lib/modules/wlan.ko");
    shell.answer("", {printed});
    std::string out = "left over";
    const int status = suite.make()->RunRxStop("6", out);
    check(status == 0, "the end of a reception succeeds", std::to_string(status));
    const std::optional<std::string> expected = countOf(suite, keptOutput(printed));
    if (expected) checkEqual(*expected, out, "the count of a suite");
}

using Fuzz = void (*)(Input& input, VendorTestSuit& suite);
constexpr Fuzz kTools[] = {fuzzReplace, fuzzSplit, fuzzCountWithout, fuzzGoodPackets,
                           fuzzReceivedText};

} // namespace
} // namespace fuzz

extern "C" int LLVMFuzzerTestOneInput(const uint8_t* data, size_t size) {
    fuzz::Input input(data, size);
    recorder::RecordedShell shell;
    const size_t subject = input.number(std::size(fuzz::kTools) + 1);
    if (subject < std::size(fuzz::kTools)) {
        // Any suite will do: the tools are the base's.
        fuzz::suites::BrcmTestSuit suite;
        fuzz::kTools[subject](input, suite);
    } else {
        fuzz::fuzzStop(input, shell);
    }
    return 0;
}
