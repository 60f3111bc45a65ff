// Copyright 2026 The BEX Wi-Fi Authors
// SPDX-License-Identifier: Apache-2.0

#include "host/src/RegistrationWatch.h"

#include <poll.h>
#include <sys/inotify.h>

#include <algorithm>
#include <string>

#include "host/src/HostRoot.h"

namespace android::hardware::host {

RegistrationWatch::RegistrationWatch() : mNotices(inotify_init1(IN_CLOEXEC)) {
    // Until the first registration of all there is no folder: its making is news as well.
    for (const std::string& folder : {hostRoot() + "/dev/socket", socketFolder()}) {
        inotify_add_watch(mNotices.get(), folder.c_str(), IN_CREATE | IN_MOVED_TO);
    }
}

bool RegistrationWatch::wait(std::chrono::milliseconds timeout) {
    pollfd notice = {mNotices.get(), POLLIN, 0};
    return poll(&notice, 1, static_cast<int>(std::max<int64_t>(timeout.count(), 0))) > 0;
}

} // namespace android::hardware::host
