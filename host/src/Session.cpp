// Copyright 2026 The BEX Wi-Fi Authors
// SPDX-License-Identifier: Apache-2.0

#define LOG_TAG "hidl-host"

#include "host/src/Session.h"

#include <errno.h>
#include <log/log.h>
#include <sys/socket.h>

#include <algorithm>
#include <cstring>
#include <utility>

#include "host/src/Connection.h"

namespace android::hardware::host {
namespace {

// Any more calls of one client wait here instead of at the server, which runs fewer at a time.
constexpr size_t kMaxConnections = 16;

/** Connects to the server at the path; also returns which socket that is. */
base::unique_fd connectTo(const std::string& path, FileIdentity* identity) {
    sockaddr_un address;
    if (socketAddress(path, &address) != OK) return {};
    for (;;) {
        if (FileIdentity::of(path, identity) != OK) return {};
        base::unique_fd connection(::socket(AF_UNIX, SOCK_SEQPACKET | SOCK_CLOEXEC, 0));
        if (!connection.ok()) return {};
        const int failed = TEMP_FAILURE_RETRY(
                connect(connection.get(), reinterpret_cast<sockaddr*>(&address), sizeof(address)));
        const int error = errno;
        // If the socket was replaced meanwhile, the result is about the wrong one.
        FileIdentity after;
        if (FileIdentity::of(path, &after) != OK || !(after == *identity)) continue;
        if (failed != 0) {
            if (error != ECONNREFUSED) ALOGE("%s: %s", path.c_str(), strerror(error));
            return {};
        }
        if (isTrustedPeer(connection.get())) return connection;
        ALOGE("%s belongs to another user", path.c_str());
        return {};
    }
}

} // namespace

std::unique_ptr<Session> Session::open(const std::string& path) {
    FileIdentity identity;
    base::unique_fd first = connectTo(path, &identity);
    if (!first.ok()) return nullptr;
    return std::unique_ptr<Session>(new Session(path, identity, std::move(first)));
}

Session::Session(const std::string& path, const FileIdentity& identity, base::unique_fd first)
      : mPath(path), mIdentity(identity) {
    // first() is read without the lock while others connect.
    mConnections.reserve(kMaxConnections);
    mIdle.push_back(first.get());
    mConnections.push_back(std::move(first));
}

status_t Session::acquire(int* connection) {
    std::unique_lock<std::mutex> lock(mMutex);
    for (;;) {
        if (mStatus != OK) return mStatus;
        if (!mIdle.empty()) {
            *connection = mIdle.back();
            mIdle.pop_back();
            return OK;
        }
        if (!mMayGrow || mConnecting || mConnections.size() == kMaxConnections) {
            mChanged.wait(lock);
            continue;
        }
        mConnecting = true;
        lock.unlock();
        FileIdentity identity;
        base::unique_fd added = connectTo(mPath, &identity);
        lock.lock();
        mConnecting = false;
        mChanged.notify_all();
        // Another incarnation has the name now, so no new connection can reach this one.
        mMayGrow = mMayGrow && added.ok() && identity == mIdentity;
        if (!mMayGrow) continue;
        *connection = added.get();
        mConnections.push_back(std::move(added));
        return OK;
    }
}

void Session::release(int connection) {
    std::lock_guard<std::mutex> lock(mMutex);
    mIdle.push_back(connection);
    mChanged.notify_one();
}

void Session::drop(int connection) {
    if (connection == first()) return end(WOULD_BLOCK);
    std::lock_guard<std::mutex> lock(mMutex);
    mMayGrow = false;
    mConnections.erase(std::find(mConnections.begin(), mConnections.end(), connection));
}

void Session::end(status_t status) {
    std::lock_guard<std::mutex> lock(mMutex);
    if (mStatus == OK) mStatus = status;
    shutdown(first(), SHUT_RDWR);
    mChanged.notify_all();
}

bool Session::isRefused() {
    std::lock_guard<std::mutex> lock(mMutex);
    return mStatus == WOULD_BLOCK;
}

} // namespace android::hardware::host
