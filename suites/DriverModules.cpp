// Copyright 2026 The BEX Wi-Fi Authors
// SPDX-License-Identifier: Apache-2.0

#include "suites/DriverModules.h"

#include <android/log.h>
#include <dirent.h>
#include <unistd.h>

#include "chips/ModuleFiles.h"

namespace vendor::korvan::bex::wifi::V1_0::implementation {

int findFwPath(const char* tag, std::string* fwPath) {
    for (const char* candidate : kModuleCandidates) {
        if (access(candidate, R_OK) == 0) {
            *fwPath = candidate;
            return 0;
        }
    }
    __android_log_print(ANDROID_LOG_ERROR, tag, "%s cannot find out FwPath", "getFwPath");
    return -1;
}

int listDriverPaths(const char* tag, std::vector<std::string>* driverPaths) {
    DIR* directory = opendir(kModuleFolder);
    if (directory == nullptr) return -1;
    while (const dirent* entry = readdir(directory)) {
        const std::string name = entry->d_name;
        if (name.rfind(kModulePrefix, 0) != 0) continue;
        __android_log_print(ANDROID_LOG_ERROR, tag, "getDriverPaths: %s", name.c_str());
        driverPaths->push_back(std::string(kModuleFolder) + "/" + name);
    }
    closedir(directory);
    return driverPaths->empty() ? -1 : 0;
}

} // namespace vendor::korvan::bex::wifi::V1_0::implementation
