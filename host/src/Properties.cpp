// Copyright 2026 The BEX Wi-Fi Authors
// SPDX-License-Identifier: Apache-2.0

#include <android-base/properties.h>
#include <android-base/strings.h>
#include <android/log.h>
#include <log/log.h>

#include <cctype>
#include <fstream>
#include <string>

#include "host/src/HostRoot.h"

namespace android::hardware::host {
namespace {

void seedProperties(const std::string& path) {
    std::ifstream file(path);
    for (std::string line; std::getline(file, line);) {
        line = base::Trim(line);
        const size_t equals = line.find('=');
        if (line.empty() || line[0] == '#' || equals == std::string::npos) continue;
        const std::string key = base::Trim(line.substr(0, equals));
        if (!base::SetProperty(key, base::Trim(line.substr(equals + 1)))) {
            ALOGE("%s: property '%s' cannot be set", path.c_str(), key.c_str());
        }
    }
}

void setLogLevel() {
    const std::string level = base::GetProperty("log.tag", "");
    if (level.empty()) return;
    switch (toupper(static_cast<unsigned char>(level[0]))) {
        case 'V':
            __android_log_set_minimum_priority(ANDROID_LOG_VERBOSE);
            break;
        case 'D':
            __android_log_set_minimum_priority(ANDROID_LOG_DEBUG);
            break;
        case 'I':
            __android_log_set_minimum_priority(ANDROID_LOG_INFO);
            break;
        case 'W':
            __android_log_set_minimum_priority(ANDROID_LOG_WARN);
            break;
        case 'E':
            __android_log_set_minimum_priority(ANDROID_LOG_ERROR);
            break;
        case 'S':
            __android_log_set_minimum_priority(ANDROID_LOG_SILENT);
            break;
        default:
            ALOGE("Property log.tag: '%s' is no level", level.c_str());
    }
}

} // namespace
} // namespace android::hardware::host

// On a phone, init sets the properties before any service runs. The build names this function to
// the linker, so that every program of the host layer carries it.
extern "C" __attribute__((constructor)) void bexSeedHostProperties() {
    using namespace android::hardware::host;
    seedProperties(hostRoot() + "/vendor/build.prop");
    setLogLevel();
}
