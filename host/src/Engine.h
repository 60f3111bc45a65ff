// Copyright 2026 The BEX Wi-Fi Authors
// SPDX-License-Identifier: Apache-2.0

#pragma once

#include <android-base/unique_fd.h>

#include <atomic>
#include <cstddef>
#include <cstdint>
#include <memory>
#include <mutex>
#include <set>
#include <unordered_map>

namespace android::hardware::host {

/** A socket that the engine's threads serve. */
class Endpoint {
  public:
    explicit Endpoint(base::unique_fd socket) : mSocket(std::move(socket)) {}
    virtual ~Endpoint();
    Endpoint(const Endpoint&) = delete;
    Endpoint& operator=(const Endpoint&) = delete;

    /**
     * There is new input. May be called on any of the threads, also on two at once. Reads until
     * there is nothing left, or makes sure that it is called again.
     *
     * @param events What epoll reports about the socket, 0 when it was not asked.
     */
    virtual void onReady(uint32_t events) = 0;

    int socket() const { return mSocket.get(); }
    /** Its number in the engine, never used twice. */
    uint64_t id() const { return mId; }

  private:
    friend class Engine;
    base::unique_fd mSocket;
    uint64_t mId = 0;
};

/**
 * The process's server: a fixed number of threads that wait on one epoll instance. A thread that
 * runs a call does nothing else, so at most that many calls run at a time and the next one waits in
 * its socket.
 */
class Engine {
  public:
    static Engine& get();

    /** See configureRpcThreadpool(). */
    void configure(size_t threads, bool callerWillJoin);
    /** Starts the threads, except when the caller is to join. One thread when never configured. */
    void start();
    /** See joinRpcThreadpool(). */
    [[noreturn]] void join();

    void add(const std::shared_ptr<Endpoint>& endpoint);
    /** Ends the serving; the socket closes when the last thread that uses the endpoint is done. */
    void remove(uint64_t id);
    /** As remove(), but first handles the input that has already come. */
    void retire(uint64_t id);
    /** Makes the engine call onReady() again if there is still something to read. */
    void rearm(const Endpoint& endpoint);
    /** Makes the engine call onReady() again a little later, for what is impossible now. */
    void retry(uint64_t id);
    /** Whether one more connection would leave the process too few descriptors for its own work. */
    bool isFull();

  private:
    Engine();
    std::shared_ptr<Endpoint> find(uint64_t id);
    void spawn(size_t threads);
    [[noreturn]] void serve() noexcept;
    void retryAll();

    const base::unique_fd mEpoll;
    // It is in the epoll instance from the start, since later there may be no descriptor for it.
    const base::unique_fd mRetryTimer;
    const size_t mMaxEndpoints;

    std::mutex mMutex;
    bool mConfigured = false;
    bool mStarted = false;
    size_t mThreads = 1;
    bool mCallerWillJoin = false;
    uint64_t mNextId = 1;
    std::unordered_map<uint64_t, std::shared_ptr<Endpoint>> mEndpoints;
    std::set<uint64_t> mToRetry;
};

} // namespace android::hardware::host
