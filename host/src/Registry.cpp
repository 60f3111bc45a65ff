// Copyright 2026 The BEX Wi-Fi Authors
// SPDX-License-Identifier: Apache-2.0

#define LOG_TAG "hidl-host"

#include "host/src/Registry.h"

#include <android-base/unique_fd.h>
#include <errno.h>
#include <log/log.h>
#include <stdio.h>
#include <sys/socket.h>
#include <unistd.h>

#include <atomic>
#include <cstring>
#include <memory>
#include <utility>

#include "host/src/Connection.h"
#include "host/src/Engine.h"
#include "host/src/HostRoot.h"

namespace android::hardware::host {
namespace {

/** A path beside the sockets that only this process uses. */
std::string temporaryPath() {
    static std::atomic<unsigned> count{0};
    return socketFolder() + "/." + std::to_string(getpid()) + "-" + std::to_string(count++);
}

/** Binds under a name of its own; skips a name that a killed process has left. */
status_t bindTemporarily(int socket, std::string* path) {
    for (int attempts = 0; attempts < 100; ++attempts) {
        *path = temporaryPath();
        sockaddr_un address;
        status_t result = socketAddress(*path, &address);
        if (result != OK) return result;
        if (bind(socket, reinterpret_cast<sockaddr*>(&address), sizeof(address)) == 0) return OK;
        if (errno != EADDRINUSE) return -errno;
    }
    return ALREADY_EXISTS;
}

/** Listens at the path: others see either what was there before or a socket that answers. */
status_t listenAt(const std::string& path, base::unique_fd* listener, FileIdentity* identity) {
    sockaddr_un address;
    status_t result = socketAddress(path, &address);
    if (result != OK) return result;
    // The system makes its parent folder: on a phone, init does.
    if (mkdir(socketFolder().c_str(), 0755) != 0 && errno != EEXIST) return -errno;

    base::unique_fd socket(::socket(AF_UNIX, SOCK_SEQPACKET | SOCK_CLOEXEC | SOCK_NONBLOCK, 0));
    if (!socket.ok()) return -errno;
    std::string temporary;
    result = bindTemporarily(socket.get(), &temporary);
    if (result != OK) return result;
    if (chmod(temporary.c_str(), 0600) != 0 || listen(socket.get(), SOMAXCONN) != 0) {
        result = -errno;
    }
    if (result == OK) result = FileIdentity::of(temporary, identity);
    if (result == OK && rename(temporary.c_str(), path.c_str()) != 0) result = -errno;
    if (result != OK) {
        unlink(temporary.c_str());
        return result;
    }
    *listener = std::move(socket);
    return OK;
}

} // namespace

Registry& Registry::get() {
    static Registry& registry = *new Registry;
    return registry;
}

status_t Registry::add(const std::string& path, const sp<hidl::base::V1_0::IBase>& object,
                       const sp<BHwBinder>& stub) {
    std::lock_guard<std::mutex> lock(mMutex);
    base::unique_fd socket;
    FileIdentity identity;
    status_t result = listenAt(path, &socket, &identity);
    if (result != OK) {
        ALOGE("Cannot register %s: %s", path.c_str(),
              result == BAD_VALUE ? "the path is too long for a socket" : strerror(-result));
        return result;
    }
    auto listener = std::make_shared<Listener>(std::move(socket), stub);
    Engine::get().add(listener);
    Entry& entry = mEntries[path];
    const uint64_t replaced = std::exchange(entry.listener, listener->id());
    entry.socket = identity;
    entry.object = object;
    if (replaced != 0) Engine::get().retire(replaced);
    return OK;
}

sp<hidl::base::V1_0::IBase> Registry::find(const FileIdentity& socket) {
    std::lock_guard<std::mutex> lock(mMutex);
    for (const auto& [path, entry] : mEntries) {
        // The rename has changed the time. The number is not reused while the socket listens.
        if (entry.socket.device == socket.device && entry.socket.inode == socket.inode) {
            return entry.object;
        }
    }
    return nullptr;
}

} // namespace android::hardware::host
