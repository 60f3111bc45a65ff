// Copyright 2026 The BEX Wi-Fi Authors
// SPDX-License-Identifier: Apache-2.0

#include "client/Terminal.h"

#include <android-base/parseint.h>
#include <sys/ioctl.h>
#include <termios.h>

#include <cstdlib>

namespace vendor::korvan::bex::wifi::client {

size_t terminalColumns(int fd) {
    struct winsize size = {};
    if (ioctl(fd, TIOCGWINSZ, &size) == 0 && size.ws_col != 0) return size.ws_col;
    const char* variable = getenv("COLUMNS");
    size_t columns = 0;
    if (variable != nullptr && ::android::base::ParseUint(variable, &columns) && columns != 0) {
        return columns;
    }
    return 80;
}

} // namespace vendor::korvan::bex::wifi::client
