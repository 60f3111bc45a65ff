// Copyright 2026 The BEX Wi-Fi Authors
// SPDX-License-Identifier: Apache-2.0

#include "host/src/Closing.h"

#include <sys/socket.h>

#include <deque>
#include <mutex>
#include <system_error>
#include <thread>
#include <utility>

namespace android::hardware::host {
namespace {

/** Its thread runs while there is something to close. */
class Closer {
  public:
    static Closer& get() {
        // Never destroyed: its thread may run until the process ends.
        static Closer& closer = *new Closer;
        return closer;
    }

    void add(base::unique_fd descriptor) {
        std::lock_guard<std::mutex> lock(mMutex);
        mWaiting.push_back(std::move(descriptor));
        if (mRunning) return;
        try {
            std::thread([this] { run(); }).detach();
            mRunning = true;
        } catch (const std::system_error&) {
            // No thread can be started: it stays open until the next one comes.
        }
    }

    size_t count() {
        std::lock_guard<std::mutex> lock(mMutex);
        return mWaiting.size();
    }

  private:
    void run() {
        std::unique_lock<std::mutex> lock(mMutex);
        while (!mWaiting.empty()) {
            base::unique_fd next = std::move(mWaiting.front());
            lock.unlock();
            next.reset();
            lock.lock();
            mWaiting.pop_front();
        }
        mRunning = false;
    }

    std::mutex mMutex;
    // The first one is the one that is being closed.
    std::deque<base::unique_fd> mWaiting;
    bool mRunning = false;
};

/** Whether a socket that is shut down has no message left. */
bool isDrained(int socket) {
    // An empty message and the end look alike, but only a message has its sender's credentials.
    const int on = 1;
    if (setsockopt(socket, SOL_SOCKET, SO_PASSCRED, &on, sizeof(on)) != 0) return false;
    alignas(cmsghdr) char control[CMSG_LEN(sizeof(ucred))];
    msghdr head = {};
    head.msg_control = control;
    head.msg_controllen = sizeof(control);
    return recvmsg(socket, &head, MSG_PEEK | MSG_DONTWAIT) == 0 && head.msg_controllen == 0;
}

} // namespace

void closeElsewhere(base::unique_fd descriptor) {
    Closer::get().add(std::move(descriptor));
}

void closeConnection(base::unique_fd socket) {
    shutdown(socket.get(), SHUT_RDWR);
    if (!isDrained(socket.get())) closeElsewhere(std::move(socket));
}

size_t closingElsewhere() {
    return Closer::get().count();
}

} // namespace android::hardware::host
