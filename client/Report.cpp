// Copyright 2026 The BEX Wi-Fi Authors
// SPDX-License-Identifier: Apache-2.0

#include "client/Report.h"

#include <android-base/stringprintf.h>

#include <cstring>
#include <ctime>

#include "client/Help.h"
#include "client/base/Logcat.h"
#include "client/base/Version.h"

namespace vendor::korvan::bex::wifi::client {
namespace {

std::string inMilliseconds(std::chrono::nanoseconds duration) {
    const long long us = std::chrono::duration_cast<std::chrono::microseconds>(duration).count();
    return ::android::base::StringPrintf("%lld.%03lld", us / 1000, us % 1000);
}

/** In the form of RFC 3339, UTC. */
std::string timestamp(std::chrono::system_clock::time_point time) {
    using namespace std::chrono;
    const auto ms = duration_cast<milliseconds>(time.time_since_epoch()).count();
    const auto seconds = static_cast<time_t>(ms / 1000);
    struct tm utc = {};
    gmtime_r(&seconds, &utc);
    char text[sizeof("2026-01-01T00:00:00")];
    strftime(text, sizeof(text), "%Y-%m-%dT%H:%M:%S", &utc);
    return ::android::base::StringPrintf("%s.%03dZ", text, static_cast<int>(ms % 1000));
}

const char* stageName(Stage stage) {
    switch (stage) {
        case Stage::lookup:
            return "lookup";
        case Stage::call:
            return "call";
        case Stage::done:
            break;
    }
    return "done";
}

std::string channelOf(const Request& request) {
    for (size_t i = 0; i < request.values.size(); ++i) {
        if (strcmp(request.command->arguments[i]->name, "channel") == 0) {
            return request.values[i].text;
        }
    }
    return "";
}

/** What the host's transport says of a service that has no room for one more client. */
bool wasRefused(const Outcome& outcome) {
    return outcome.ending == Ending::transportFailed &&
           outcome.answer.transportError.find("'WOULD_BLOCK: '") != std::string::npos;
}

Report judgeAnswer(const Request& request, const Outcome& outcome) {
    if (outcome.ending != Ending::answered) return judgeUnanswered(request.command->name, outcome);
    if (!request.command->tellsFailure(outcome.answer)) return {};
    return {kFailed, std::string(request.command->name) + " answered " + outcome.answer.text +
                             ": " + request.command->result->advice + ": " + logcat()};
}

} // namespace

Report judgeUnanswered(const std::string& doing, const Outcome& outcome) {
    switch (outcome.ending) {
        case Ending::answered:
            break;
        case Ending::notFound:
            return {kNoService,
                    "vendor.korvan.bex.wifi@1.0::IWifiService/default is not registered: is "
                    "vendor.korvan.bex.wifi@1.0-service running, is it in the VINTF manifest, and "
                    "may this user find it?"};
        case Ending::transportFailed:
            if (wasRefused(outcome)) {
                return {kTransportFailed,
                        "vendor.korvan.bex.wifi@1.0-service has too many clients and took no call "
                        "from this one; see which processes hold its sockets: ss -xp"};
            }
            return {kTransportFailed,
                    doing + " failed in the transport, the service may have died: see its log; " +
                            jsonString(outcome.answer.transportError)};
        case Ending::late:
            if (outcome.stage == Stage::lookup) {
                return {kTooLate,
                        "vendor.korvan.bex.wifi@1.0-service has not answered in time: it may be "
                        "busy with other calls or not running; nothing was called"};
            }
            return {kTooLate, "the deadline passed in " + doing +
                                      ": the service's commands may still be running"};
        case Ending::interrupted:
            return {kSignalled + outcome.number,
                    doing + " was interrupted by " + strsignal(outcome.number)};
        case Ending::notStarted:
            return {kTransportFailed, std::string("no thread can be started: ") +
                                              strerror(outcome.number) + "; nothing was called"};
    }
    return {};
}

bool mayHaveStarted(const Request& request, const Outcome& outcome) {
    return *request.command->starts != '\0' && outcome.stage != Stage::lookup &&
           !wasRefused(outcome);
}

std::string stopCommandLine(const std::string& channel) {
    const bool number = !channel.empty() && channel.size() <= 3 &&
                        channel.find_first_not_of("0123456789") == std::string::npos;
    return "bex-wifi-client stop" + (number ? " " + channel : "");
}

Report judge(const Request& request, const Outcome& outcome) {
    Report report = judgeAnswer(request, outcome);
    if (report.exitCode != kSuccess && mayHaveStarted(request, outcome)) {
        report.error += std::string("; ") + request.command->starts +
                        " may be on, what ends it is: " + stopCommandLine(channelOf(request));
    }
    return report;
}

JsonObject jsonHead(const std::string& method, const JsonObject& arguments, const Report& report) {
    JsonObject object;
    object.add("schema_version", kSchemaVersion)
            .addText("method", method)
            .add("arguments", arguments.str())
            .add("ok", report.exitCode == kSuccess ? "true" : "false");
    return object;
}

void addCourse(const Outcome& outcome, std::optional<bool> mayBeOn, JsonObject* object) {
    object->add("radio_may_be_on", !mayBeOn   ? "null"
                                   : *mayBeOn ? "true"
                                              : "false")
            .addText("stage", stageName(outcome.stage))
            .addText("started_at", timestamp(outcome.started))
            .add("duration_ms", inMilliseconds(outcome.duration))
            .addText("client_version", kVersion);
}

std::string withEnding(JsonObject object, const Report& report) {
    object.add("exit_code", std::to_string(report.exitCode));
    if (!report.error.empty()) object.addText("error", report.error);
    return object.str() + "\n";
}

std::string jsonReport(const Request& request, const Outcome& outcome, const Report& report) {
    JsonObject arguments;
    JsonObject inHex;
    for (size_t i = 0; i < request.values.size(); ++i) {
        const ArgumentKind& kind = *request.command->arguments[i];
        const Value& value = request.values[i];
        if (kind.type == ArgumentKind::Type::boolean) {
            arguments.add(kind.name, value.flag ? "true" : "false");
        } else {
            bool exact = true;
            arguments.add(kind.name, jsonString(value.text, &exact));
            if (!exact) inHex.addText(kind.name, hexDigits(value.text));
        }
    }
    bool exact = true;
    std::string value = "null";
    if (outcome.ending == Ending::answered) {
        // Numbers and booleans are printed as JSON has them.
        const bool text = request.command->result->type == ResultKind::Type::text;
        value = text ? jsonString(outcome.answer.text, &exact) : outcome.answer.text;
    }
    JsonObject object = jsonHead(request.command->name, arguments, report);
    if (!inHex.empty()) object.add("arguments_hex", inHex.str());
    object.add("value", value);
    if (!exact) object.addText("value_hex", hexDigits(outcome.answer.text));
    if (request.command->result->counts) {
        object.add("count", packetCount(outcome.answer.text).value_or("null"));
    }
    const bool started = mayHaveStarted(request, outcome);
    const std::vector<std::string> warnings = warningsOf(request);
    if (!warnings.empty()) {
        JsonArray array;
        for (const std::string& warning : warnings) array.add(jsonString(warning));
        object.add("warnings", array.str());
    }
    addCourse(outcome, started ? std::optional<bool>(true) : std::nullopt, &object);
    return withEnding(object, report);
}

} // namespace vendor::korvan::bex::wifi::client
