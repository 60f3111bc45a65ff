// Copyright 2026 The BEX Wi-Fi Authors
// SPDX-License-Identifier: Apache-2.0

#include "host/src/SocketFile.h"

#include <android-base/stringprintf.h>
#include <ctype.h>
#include <errno.h>
#include <sys/socket.h>

#include <cstring>

#include "host/src/HostRoot.h"

namespace android::hardware::host {

status_t FileIdentity::of(const std::string& path, FileIdentity* identity) {
    struct stat file;
    if (stat(path.c_str(), &file) != 0) return -errno;
    *identity = {file.st_dev, file.st_ino, file.st_ctim};
    return OK;
}

std::string socketPath(const std::string& descriptor, const std::string& instance) {
    std::string name = descriptor + "~";
    for (const char c : instance) {
        const auto byte = static_cast<unsigned char>(c);
        if (byte < 0x80 && (isalnum(byte) || strchr("._-", byte) != nullptr) && byte != 0) {
            name += c;
        } else {
            name += base::StringPrintf("%%%02X", byte);
        }
    }
    return socketFolder() + "/" + name;
}

status_t socketAddress(const std::string& path, sockaddr_un* address) {
    if (path.size() >= sizeof(address->sun_path)) return BAD_VALUE;
    *address = {};
    address->sun_family = AF_UNIX;
    memcpy(address->sun_path, path.c_str(), path.size() + 1);
    return OK;
}

} // namespace android::hardware::host
