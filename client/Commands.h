// Copyright 2026 The BEX Wi-Fi Authors
// SPDX-License-Identifier: Apache-2.0

#pragma once

#include <optional>
#include <string>
#include <vector>

#include "client/base/Service.h"

// The table of the interface's methods: what each is called, takes, answers, and how it is called.
// It works on any IWifiService, a proxy as well as an object in the same process:
//
//     Request request;
//     std::string problem;
//     if (!readRequest({"RunTxStop", "6"}, &request, &problem)) return usageError(problem);
//     const Answer answer = request.command->call(service, request.values);
//     if (answer.delivered) std::cout << answer.text << '\n';

namespace vendor::korvan::bex::wifi::client {

/** What an argument means. Several methods share one kind; the name is the interface's. */
struct ArgumentKind {
    enum class Type { text, boolean };

    const char* name;
    Type type;
    const char* meaning;
    /** The unit of a measure; empty where there is none. */
    const char* unit;
    /** The forms that the service understands. The client checks booleans only. */
    const char* accepted;
    /** One of them. */
    const char* example;
    /** Whether some chip knows a value; null where only the chip's tool can tell. */
    bool (*isKnown)(const std::string& text) = nullptr;
};

/** What a method answers. */
struct ResultKind {
    enum class Type { int32, boolean, text };

    Type type;
    const char* meaning;
    /** The answer, as printed, that tells of a failure; empty where no answer does. */
    const char* failure;
    /** What to look for in the log after that answer. */
    const char* advice;
    /** Whether it may hold a count of packets. */
    bool counts = false;
};

/** One argument as the service gets it. */
struct Value {
    /** The bytes from the command line. */
    std::string text;
    /** The flag that a boolean argument's text stands for. */
    bool flag = false;
};

/** The result of a call. */
struct Answer {
    /** Whether the service answered; otherwise transportError tells why not. */
    bool delivered = false;
    /** The answer as printed: a decimal number, "true" or "false", or the text byte for byte. */
    std::string text;
    /** The platform's description of the failed transaction, for people. */
    std::string transportError;
};

/**
 * The count of packets in an answer, in decimal without leading zeros; nothing when it holds none.
 *
 * @param answer A number, which "Rx: " may precede.
 */
std::optional<std::string> packetCount(const std::string& answer);

/** One method of the interface. */
struct Command {
    const char* name;
    const char* summary;
    std::vector<const ArgumentKind*> arguments;
    const ResultKind* result;
    /** What still runs after the call, such as "the transmission"; empty where nothing does. */
    const char* starts;
    /** Calls the method; takes as many values as there are arguments. Blocks until it answers. */
    Answer (*call)(IWifiService& service, const std::vector<Value>& values);

    /** Whether the service's answer tells of a failure: "-1" or "failure", by the kind of result.
     */
    bool tellsFailure(const Answer& answer) const;
};

/** A method with the values to call it with. */
struct Request {
    const Command* command = nullptr;
    std::vector<Value> values;
};

/** One line for each value that no chip knows. The values still go to the service. */
std::vector<std::string> warningsOf(const Request& request);

/** The sixteen methods in the interface's order. */
const std::vector<Command>& commands();

/** The method of exactly this name, or null. */
const Command* findCommand(const std::string& name);

/** One line that says that there is no method of this name, and names the nearest one. */
std::string unknownCommand(const std::string& name);

/**
 * Reads a method's name and its arguments. Booleans are "true", "false", "1" or "0"; any text is
 * accepted unchanged for the other arguments, also an empty one and one that is not UTF-8, unless
 * it is too long for a command line.
 *
 * @param words The name, then the arguments in the interface's order.
 * @param problem On failure one line (without a newline) that tells what is wrong.
 * @return whether the request is complete; otherwise it is unspecified.
 */
bool readRequest(const std::vector<std::string>& words, Request* request, std::string* problem);

} // namespace vendor::korvan::bex::wifi::client
