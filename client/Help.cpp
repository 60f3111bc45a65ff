// Copyright 2026 The BEX Wi-Fi Authors
// SPDX-License-Identifier: Apache-2.0

#include "client/Help.h"

#include "client/base/Json.h"

namespace vendor::korvan::bex::wifi::client {
namespace {

constexpr char kUsage[] =
        R"(Calls the Wi-Fi radio test service, vendor.korvan.bex.wifi@1.0::IWifiService/default.

Usage:
  bex-wifi-client [OPTION]... METHOD [ARGUMENT]...   call a method and print what it answers
  bex-wifi-client METHOD --help                      explain a method and its arguments
  bex-wifi-client list [--json]                      name the methods
  bex-wifi-client stop [--json] [CHANNEL]            end whatever the radio does
  bex-wifi-client doctor [--json]                    find out what keeps the service from working

Options, before or after the method:
  --json             print one JSON object, on one line, whatever comes of the call
  --timeout SECONDS  wait for the service to start, and give up after SECONDS (such as 2.5)
                     altogether; without it the service must run, and may take its time. The
                     doctor gives up after 5 seconds without it, stop after 60
  --require-count    end with 7 when the answer holds no count of packets
  --                 end of the options; needed before an argument that begins with "-", unless
                     it is a number
  --help             explain

Exit codes:
  0  success
  1  the service answered -1 or "failure"; the doctor found a problem; stop did not prove
     that the radio is off
  2  wrong usage
  3  the service cannot be found
  4  the transport failed in the call
  5  the deadline of --timeout passed
  6  the result could not be written to stdout
  7  the answer holds no count, with --require-count
  130, 143  SIGINT (Ctrl-C) or SIGTERM ended the wait; nothing tells the service

Methods:
)";

constexpr size_t kNameWidth = 16;

std::string padded(std::string text) {
    if (text.size() < kNameWidth) text.resize(kNameWidth, ' ');
    return text;
}

std::string methodLines(const std::string& indent) {
    std::string lines;
    for (const Command& command : commands()) {
        lines += indent + padded(command.name) + command.summary + "\n";
    }
    return lines;
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
    return kUsage + methodLines("  ");
}

std::string helpText(const Command& command) {
    std::string usage = std::string("Usage: bex-wifi-client [OPTION]... ") + command.name;
    std::string details;
    for (const ArgumentKind* argument : command.arguments) {
        usage.append(" ").append(argument->name);
        details.append("  ").append(padded(argument->name)).append(argument->meaning);
        if (*argument->unit != '\0') details.append("; unit: ").append(argument->unit);
        details.append("\n  ").append(padded("")).append(argument->accepted).append("\n");
    }
    if (!details.empty()) {
        details = "\nArguments (text reaches the chip's tool as it stands, unchecked):\n" + details;
    }
    return usage + "\n" + command.summary + "\n" + details + "\nResult (" +
           typeName(command.result->type) + "): " + command.result->meaning + "\n";
}

std::string listText() {
    return methodLines("");
}

std::string listJson() {
    JsonArray methods;
    for (const Command& command : commands()) methods.add(describe(command));
    JsonObject object;
    object.add("schema_version", kSchemaVersion).add("methods", methods.str());
    return object.str() + "\n";
}

} // namespace vendor::korvan::bex::wifi::client
