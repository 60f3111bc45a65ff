// Copyright 2026 The BEX Wi-Fi Authors
// SPDX-License-Identifier: Apache-2.0

#include "client/Client.h"

#include <android-base/stringprintf.h>

#include <cerrno>
#include <cstring>

#include "client/Arguments.h"
#include "client/FamilyHelp.h"
#include "client/Help.h"
#include "client/base/Json.h"
#include "client/doctor/PhoneChecks.h"

namespace vendor::korvan::bex::wifi::client {
namespace {

constexpr char kList[] = "list";
constexpr char kDoctor[] = "doctor";
constexpr std::chrono::seconds kDoctorTimeout(5);

/** A finished call as the user sees it. */
struct Report {
    int exitCode;
    /** Why it is not kSuccess; empty when it is. */
    std::string error;
};

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

Report judge(const Request& request, const Outcome& outcome) {
    const std::string method = request.command->name;
    switch (outcome.ending) {
        case Ending::answered:
            break;
        case Ending::notFound:
            return {kNoService,
                    "vendor.korvan.bex.wifi@1.0::IWifiService/default is not registered: is "
                    "vendor.korvan.bex.wifi@1.0-service running, is it in the VINTF manifest, and "
                    "may this user find it?"};
        case Ending::transportFailed:
            return {kTransportFailed,
                    method + " failed in the transport, the service may have died: see its log; " +
                            jsonString(outcome.answer.transportError)};
        case Ending::late:
            if (outcome.stage == Stage::lookup) {
                return {kTooLate,
                        "vendor.korvan.bex.wifi@1.0-service has not answered in time: it may be "
                        "busy with other calls or not running"};
            }
            return {kTooLate, "the deadline passed in " + method +
                                      ": the service's commands may still be running"};
        case Ending::interrupted:
            return {kSignalled + outcome.number,
                    method + " was interrupted by " + strsignal(outcome.number)};
        case Ending::notStarted:
            return {kTransportFailed, std::string("no thread can be started: ") +
                                              strerror(outcome.number) + "; nothing was called"};
    }
    if (request.command->tellsFailure(outcome.answer)) {
        return {kFailed, method + " answered " + outcome.answer.text + ": " +
                                 request.command->result->advice};
    }
    return {kSuccess, ""};
}

std::string milliseconds(std::chrono::nanoseconds duration) {
    const long long us = std::chrono::duration_cast<std::chrono::microseconds>(duration).count();
    return ::android::base::StringPrintf("%lld.%03lld", us / 1000, us % 1000);
}

/** The object with the members that end every report. */
std::string withEnding(JsonObject object, const Report& report) {
    object.add("exit_code", std::to_string(report.exitCode));
    if (!report.error.empty()) object.addText("error", report.error);
    return object.str() + "\n";
}

/** Prints the text, then why it is not kSuccess. */
int conclude(const Surroundings& to, const std::string& text, const Report& report) {
    const int written = print(to, text);
    if (written != kSuccess) return written;
    return report.error.empty() ? kSuccess : fail(to, report.exitCode, report.error);
}

std::string jsonReport(const Request& request, const Outcome& outcome, const Report& report) {
    JsonObject arguments;
    for (size_t i = 0; i < request.values.size(); ++i) {
        const ArgumentKind& kind = *request.command->arguments[i];
        const Value& value = request.values[i];
        if (kind.type == ArgumentKind::Type::boolean) {
            arguments.add(kind.name, value.flag ? "true" : "false");
        } else {
            arguments.addText(kind.name, value.text);
        }
    }
    bool exact = true;
    std::string value = "null";
    if (outcome.ending == Ending::answered) {
        // Numbers and booleans are printed as JSON has them.
        const bool text = request.command->result->type == ResultKind::Type::text;
        value = text ? jsonString(outcome.answer.text, &exact) : outcome.answer.text;
    }
    JsonObject object;
    object.add("schema_version", kSchemaVersion)
            .addText("method", request.command->name)
            .add("arguments", arguments.str())
            .add("ok", report.exitCode == kSuccess ? "true" : "false")
            .add("value", value);
    if (!exact) object.addText("value_hex", hexDigits(outcome.answer.text));
    object.add("duration_ms", milliseconds(outcome.duration));
    return withEnding(object, report);
}

Outcome callWatched(const Request& request, const CommandLine& line, const Surroundings& to) {
    std::string shown;
    Progress progress{to.second, nullptr};
    if (to.terminal) {
        progress.tick = [&](long seconds) {
            shown = std::string(request.command->name) + ": " + std::to_string(seconds) + " s";
            to.err << '\r' << shown << std::flush;
        };
    }
    Outcome outcome =
            callService(request, line.timeout ? to.awaitFind : to.tryFind, line.timeout, progress);
    if (!shown.empty()) to.err << '\r' << std::string(shown.size(), ' ') << '\r' << std::flush;
    return outcome;
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

int help(const CommandLine& line, const Surroundings& to) {
    const bool method = !line.words.empty() && line.words[0] != kList && line.words[0] != kDoctor;
    if (!method) return print(to, helpText());
    const Command* command = findCommand(line.words[0]);
    if (command == nullptr) return wrongUsage(to, unknownCommand(line.words[0]));
    return print(to, helpText(*command) + familyHelp(phoneFamily(), *command));
}

int call(const CommandLine& line, const Surroundings& to) {
    Request request;
    std::string problem;
    if (!readRequest(line.words, &request, &problem)) {
        const Command* command = line.words.empty() ? nullptr : findCommand(line.words[0]);
        return wrongUsage(to, problem, command ? command->name : nullptr);
    }
    const Outcome outcome = callWatched(request, line, to);
    const Report report = judge(request, outcome);

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
    if (line.help) return help(line, surroundings);
    if (!line.words.empty() && line.words[0] == kList) return list(line, surroundings);
    if (!line.words.empty() && line.words[0] == kDoctor) return doctor(line, surroundings);
    return call(line, surroundings);
}

} // namespace vendor::korvan::bex::wifi::client
