// Copyright 2026 The BEX Wi-Fi Authors
// SPDX-License-Identifier: Apache-2.0

#include "suites/DriverModules.h"

#include <android/log.h>
#include <dirent.h>
#include <unistd.h>

namespace vendor::korvan::bex::wifi::V1_0::implementation {

int findFwPath(const char* tag, FirmwarePathStrings& strings) {
    for (const std::string& candidate : strings.FwPathCandidates) {
        if (access(candidate.c_str(), R_OK) == 0) {
            strings.FwPath = candidate;
            return 0;
        }
    }
    __android_log_print(ANDROID_LOG_ERROR, tag, "%s cannot find out FwPath", "getFwPath");
    return -1;
}

int listDriverPaths(const char* tag, const DriverPathStrings& strings,
                    std::vector<std::string>& driverPaths) {
    DIR* directory = opendir(strings.driverDir.c_str());
    if (directory == nullptr) return -1;
    while (const dirent* entry = readdir(directory)) {
        const std::string name = entry->d_name;
        if (name.rfind(strings.driverPrefix, 0) != 0) continue;
        __android_log_print(ANDROID_LOG_ERROR, tag, "getDriverPaths: %s", name.c_str());
        driverPaths.push_back(strings.driverDir + "/" + name);
    }
    closedir(directory);
    return driverPaths.empty() ? -1 : 0;
}

} // namespace vendor::korvan::bex::wifi::V1_0::implementation
