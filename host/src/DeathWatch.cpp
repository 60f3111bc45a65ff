// Copyright 2026 The BEX Wi-Fi Authors
// SPDX-License-Identifier: Apache-2.0

#define LOG_TAG "hidl-host"

#include "host/src/DeathWatch.h"

#include <errno.h>
#include <log/log.h>
#include <sys/epoll.h>

#include <cstring>
#include <thread>
#include <utility>

namespace android::hardware::host {

DeathWatch& DeathWatch::get() {
    // Never destroyed: its thread runs until the process ends.
    static DeathWatch& watch = *new DeathWatch;
    return watch;
}

DeathWatch::DeathWatch() : mEpoll(epoll_create1(EPOLL_CLOEXEC)) {
    LOG_ALWAYS_FATAL_IF(!mEpoll.ok(), "epoll_create1: %s", strerror(errno));
    std::thread([this] { run(); }).detach();
}

uint64_t DeathWatch::watch(int socket, std::function<void()> onHangup) {
    std::lock_guard<std::mutex> lock(mMutex);
    const uint64_t id = mNextId++;
    mWatches.emplace(id, std::move(onHangup));
    epoll_event event = {};
    event.events = EPOLLRDHUP | EPOLLONESHOT;
    event.data.u64 = id;
    epoll_ctl(mEpoll.get(), EPOLL_CTL_ADD, socket, &event);
    return id;
}

void DeathWatch::unwatch(uint64_t id, int socket) {
    std::lock_guard<std::mutex> lock(mMutex);
    mWatches.erase(id);
    epoll_ctl(mEpoll.get(), EPOLL_CTL_DEL, socket, nullptr);
}

void DeathWatch::run() {
    for (;;) {
        epoll_event event;
        if (epoll_wait(mEpoll.get(), &event, 1, -1) != 1) continue;
        std::function<void()> onHangup;
        {
            std::lock_guard<std::mutex> lock(mMutex);
            auto found = mWatches.find(event.data.u64);
            if (found != mWatches.end()) onHangup = std::move(found->second);
        }
        if (onHangup) onHangup();
    }
}

} // namespace android::hardware::host
