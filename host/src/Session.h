// Copyright 2026 The BEX Wi-Fi Authors
// SPDX-License-Identifier: Apache-2.0

#pragma once

#include <android-base/unique_fd.h>

#include <condition_variable>
#include <memory>
#include <mutex>
#include <string>
#include <vector>

#include "host/src/SocketFile.h"

namespace android::hardware::host {

/**
 * A client's connections to one server incarnation: the process and the registration that had the
 * name when the session was opened. A session never changes to another one.
 */
class Session {
  public:
    /** Null when nobody answers at the path. */
    static std::unique_ptr<Session> open(const std::string& path);

    /**
     * A connection for one call; waits for a free one when there can be no more. After the session
     * has ended, the status with which it ended.
     */
    status_t acquire(int* connection);
    void release(int connection);
    /**
     * Instead of release(), when the server had too many clients and has taken no call from the
     * connection.
     */
    void drop(int connection);

    /**
     * Ends the session: no thread can make a call any more.
     *
     * @param status DEAD_OBJECT when the server is gone, WOULD_BLOCK when it never accepted this
     *     client.
     */
    void end(status_t status);
    /** Whether the server had no room for this client. */
    bool isRefused();

    /** Hangs up when the session dies; open as long as the session exists. */
    int first() const { return mConnections.front().get(); }

  private:
    Session(const std::string& path, const FileIdentity& identity, base::unique_fd first);

    const std::string mPath;
    const FileIdentity mIdentity;

    std::mutex mMutex;
    std::condition_variable mChanged;
    std::vector<base::unique_fd> mConnections;
    std::vector<int> mIdle;
    bool mConnecting = false;
    bool mMayGrow = true;
    status_t mStatus = OK;
};

} // namespace android::hardware::host
