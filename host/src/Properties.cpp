// Copyright 2026 The BEX Wi-Fi Authors
// SPDX-License-Identifier: Apache-2.0

#define LOG_TAG "hidl-host"

#include <android-base/properties.h>
#include <android-base/strings.h>
#include <log/log.h>

#include <optional>
#include <sstream>
#include <string>

#include "host/src/BeforeMain.h"
#include "host/src/HostRoot.h"
#include "host/src/RegularFile.h"

namespace android::hardware::host {

void seedProperties() {
    const std::string path = hostRoot() + "/vendor/build.prop";
    const std::optional<std::string> content = readRegularFile(path);
    if (!content) return;
    std::istringstream lines(*content);
    for (std::string line; std::getline(lines, line);) {
        line = base::Trim(line);
        const size_t equals = line.find('=');
        if (line.empty() || line[0] == '#' || equals == std::string::npos) continue;
        const std::string key = base::Trim(line.substr(0, equals));
        if (!base::SetProperty(key, base::Trim(line.substr(equals + 1)))) {
            ALOGE("%s: property '%s' cannot be set", path.c_str(), key.c_str());
        }
    }
}

} // namespace android::hardware::host
