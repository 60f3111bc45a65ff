// Copyright 2026 The BEX Wi-Fi Authors
// SPDX-License-Identifier: Apache-2.0

#include "client/Client.h"

#include <android-base/strings.h>

#include <algorithm>
#include <cerrno>
#include <cstring>

#include "client/Arguments.h"
#include "client/FamilyHelp.h"
#include "client/Help.h"
#include "client/Stop.h"
#include "client/base/Json.h"
#include "client/base/Logcat.h"
#include "client/base/Text.h"
#include "client/doctor/PhoneChecks.h"

namespace vendor::korvan::bex::wifi::client {
namespace {

constexpr char kHelp[] = "help";
constexpr char kList[] = "list";
constexpr char kDoctor[] = "doctor";
constexpr char kStop[] = "stop";
constexpr std::chrono::seconds kDoctorTimeout(5);
constexpr std::chrono::seconds kStopTimeout(60);
// The driver is reloaded or its interface taken down, whatever the channel.
constexpr char kAnyChannel[] = "1";

int fail(const Surroundings& to, int exitCode, const std::string& error) {
    to.err << "bex-wifi-client: " << error << std::endl;
    return exitCode;
}

int wrongUsage(const Surroundings& to, const std::string& problem, const char* method = nullptr) {
    return fail(to, kWrongUsage,
                problem + "; see bex-wifi-client " + (method ? std::string(method) + " " : "") +
                        "--help");
}

int print(const Surroundings& to, const std::string& text) {
    errno = 0;
    to.out << text << std::flush;
    if (to.out) return kSuccess;
    const std::string reason = errno != 0 ? std::string(": ") + strerror(errno) : "";
    return fail(to, kNotWritten, "cannot write the result to stdout" + reason);
}

/** Prints the text, then why it is not kSuccess. */
int conclude(const Surroundings& to, const std::string& text, const Report& report) {
    const int written = print(to, text);
    if (written != kSuccess) return written;
    return report.error.empty() ? kSuccess : fail(to, report.exitCode, report.error);
}

/**
 * Calls `wait` with what to do meanwhile: on a terminal, show how long the call has taken.
 */
template <typename Wait>
auto watched(const std::string& doing, const Surroundings& to, Wait wait) {
    size_t widest = 0;
    const auto show = [&](std::string text) {
        // The last column stays free, since some terminals begin a new line once it is filled.
        const size_t room = std::max<size_t>(to.columns(), 1) - 1;
        text.resize(std::min(text.size(), room));
        widest = std::max(widest, text.size());
        to.err << '\r' << text << std::flush;
    };
    Progress progress{to.second, nullptr};
    if (to.columns) {
        progress.tick = [&](long seconds) { show(doing + ": " + std::to_string(seconds) + " s"); };
    }
    auto result = wait(progress);
    if (widest != 0) {
        show(std::string(widest, ' '));
        to.err << '\r' << std::flush;
    }
    return result;
}

Outcome callWatched(const Request& request, const CommandLine& line, const Surroundings& to) {
    return watched(request.command->name, to, [&](const Progress& progress) {
        return callService(request, line.timeout ? to.awaitFind : to.tryFind, line.timeout,
                           progress);
    });
}

int list(const CommandLine& line, const Surroundings& to) {
    if (line.words.size() > 1) return wrongUsage(to, "list takes no arguments");
    return print(to, line.json ? listJson() : listText());
}

int doctor(const CommandLine& line, const Surroundings& to) {
    if (line.words.size() > 1) return wrongUsage(to, "doctor takes no arguments");
    const Checks checks = examine(to.tryFind, to.phone, line.timeout.value_or(kDoctorTimeout));
    const size_t problems = countProblems(checks);
    Report report = {kSuccess, ""};
    if (problems != 0) {
        report = {kFailed, "the doctor found " + std::to_string(problems) +
                                   (problems == 1 ? " problem" : " problems") +
                                   ": each names what to do"};
    }
    std::string text = checksText(checks);
    if (line.json) {
        JsonObject object;
        object.add("schema_version", kSchemaVersion)
                .add("ok", report.exitCode == kSuccess ? "true" : "false")
                .add("checks", checksJson(checks));
        text = withEnding(object, report);
    }
    return conclude(to, text, report);
}

Report judgeStop(const std::string& channel, const Stopped& stopped) {
    if (stopped.off) return {};
    const std::string again = stopCommandLine(channel);
    Report report = judgeUnanswered("stop", stopped.outcome);
    if (stopped.outcome.ending == Ending::answered) {
        report = {kFailed, std::string("the calls do not prove that the radio is off: ") +
                                   kWhichCommandFailed + ": " + logcat()};
    } else if (stopped.outcome.ending == Ending::late && stopped.outcome.stage == Stage::call &&
               !stopped.alone) {
        report.error = "the deadline passed while waiting for another call to end";
    }
    report.error += "; the radio may be on, try again: " + again;
    return report;
}

std::string stopText(const Stopped& stopped) {
    std::string text;
    for (const StopCall& call : stopped.calls) {
        text += std::string(call.command->name) + ": " + call.answer.text + "\n";
    }
    return text + (stopped.off ? "the radio is off\n" : "the radio may be on\n");
}

std::string stopJson(const std::string& channel, const Stopped& stopped, const Report& report) {
    JsonArray calls;
    for (const StopCall& call : stopped.calls) {
        const bool text = call.command->result->type == ResultKind::Type::text;
        calls.add(JsonObject()
                          .addText("method", call.command->name)
                          .add("value", text ? jsonString(call.answer.text) : call.answer.text)
                          .str());
    }
    JsonObject object = jsonHead(kStop, JsonObject().addText("channel", channel), report);
    object.add("calls", calls.str());
    addCourse(stopped.outcome, !stopped.off, &object);
    return withEnding(object, report);
}

int stop(const CommandLine& line, const Surroundings& to) {
    if (line.words.size() > 2) return wrongUsage(to, "stop takes a channel at most", kStop);
    const std::string channel = line.words.size() == 2 ? line.words[1] : kAnyChannel;
    const ChipFamily* family = phoneFamily();
    const Stopped stopped = watched(kStop, to, [&](const Progress& progress) {
        return stopRadio(channel, family ? family->name : "", to.awaitFind,
                         line.timeout.value_or(kStopTimeout), progress);
    });
    const Report report = judgeStop(channel, stopped);
    return conclude(to, line.json ? stopJson(channel, stopped, report) : stopText(stopped), report);
}

/** Explains a subcommand, or the whole client. */
int help(const std::vector<std::string>& words, const Surroundings& to) {
    if (words.empty()) return print(to, helpText());
    if (const auto text = helpOnTopic(words[0])) return print(to, *text);
    const Command* command = findCommand(words[0]);
    if (command == nullptr) return wrongUsage(to, unknownCommand(words[0]));
    return print(to, helpText(*command) + familyHelp(phoneFamily(), *command));
}

int call(const CommandLine& line, const Surroundings& to) {
    Request request;
    std::string problem;
    if (!readRequest(line.words, &request, &problem)) {
        const Command* command = line.words.empty() ? nullptr : findCommand(line.words[0]);
        return wrongUsage(to, problem, command ? command->name : nullptr);
    }
    if (line.requireCount && !request.command->result->counts) {
        return wrongUsage(to, std::string(request.command->name) + " has no count to require",
                          request.command->name);
    }
    const std::vector<std::string> warnings = warningsOf(request);
    if (line.strict && !warnings.empty()) {
        return wrongUsage(to, warnings[0], request.command->name);
    }
    if (!line.json && !warnings.empty()) {
        fail(to, kSuccess, "warning: " + ::android::base::Join(warnings, "; "));
    }
    const Outcome outcome = callWatched(request, line, to);
    Report report = judge(request, outcome);
    if (report.exitCode == kSuccess && line.requireCount && !packetCount(outcome.answer.text)) {
        report = {kNoCount, std::string(request.command->name) +
                                    " answered no count: " + quote(outcome.answer.text)};
    }

    std::string text;
    if (line.json) {
        text = jsonReport(request, outcome, report);
    } else if (outcome.ending == Ending::answered) {
        text = outcome.answer.text + "\n";
    }
    return conclude(to, text, report);
}

} // namespace

int runClient(const std::vector<std::string>& arguments, const Surroundings& surroundings) {
    CommandLine line;
    std::string problem;
    if (!readCommandLine(arguments, &line, &problem)) return wrongUsage(surroundings, problem);
    if (line.version) return print(surroundings, versionText());
    const std::string first = line.words.empty() ? "" : line.words[0];
    if (first == kHelp) return help({line.words.begin() + 1, line.words.end()}, surroundings);
    if (line.help) return help(line.words, surroundings);
    if (first == kList) return list(line, surroundings);
    if (first == kDoctor) return doctor(line, surroundings);
    if (first == kStop) return stop(line, surroundings);
    return call(line, surroundings);
}

} // namespace vendor::korvan::bex::wifi::client
