// Copyright 2026 The BEX Wi-Fi Authors
// SPDX-License-Identifier: Apache-2.0

#pragma once

#include <sys/stat.h>
#include <sys/un.h>
#include <utils/Errors.h>

#include <string>

namespace android::hardware::host {

/**
 * The file to which a path led at one moment. It distinguishes a server's socket from that of
 * another server that took over the name.
 */
struct FileIdentity {
    dev_t device = 0;
    ino_t inode = 0;
    // A file made later may get the number of one that is gone.
    timespec changed = {};

    /** NAME_NOT_FOUND when there is nothing, otherwise the error of stat(). */
    static status_t of(const std::string& path, FileIdentity* identity);

    bool operator==(const FileIdentity& other) const {
        return device == other.device && inode == other.inode &&
               changed.tv_sec == other.changed.tv_sec && changed.tv_nsec == other.changed.tv_nsec;
    }
};

/**
 * The socket of an instance, below socketFolder():
 * "vendor.korvan.bex.wifi@1.0::IWifiService~default". Every character of the instance's name that
 * is not a letter, a digit, '.', '_' or '-' is written as % and two hexadecimal digits.
 */
std::string socketPath(const std::string& descriptor, const std::string& instance);

/** BAD_VALUE when the path is longer than a socket's address may be (107 bytes). */
status_t socketAddress(const std::string& path, sockaddr_un* address);

} // namespace android::hardware::host
