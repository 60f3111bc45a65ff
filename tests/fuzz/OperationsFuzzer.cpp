// Copyright 2026 The BEX Wi-Fi Authors
// SPDX-License-Identifier: Apache-2.0

// Every operation of every suite and of the sniffer controllers, with any arguments, on tools that
// print and return anything. See tests/fuzz/README.md.

#include <functional>
#include <memory>
#include <string>
#include <vector>

#include "sniffer/Qca639xSnifferTool.h"
#include "sniffer/SnifferTool.h"
#include "sniffer/Wcn685xSnifferTool.h"
#include "tests/fuzz/Check.h"
#include "tests/fuzz/Input.h"
#include "tests/fuzz/Operations.h"
#include "tests/fuzz/Script.h"

namespace fuzz {
namespace {

using recorder::RecordedShell;
using vendor::korvan::bex::wifi::V1_0::implementation::Qca639xSnifferTool;
using vendor::korvan::bex::wifi::V1_0::implementation::SnifferTool;
using vendor::korvan::bex::wifi::V1_0::implementation::Wcn685xSnifferTool;
using Lines = std::vector<std::string>;

constexpr const char* kBefore = "left over";

/** The lines of one run, and what they ran for. */
template <typename Run>
Lines linesOf(RecordedShell& shell, Run run) {
    shell.clear();
    run();
    return shell.lines();
}

bool endsWith(const std::string& text, const std::string& end) {
    return text.size() >= end.size() &&
           text.compare(text.size() - end.size(), end.size(), end) == 0;
}

std::string tool(const std::string& line) {
    return line.substr(0, line.find(' '));
}

/**
 * A table gives each of its words one blank. The shell gets a line up to its first NUL, so an
 * argument that has one may be the end; one that is empty or ends in a blank may add its own.
 */
void checkEnd(const std::string& line, const Arguments& arguments) {
    bool cut = false;
    bool blank = false;
    for (const std::string& text : arguments.texts) {
        const size_t nul = text.find('\0');
        cut = cut || (nul != std::string::npos && endsWith(line, text.substr(0, nul)));
        blank = blank || text.empty() || text.back() == ' ';
    }
    if (cut) return;
    check(endsWith(line, " "), "a line ends in a blank", quoted(line));
    check(blank || !endsWith(line, "  "), "a line ends in one blank", quoted(line));
}

/**
 * How many lines there are, and which tools they call, is the table's alone: neither arguments nor
 * what the tools answer changes it. Only the driver's module files do, and they are the same here.
 */
void checkLines(const Lines& plain, const Lines& lines, const Arguments& arguments) {
    check(plain.size() == lines.size(), "the number of lines is the table's",
          std::to_string(lines.size()) + " instead of " + std::to_string(plain.size()));
    for (size_t i = 0; i < lines.size(); ++i) {
        checkEqual(tool(plain[i]), tool(lines[i]), "a line's tool is the table's");
        checkEnd(lines[i], arguments);
    }
}

const Arguments kPlain = {{"1", "1", "1", "1", "1", "1"}, false};

void fuzzSuite(Input& input, RecordedShell& shell) {
    const Suite& suite = readSuite(input);
    const Operation& operation = kOperations[input.number(kOperations.size())];
    readModules(input, shell);
    const Arguments arguments = readArguments(input, operation.texts);
    const Script script(input);

    const std::unique_ptr<VendorTestSuit> subject = suite.make();
    std::string out;
    const Lines plain = linesOf(shell, [&] { operation.run(*subject, kPlain, out); });
    script.apply(shell);
    out = kBefore;
    int status = 0;
    const Lines lines = linesOf(shell, [&] { status = operation.run(*subject, arguments, out); });

    checkLines(plain, lines, arguments);
    const Outcome expected = outcomeOf(suite, operation, script, lines, kBefore);
    check(status == expected.status, "the result is 0 when every line that counts succeeded, or -1",
          std::to_string(status));
    if (expected.out) checkEqual(*expected.out, out, "the text has its form");
}

using MakeSniffer = std::unique_ptr<SnifferTool> (*)();
constexpr MakeSniffer kSniffers[] = {
        []() -> std::unique_ptr<SnifferTool> { return std::make_unique<SnifferTool>(); },
        []() -> std::unique_ptr<SnifferTool> { return std::make_unique<Qca639xSnifferTool>(); },
        []() -> std::unique_ptr<SnifferTool> { return std::make_unique<Wcn685xSnifferTool>(); },
};

void fuzzSnifferMode(SnifferTool& subject, const Script& script, RecordedShell& shell) {
    bool monitors = false;
    int mode = 0;
    const Lines asked = linesOf(shell, [&] { monitors = subject.isSnifferMode(); });
    const Lines read = linesOf(shell, [&] { mode = subject.getWlanMode(); });
    check(asked == read && read.size() == 1, "the mode is read by one line",
          std::to_string(read.size()));
    check(mode == -1 || mode == 0 || mode == 4 || mode == 5, "a mode is -1, 0, 4 or 5",
          std::to_string(mode));
    const bool unreadable = script.outputOf(read[0]).empty();
    check(!unreadable || mode == -1, "a mode that cannot be read is -1", std::to_string(mode));
    check(monitors == (unreadable || mode == 4),
          "monitor mode is mode 4, or one that cannot be read", std::to_string(mode));
}

void fuzzSniffer(Input& input, RecordedShell& shell) {
    const std::unique_ptr<SnifferTool> subject = input.oneOf(kSniffers)();
    const size_t operation = input.number(3);
    const Arguments arguments = readArguments(input, 2);
    const Script script(input);
    auto run = [&](const Arguments& given) {
        return operation == 0 ? subject->snifferStart(given.texts[0], given.texts[1])
                              : subject->snifferStop();
    };

    const Lines plain = linesOf(shell, [&] { run(kPlain); });
    script.apply(shell);
    if (operation == 2) return fuzzSnifferMode(*subject, script, shell);
    int status = 0;
    const Lines lines = linesOf(shell, [&] { status = run(arguments); });
    checkLines(plain, lines, arguments);
    bool allSucceed = true;
    for (const std::string& line : lines) allSucceed = allSucceed && script.succeeds(line);
    check(status == (allSucceed ? 0 : -1), "the result is 0 when every line succeeded, or -1",
          std::to_string(status));
}

} // namespace
} // namespace fuzz

extern "C" int LLVMFuzzerTestOneInput(const uint8_t* data, size_t size) {
    fuzz::Input input(data, size);
    recorder::RecordedShell shell;
    if (input.number(8) == 7) {
        fuzz::fuzzSniffer(input, shell);
    } else {
        fuzz::fuzzSuite(input, shell);
    }
    return 0;
}
