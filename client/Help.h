// Copyright 2026 The BEX Wi-Fi Authors
// SPDX-License-Identifier: Apache-2.0

#pragma once

#include <optional>
#include <string>

#include "client/Commands.h"

// What the client tells about itself, for people and, in JSON, for programs. All end in a newline.

namespace vendor::korvan::bex::wifi::client {

/** Of all the client's JSON; a change that could break a reader raises it. */
constexpr char kSchemaVersion[] = "1";

/** Of the whole client: how to call it, its subcommands and options, its exit codes. */
std::string helpText();

/** Of one method: each argument's meaning, unit and accepted text, the result, and an example. */
std::string helpText(const Command& command);

/** Of a subcommand that calls no single method: list, doctor, stop; nothing for other names. */
std::optional<std::string> helpOnTopic(const std::string& name);

/** The client's version, and the interface that it was built for. */
std::string versionText();

/** A line for each method: its name and summary. */
std::string listText();

/**
 * All methods on one line: {"schema_version":1,"methods":[{"name":..., "summary":...,
 * "arguments":[{"name":..., "type":"string" or "bool", "meaning":..., "unit":... or null,
 * "accepted":...}], "result":{"type":"int32", "bool" or "string", "meaning":...}}]}.
 */
std::string listJson();

} // namespace vendor::korvan::bex::wifi::client
