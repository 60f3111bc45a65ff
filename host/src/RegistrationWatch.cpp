// Copyright 2026 The BEX Wi-Fi Authors
// SPDX-License-Identifier: Apache-2.0

#include "host/src/RegistrationWatch.h"

#include <poll.h>
#include <sys/inotify.h>
#include <unistd.h>

#include <algorithm>
#include <mutex>
#include <string>
#include <utility>

#include "host/src/HostRoot.h"

namespace android::hardware::host {

namespace {

// The kernel takes tens of milliseconds to close an inotify instance, so the process keeps the last
// one that it used.
std::mutex gMutex;
base::unique_fd& spare() {
    static auto& spare = *new base::unique_fd;
    return spare;
}

} // namespace

RegistrationWatch::RegistrationWatch() {
    {
        std::lock_guard<std::mutex> lock(gMutex);
        mNotices = std::move(spare());
    }
    if (!mNotices.ok()) mNotices.reset(inotify_init1(IN_CLOEXEC | IN_NONBLOCK));
    // Before the very first registration there is no folder, so its creation counts as well.
    for (const std::string& folder : {hostRoot() + "/dev/socket", socketFolder()}) {
        inotify_add_watch(mNotices.get(), folder.c_str(), IN_CREATE | IN_MOVED_TO);
    }
    // Events of an earlier use, or of what the caller is about to see anyway.
    alignas(inotify_event) char old[4096];
    while (read(mNotices.get(), old, sizeof(old)) > 0) {
    }
}

RegistrationWatch::~RegistrationWatch() {
    std::lock_guard<std::mutex> lock(gMutex);
    if (!spare().ok()) spare() = std::move(mNotices);
}

bool RegistrationWatch::wait(std::chrono::milliseconds timeout) {
    pollfd notice = {mNotices.get(), POLLIN, 0};
    return poll(&notice, 1, static_cast<int>(std::max<int64_t>(timeout.count(), 0))) > 0;
}

} // namespace android::hardware::host
