// Copyright 2026 The BEX Wi-Fi Authors
// SPDX-License-Identifier: Apache-2.0

#pragma once

#include <sys/stat.h>
#include <sys/un.h>
#include <utils/Errors.h>

#include <string>

namespace android::hardware::host {

/**
 * Which file a path led to at one moment: tells a server's socket from the one of another server
 * that took the name over.
 */
struct FileIdentity {
    dev_t device = 0;
    ino_t inode = 0;
    // A file made later may get the number of one that is gone.
    timespec changed = {};

    /** NAME_NOT_FOUND when there is nothing, else what else stat() says. */
    static status_t of(const std::string& path, FileIdentity* identity);

    bool operator==(const FileIdentity& other) const {
        return device == other.device && inode == other.inode &&
               changed.tv_sec == other.changed.tv_sec && changed.tv_nsec == other.changed.tv_nsec;
    }
};

/**
 * The socket of an instance, below socketFolder():
 * "vendor.korvan.bex.wifi@1.0::IWifiService~default". Whatever in the instance's name is neither a
 * letter, a digit, '.', '_' nor '-' stands as % and two hexadecimal digits.
 */
std::string socketPath(const std::string& descriptor, const std::string& instance);

/** BAD_VALUE when the path is longer than a socket's address may be (107 bytes). */
status_t socketAddress(const std::string& path, sockaddr_un* address);

} // namespace android::hardware::host
