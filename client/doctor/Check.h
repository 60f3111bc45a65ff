// Copyright 2026 The BEX Wi-Fi Authors
// SPDX-License-Identifier: Apache-2.0

#pragma once

#include <string>
#include <vector>

// What `bex-wifi-client doctor` finds out, and how it prints it.

namespace vendor::korvan::bex::wifi::client {

enum class Verdict {
    ok,
    problem,
    /** It cannot be seen from here. */
    unknown,
};

/** The result of one check. Each text is one line. */
struct Check {
    std::string name;
    Verdict verdict;
    /** What is there, or what is wrong. */
    std::string found;
    /** What to do about a problem, or where else to look; empty when the check is ok. */
    std::string remedy;
};

using Checks = std::vector<Check>;

Check ok(std::string name, std::string found);
Check problem(std::string name, std::string found, std::string remedy);
Check unknown(std::string name, std::string found, std::string remedy);

size_t countProblems(const Checks& checks);

/** For people: a line for each check, with its remedy on the next, and a line that counts. */
std::string checksText(const Checks& checks);

/** [{"name":..., "status":"ok", "problem" or "unknown", "found":..., "remedy":... or null}, ...] */
std::string checksJson(const Checks& checks);

} // namespace vendor::korvan::bex::wifi::client
