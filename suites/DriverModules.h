// Copyright 2026 The BEX Wi-Fi Authors
// SPDX-License-Identifier: Apache-2.0

#pragma once

#include <iterator>
#include <string>
#include <vector>

#include "chips/ModuleFiles.h"

namespace vendor::korvan::bex::wifi::V1_0::implementation {

// How a suite finds its driver's module files, and the strings for that. Each suite's unit has its
// own strings.

/** The strings of a suite whose driver is one module file. */
struct FirmwarePathStrings {
    /** No operation reads it. */
    std::string MfgFirmwarePath = kMfgFirmwarePath;
    /** The places of the module file, in the order of the search. */
    std::string FwPathCandidates[std::size(kModuleCandidates)] = {
            kModuleCandidates[0], kModuleCandidates[1], kModuleCandidates[2],
            kModuleCandidates[3], kModuleCandidates[4],
    };
    /** The module file, once one has been found. All objects of the suite's class share it. */
    std::string FwPath;
};

/**
 * Sets FwPath to the first of the candidates that can be read. Without one it stays as it is, and
 * an error is logged.
 *
 * @param tag The log tag of the caller.
 * @return 0, or -1 when there is none.
 */
int findFwPath(const char* tag, FirmwarePathStrings& strings);

/** The strings of a suite whose driver is several module files. */
struct DriverPathStrings {
    /** The folder of the files, and how their names begin. */
    std::string driverDir = kModuleFolder;
    std::string driverPrefix = kModulePrefix;
};

/**
 * Adds the path of every file in the folder whose name begins with the prefix, in the order in
 * which the folder lists them, and logs each name as an error.
 *
 * @param tag The log tag of the caller.
 * @param driverPaths The paths are appended to it.
 * @return 0 when it then has a path; -1 when not, or when the folder cannot be opened.
 */
int listDriverPaths(const char* tag, const DriverPathStrings& strings,
                    std::vector<std::string>& driverPaths);

} // namespace vendor::korvan::bex::wifi::V1_0::implementation
