// Copyright 2026 The BEX Wi-Fi Authors
// SPDX-License-Identifier: Apache-2.0

#define LOG_TAG "hidl-host"

#include "host/src/RegularFile.h"

#include <android-base/file.h>
#include <android-base/unique_fd.h>
#include <errno.h>
#include <fcntl.h>
#include <log/log.h>
#include <sys/stat.h>

#include <cstring>

namespace android::hardware::host {

std::optional<std::string> readRegularFile(const std::string& path) {
    // Without O_NONBLOCK, opening a FIFO waits for a writer.
    const base::unique_fd file(open(path.c_str(), O_RDONLY | O_CLOEXEC | O_NOCTTY | O_NONBLOCK));
    if (!file.ok() && (errno == ENOENT || errno == ENOTDIR)) return std::nullopt;
    struct stat status = {};
    if (file.ok() && fstat(file.get(), &status) == 0 && !S_ISREG(status.st_mode)) {
        ALOGE("%s is not a regular file and is ignored", path.c_str());
        return std::nullopt;
    }
    std::string content;
    if (!file.ok() || !base::ReadFdToString(file.get(), &content)) {
        ALOGE("%s is ignored: %s", path.c_str(), strerror(errno));
        return std::nullopt;
    }
    return content;
}

} // namespace android::hardware::host
