// Copyright 2026 The BEX Wi-Fi Authors
// SPDX-License-Identifier: Apache-2.0

#pragma once

#include <string>
#include <vector>

#include "chips/ChipFamily.h"

// What the service's command lines need of a phone, by chip family.

namespace vendor::korvan::bex::wifi::client {

/** How a family's suite finds the driver's module files (suites/DriverModules.h). */
enum class Modules { none, oneOfSeveral, allOfAFolder };

/** A file of the driver that the commands read or write, or that the driver loads. */
struct DriverFile {
    const char* path;
    /** The module whose presence brings the file; empty for a file that is always there. */
    const char* module;
    /** Whether that module is unloaded at times, so that the absence of both is no fault. */
    bool comesAndGoes;
};

struct FamilyNeeds {
    ChipFamily family;
    const char* name;
    Modules modules;
    /** Tools that the command lines call as /vendor/bin/NAME. */
    std::vector<const char*> byPath;
    /** Tools that the command lines call by their bare name, which the shell looks up. */
    std::vector<const char*> byName;
    std::vector<DriverFile> files;
};

/** The tags under which the service logs its command lines, at the priority DEBUG. */
extern const std::vector<std::string> kCommandTags;

const FamilyNeeds& needsOf(ChipFamily family);

} // namespace vendor::korvan::bex::wifi::client
