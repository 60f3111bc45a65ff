// Copyright 2026 The BEX Wi-Fi Authors
// SPDX-License-Identifier: Apache-2.0

#pragma once

#include <optional>
#include <string>

#include "client/Commands.h"

// The client's texts about itself, for people and, in JSON, for programs. All end in a newline.

namespace vendor::korvan::bex::wifi::client {

/** The version of all the client's JSON; a change that could break a reader raises it. */
constexpr char kSchemaVersion[] = "1";

/** The help on the whole client: how to call it, its subcommands and options, its exit codes. */
std::string helpText();

/**
 * The help on one method: its arguments' meaning, units and accepted texts, its result, an
 * example.
 */
std::string helpText(const Command& command);

/** The help on a subcommand that is no method: list, doctor, stop; nothing for other names. */
std::optional<std::string> helpOnTopic(const std::string& name);

/** The client's version, and the interface that it was built for. */
std::string versionText();

/** Each method's name and summary, in lines of at most 80 columns. */
std::string listText();

/**
 * All methods on one line: {"schema_version":1,"methods":[{"name":..., "summary":...,
 * "arguments":[{"name":..., "type":"string" or "bool", "meaning":..., "unit":... or null,
 * "accepted":...}], "result":{"type":"int32", "bool" or "string", "meaning":...}}]}.
 */
std::string listJson();

} // namespace vendor::korvan::bex::wifi::client
