// Copyright 2026 The BEX Wi-Fi Authors
// SPDX-License-Identifier: Apache-2.0

#pragma once

#include <sys/types.h>

#include <cstddef>
#include <functional>
#include <vector>

namespace vendor::korvan::bex::wifi::benchmarks {

/** Another process, killed when the object goes. */
class Child {
  public:
    Child() = default;
    explicit Child(pid_t pid) : mPid(pid) {}
    Child(Child&& other) noexcept;
    Child& operator=(Child&& other) noexcept;
    ~Child();

    pid_t pid() const { return mPid; }

  private:
    pid_t mPid = -1;
};

/** A copy of this process that does `work` and ends, with the benchmark at the latest. */
Child forked(const std::function<void()>& work);

/** Ends the program with a line on stderr unless `good`. */
void require(bool good, const char* what);

// The floor of a call: two processes that pass messages of a call's sizes back and forth, over the
// kind of socket that the host layer uses.

/** What isMimoSupport() and its answer are on the wire. */
constexpr size_t kRequestSize = 80;
constexpr size_t kReplySize = 40;

/** One round trip as the client. */
void pingPong(int socket);

/** A process that answers one client, and the client's end of the socket. */
struct Echo {
    Echo();
    int socket;
    Child server;
};

/** A process that answers many clients on two threads, as the service's are, and their ends. */
struct EchoForMany {
    explicit EchoForMany(size_t clients);
    ~EchoForMany();
    std::vector<int> sockets;
    Child server;
};

} // namespace vendor::korvan::bex::wifi::benchmarks
