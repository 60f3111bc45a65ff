// Copyright 2026 The BEX Wi-Fi Authors
// SPDX-License-Identifier: Apache-2.0

#pragma once

#include <string>

#include "client/Commands.h"

// What the client tells about itself, for people and, in JSON, for programs. All end in a newline.

namespace vendor::korvan::bex::wifi::client {

/** Of all the client's JSON; a change that could break a reader raises it. */
constexpr char kSchemaVersion[] = "1";

/** Of the whole client: how to call it, its subcommands and options, its exit codes. */
std::string helpText();

/** Of one method: each argument's meaning, unit and accepted text, and the result. */
std::string helpText(const Command& command);

/** A line for each method: its name and summary. */
std::string listText();

/**
 * All methods on one line: {"schema_version":1,"methods":[{"name":..., "summary":...,
 * "arguments":[{"name":..., "type":"string" or "bool", "meaning":..., "unit":... or null,
 * "accepted":...}], "result":{"type":"int32", "bool" or "string", "meaning":...}}]}.
 */
std::string listJson();

} // namespace vendor::korvan::bex::wifi::client
