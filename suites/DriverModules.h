// Copyright 2026 The BEX Wi-Fi Authors
// SPDX-License-Identifier: Apache-2.0

#pragma once

#include <string>
#include <vector>

namespace vendor::korvan::bex::wifi::V1_0::implementation {

// The search for the kernel module files of the WLAN driver (chips/ModuleFiles.h).

/**
 * Looks for the one module file of the driver in kModuleCandidates, and takes the first that can
 * be read.
 *
 * @param tag The log tag of the caller.
 * @param fwPath Set to the file's path; stays as it is when there is none.
 * @return 0, or -1, with an error line, when there is none.
 */
int findFwPath(const char* tag, std::string* fwPath);

/**
 * Adds every file in kModuleFolder whose name begins with kModulePrefix, with an error line for
 * each, in the order in which the directory lists them.
 *
 * @param tag The log tag of the caller.
 * @param driverPaths Gets the paths, behind those that it has.
 * @return 0 when it holds a path then; -1 when not, or when the directory cannot be opened.
 */
int listDriverPaths(const char* tag, std::vector<std::string>* driverPaths);

} // namespace vendor::korvan::bex::wifi::V1_0::implementation
