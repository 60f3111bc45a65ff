// Copyright 2026 The BEX Wi-Fi Authors
// SPDX-License-Identifier: Apache-2.0

#include "client/Help.h"

#include <android-base/strings.h>

#include "client/base/Json.h"
#include "client/base/Text.h"
#include "client/base/Version.h"

namespace vendor::korvan::bex::wifi::client {
namespace {

constexpr char kUsage[] =
        R"(Calls the Wi-Fi radio test service,
vendor.korvan.bex.wifi@1.0::IWifiService/default.

Usage:
  bex-wifi-client [OPTION]... METHOD [ARGUMENT]...   call a method
  bex-wifi-client help METHOD                        explain a method
  bex-wifi-client list [--json]                      name the methods
  bex-wifi-client stop [--json] [CHANNEL]            end whatever the radio does
  bex-wifi-client doctor [--json]                    find out why nothing works
  bex-wifi-client --version

Options, before or after the method:
  --json             print one JSON object, on one line, whatever comes of the
                     call
  --timeout SECONDS  wait for the service to start, and give up after SECONDS
                     (such as 2.5) altogether; without it the service must run,
                     and may take its time. The doctor gives up after 5 seconds
                     without it, stop after 60
  --require-count    end with 7 when the answer holds no count of packets
  --strict           end with 2, before the call, when a value is none that a
                     chip knows; without it that is a warning
  --                 end of the options; needed before an argument that begins
                     with "-", unless it is a number
  --help, -h         explain

Exit codes:
  0  success
  1  the service answered -1 or "failure"; the doctor found a problem; stop did
     not prove that the radio is off
  2  wrong usage
  3  the service cannot be found
  4  the transport failed in the call
  5  the deadline of --timeout passed
  6  the result could not be written to stdout
  7  the answer holds no count, with --require-count
  130, 143  SIGINT (Ctrl-C) or SIGTERM ended the wait; nothing tells the service

Methods:
)";

struct Topic {
    const char* name;
    const char* text;
};

constexpr Topic kTopics[] = {
        {"list", R"(Usage: bex-wifi-client list [--json]
Names the methods and what each does. With --json also their arguments and
results.
)"},
        {"doctor", R"(Usage: bex-wifi-client doctor [--json] [--timeout SECONDS]
Looks for what keeps the service from working, on the phone where it runs, best
as root. It changes nothing and calls no method. Each problem comes with what to
do about it. Gives up on a silent service after 5 seconds, or after SECONDS.

Ends with 0 when it found no problem, else with 1.
)"},
        {"stop", R"(Usage: bex-wifi-client stop [--json] [--timeout SECONDS] [CHANNEL]
Ends transmission, tone, reception and monitor mode: calls RunTxStop,
RunTxStStop, RunRxStop and snifferStop, and prints each answer. It waits for a
call that is still under way and repeats its own afterwards. Reloads the driver
and leaves the interface down. Gives up after 60 seconds, or after SECONDS.

Ends with 0 only when the answers prove that the radio is off, with 1 when they
do not.
)"},
};

constexpr size_t kNameWidth = 16;

std::string padded(std::string text) {
    if (text.size() < kNameWidth) text.resize(kNameWidth, ' ');
    return text;
}

const char* typeName(ArgumentKind::Type type) {
    return type == ArgumentKind::Type::boolean ? "bool" : "string";
}

const char* typeName(ResultKind::Type type) {
    switch (type) {
        case ResultKind::Type::int32:
            return "int32";
        case ResultKind::Type::boolean:
            return "bool";
        case ResultKind::Type::text:
            break;
    }
    return "string";
}

std::string describe(const ArgumentKind& argument) {
    JsonObject object;
    object.addText("name", argument.name)
            .addText("type", typeName(argument.type))
            .addText("meaning", argument.meaning)
            .add("unit", *argument.unit == '\0' ? "null" : jsonString(argument.unit))
            .addText("accepted", argument.accepted);
    return object.str();
}

std::string describe(const Command& command) {
    JsonArray arguments;
    for (const ArgumentKind* argument : command.arguments) arguments.add(describe(*argument));
    JsonObject result;
    result.addText("type", typeName(command.result->type))
            .addText("meaning", command.result->meaning);
    JsonObject object;
    object.addText("name", command.name)
            .addText("summary", command.summary)
            .add("arguments", arguments.str())
            .add("result", result.str());
    return object.str();
}

} // namespace

std::string helpText() {
    std::string text = kUsage;
    for (const Command& command : commands()) {
        text += wrapped("  " + padded(command.name) + command.summary, 2 + kNameWidth);
    }
    return text;
}

std::string helpText(const Command& command) {
    const std::string call = std::string("bex-wifi-client ") + command.name;
    std::string usage = std::string("Usage: bex-wifi-client [OPTION]... ") + command.name;
    std::string example = "Example: " + call;
    std::string details;
    for (const ArgumentKind* argument : command.arguments) {
        usage.append(" ").append(argument->name);
        example.append(" ").append(argument->example);
        std::string meaning = "  " + padded(argument->name) + argument->meaning;
        if (*argument->unit != '\0') meaning.append("; unit: ").append(argument->unit);
        details += wrapped(meaning, 2 + kNameWidth) +
                   wrapped("  " + padded("") + argument->accepted, 2 + kNameWidth);
    }
    if (!details.empty()) {
        details = "\nArguments (text reaches the chip's tool as it stands, unchecked):\n" + details;
    }
    return wrapped(usage, 4) + wrapped(command.summary, 0) + details + "\n" +
           wrapped(std::string("Result (") + typeName(command.result->type) +
                           "): " + command.result->meaning,
                   2) +
           example + "\n";
}

std::optional<std::string> helpOnTopic(const std::string& name) {
    for (const Topic& topic : kTopics) {
        if (name == topic.name) return topic.text;
    }
    return std::nullopt;
}

std::string versionText() {
    return std::string("bex-wifi-client ") + kVersion + "\n" + kInterface + "\n" + kInterfaceHash +
           "\n";
}

std::string listText() {
    std::string lines;
    for (const Command& command : commands()) {
        lines += wrapped(padded(command.name) + command.summary, kNameWidth);
    }
    return lines;
}

std::string listJson() {
    JsonArray methods;
    for (const Command& command : commands()) methods.add(describe(command));
    JsonObject object;
    object.add("schema_version", kSchemaVersion).add("methods", methods.str());
    return object.str() + "\n";
}

} // namespace vendor::korvan::bex::wifi::client
