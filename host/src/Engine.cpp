// Copyright 2026 The BEX Wi-Fi Authors
// SPDX-License-Identifier: Apache-2.0

#define LOG_TAG "hidl-host"

#include "host/src/Engine.h"

#include <errno.h>
#include <log/log.h>
#include <sys/epoll.h>
#include <sys/resource.h>
#include <sys/timerfd.h>

#include <cstring>
#include <thread>
#include <utility>

#include "host/src/Closing.h"

namespace android::hardware::host {
namespace {

// Edge-triggered: a connection needs no call to re-arm it, and wakes one thread instead of all.
constexpr uint32_t kEvents = EPOLLIN | EPOLLRDHUP | EPOLLET;
constexpr itimerspec kRetryDelay = {.it_interval = {}, .it_value = {0, 100'000'000}};
// The timer's number in epoll; the endpoints' numbers begin above it.
constexpr uint64_t kRetryTimer = 0;

size_t halfOfDescriptorLimit() {
    rlimit limit = {};
    getrlimit(RLIMIT_NOFILE, &limit);
    return static_cast<size_t>(limit.rlim_cur / 2);
}

} // namespace

Endpoint::~Endpoint() {
    closeConnection(std::move(mSocket));
}

Engine& Engine::get() {
    // Never destroyed: its threads run until the process ends.
    static Engine& engine = *new Engine;
    return engine;
}

Engine::Engine()
      : mEpoll(epoll_create1(EPOLL_CLOEXEC)),
        mRetryTimer(timerfd_create(CLOCK_MONOTONIC, TFD_CLOEXEC)),
        mMaxEndpoints(halfOfDescriptorLimit()) {
    epoll_event event = {};
    event.events = kEvents;
    event.data.u64 = kRetryTimer;
    const bool made = mRetryTimer.ok() && mEpoll.ok() &&
                      epoll_ctl(mEpoll.get(), EPOLL_CTL_ADD, mRetryTimer.get(), &event) == 0;
    LOG_ALWAYS_FATAL_IF(!made, "Cannot make the server: %s", strerror(errno));
}

void Engine::configure(size_t threads, bool callerWillJoin) {
    LOG_ALWAYS_FATAL_IF(threads == 0, "A thread pool needs at least one thread");
    std::lock_guard<std::mutex> lock(mMutex);
    LOG_ALWAYS_FATAL_IF(mStarted, "configureRpcThreadpool() comes before registration");
    mConfigured = true;
    mThreads = threads;
    mCallerWillJoin = callerWillJoin;
}

void Engine::start() {
    std::lock_guard<std::mutex> lock(mMutex);
    if (mStarted || mCallerWillJoin) return;
    mStarted = true;
    spawn(mThreads);
}

void Engine::join() {
    {
        std::lock_guard<std::mutex> lock(mMutex);
        LOG_ALWAYS_FATAL_IF(!mConfigured, "joinRpcThreadpool() without configureRpcThreadpool()");
        if (!mStarted) spawn(mCallerWillJoin ? mThreads - 1 : mThreads);
        mStarted = true;
    }
    serve();
}

void Engine::spawn(size_t threads) {
    for (size_t i = 0; i < threads; ++i) std::thread([this] { serve(); }).detach();
}

void Engine::add(const std::shared_ptr<Endpoint>& endpoint) {
    {
        std::lock_guard<std::mutex> lock(mMutex);
        endpoint->mId = mNextId++;
        mEndpoints.emplace(endpoint->mId, endpoint);
    }
    epoll_event event = {};
    event.events = kEvents;
    event.data.u64 = endpoint->mId;
    if (epoll_ctl(mEpoll.get(), EPOLL_CTL_ADD, endpoint->socket(), &event) != 0) {
        ALOGE("epoll_ctl: %s", strerror(errno));
        remove(endpoint->mId);
    }
}

void Engine::remove(uint64_t id) {
    std::shared_ptr<Endpoint> endpoint;
    {
        std::lock_guard<std::mutex> lock(mMutex);
        auto found = mEndpoints.find(id);
        if (found == mEndpoints.end()) return;
        endpoint = std::move(found->second);
        mEndpoints.erase(found);
    }
    epoll_ctl(mEpoll.get(), EPOLL_CTL_DEL, endpoint->socket(), nullptr);
}

void Engine::retire(uint64_t id) {
    if (std::shared_ptr<Endpoint> endpoint = find(id)) endpoint->onReady(0);
    remove(id);
}

std::shared_ptr<Endpoint> Engine::find(uint64_t id) {
    std::lock_guard<std::mutex> lock(mMutex);
    auto found = mEndpoints.find(id);
    return found == mEndpoints.end() ? nullptr : found->second;
}

void Engine::rearm(const Endpoint& endpoint) {
    epoll_event event = {};
    event.events = kEvents;
    event.data.u64 = endpoint.mId;
    epoll_ctl(mEpoll.get(), EPOLL_CTL_MOD, endpoint.socket(), &event);
}

void Engine::retry(uint64_t id) {
    std::lock_guard<std::mutex> lock(mMutex);
    if (mToRetry.empty()) timerfd_settime(mRetryTimer.get(), 0, &kRetryDelay, nullptr);
    mToRetry.insert(id);
}

void Engine::retryAll() {
    std::set<uint64_t> ids;
    {
        std::lock_guard<std::mutex> lock(mMutex);
        ids.swap(mToRetry);
    }
    for (const uint64_t id : ids) {
        if (std::shared_ptr<Endpoint> endpoint = find(id)) endpoint->onReady(0);
    }
}

bool Engine::isFull() {
    std::lock_guard<std::mutex> lock(mMutex);
    return mEndpoints.size() + closingElsewhere() >= mMaxEndpoints;
}

// An exception that leaves an interface's method ends here, and the process with it.
void Engine::serve() noexcept {
    for (;;) {
        epoll_event event;
        if (epoll_wait(mEpoll.get(), &event, 1, -1) != 1) continue;
        if (event.data.u64 == kRetryTimer) {
            retryAll();
        } else if (std::shared_ptr<Endpoint> endpoint = find(event.data.u64)) {
            endpoint->onReady(event.events);
        }
    }
}

} // namespace android::hardware::host
