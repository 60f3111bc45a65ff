// Copyright 2026 The BEX Wi-Fi Authors
// SPDX-License-Identifier: Apache-2.0

#include "client/doctor/Check.h"

#include <algorithm>

#include "client/base/Json.h"

namespace vendor::korvan::bex::wifi::client {
namespace {

const char* statusName(Verdict verdict) {
    switch (verdict) {
        case Verdict::ok:
            return "ok";
        case Verdict::problem:
            return "problem";
        case Verdict::unknown:
            break;
    }
    return "unknown";
}

size_t count(const Checks& checks, Verdict verdict) {
    return std::count_if(checks.begin(), checks.end(),
                         [verdict](const Check& check) { return check.verdict == verdict; });
}

} // namespace

Check ok(std::string name, std::string found) {
    return {std::move(name), Verdict::ok, std::move(found), ""};
}

Check problem(std::string name, std::string found, std::string remedy) {
    return {std::move(name), Verdict::problem, std::move(found), std::move(remedy)};
}

Check unknown(std::string name, std::string found, std::string remedy) {
    return {std::move(name), Verdict::unknown, std::move(found), std::move(remedy)};
}

size_t countProblems(const Checks& checks) {
    return count(checks, Verdict::problem);
}

std::string checksText(const Checks& checks) {
    std::string text;
    for (const Check& check : checks) {
        std::string status = statusName(check.verdict);
        status.resize(9, ' ');
        text += status + check.name + ": " + check.found + "\n";
        if (!check.remedy.empty()) text += "      -> " + check.remedy + "\n";
    }
    return text + std::to_string(checks.size()) +
           " checks: " + std::to_string(count(checks, Verdict::ok)) + " ok, " +
           std::to_string(countProblems(checks)) + " problem, " +
           std::to_string(count(checks, Verdict::unknown)) + " unknown\n";
}

std::string checksJson(const Checks& checks) {
    JsonArray array;
    for (const Check& check : checks) {
        JsonObject object;
        object.addText("name", check.name)
                .addText("status", statusName(check.verdict))
                .addText("found", check.found)
                .add("remedy", check.remedy.empty() ? "null" : jsonString(check.remedy));
        array.add(object.str());
    }
    return array.str();
}

} // namespace vendor::korvan::bex::wifi::client
