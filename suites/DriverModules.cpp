// Copyright 2026 The BEX Wi-Fi Authors
// SPDX-License-Identifier: Apache-2.0

#include "suites/DriverModules.h"

#include <android/log.h>
#include <dirent.h>
#include <unistd.h>

namespace vendor::korvan::bex::wifi::V1_0::implementation {

namespace {

constexpr const char* FwPathCandidates[] = {
        "/system/lib/modules/wlan.ko",
        "/vendor/lib/modules/wlan.ko",
        "/system/lib/modules/qca_cld3_wlan.ko",
        "/vendor/lib/modules/qca_cld3_wlan.ko",
        "/vendor/lib/modules/qca_cld3/qca_cld3_wlan.ko",
};

constexpr const char* driverDir = "/vendor/lib/modules";
constexpr const char* driverPrefix = "qca_cld3_";

} // namespace

int findFwPath(const char* tag, std::string* fwPath) {
    for (const char* candidate : FwPathCandidates) {
        if (access(candidate, R_OK) == 0) {
            *fwPath = candidate;
            return 0;
        }
    }
    __android_log_print(ANDROID_LOG_ERROR, tag, "%s cannot find out FwPath", "getFwPath");
    return -1;
}

int listDriverPaths(const char* tag, std::vector<std::string>* driverPaths) {
    DIR* directory = opendir(driverDir);
    if (directory == nullptr) return -1;
    while (const dirent* entry = readdir(directory)) {
        const std::string name = entry->d_name;
        if (name.rfind(driverPrefix, 0) != 0) continue;
        __android_log_print(ANDROID_LOG_ERROR, tag, "getDriverPaths: %s", name.c_str());
        driverPaths->push_back(std::string(driverDir) + "/" + name);
    }
    closedir(directory);
    return driverPaths->empty() ? -1 : 0;
}

} // namespace vendor::korvan::bex::wifi::V1_0::implementation
