// Copyright 2026 The BEX Wi-Fi Authors
// SPDX-License-Identifier: Apache-2.0

#include "benchmarks/PingPong.h"

#include <errno.h>
#include <signal.h>
#include <stdio.h>
#include <stdlib.h>
#include <sys/epoll.h>
#include <sys/prctl.h>
#include <sys/socket.h>
#include <sys/wait.h>
#include <unistd.h>

#include <thread>
#include <utility>

namespace vendor::korvan::bex::wifi::benchmarks {

namespace {

/** One round trip as the server; false when the client sent nothing. */
bool pongPing(int socket, int flags) {
    char message[kRequestSize];
    if (recv(socket, message, sizeof(message), flags) != kRequestSize) return false;
    return send(socket, message, kReplySize, flags | MSG_NOSIGNAL) == kReplySize;
}

void serveMany(const std::vector<int>& sockets) {
    const int epoll = epoll_create1(EPOLL_CLOEXEC);
    for (int socket : sockets) {
        epoll_event event = {};
        // Edge-triggered: a message wakes one thread, and the socket needs no call to re-arm it.
        event.events = EPOLLIN | EPOLLET;
        event.data.fd = socket;
        require(epoll_ctl(epoll, EPOLL_CTL_ADD, socket, &event) == 0, "epoll_ctl");
    }
    auto serve = [epoll] {
        for (;;) {
            epoll_event event;
            if (epoll_wait(epoll, &event, 1, -1) == 1) pongPing(event.data.fd, MSG_DONTWAIT);
        }
    };
    std::thread(serve).detach();
    serve();
}

} // namespace

void require(bool good, const char* what) {
    static const pid_t program = getpid();
    if (good) return;
    fprintf(stderr, "benchmark: %s failed (errno %d)\n", what, errno);
    // What the program has started and made is the program's to end, not a forked child's.
    if (getpid() != program) _exit(1);
    exit(1);
}

Child::Child(Child&& other) noexcept : mPid(std::exchange(other.mPid, -1)) {}

Child& Child::operator=(Child&& other) noexcept {
    std::swap(mPid, other.mPid);
    return *this;
}

Child::~Child() {
    if (mPid < 0) return;
    kill(mPid, SIGKILL);
    waitpid(mPid, nullptr, 0);
}

Child forked(const std::function<void()>& work) {
    const pid_t pid = fork();
    require(pid >= 0, "fork");
    if (pid == 0) {
        prctl(PR_SET_PDEATHSIG, SIGKILL);
        work();
        _exit(0);
    }
    return Child(pid);
}

void pingPong(int socket) {
    char message[kRequestSize] = {};
    require(send(socket, message, kRequestSize, 0) == kRequestSize, "send");
    require(recv(socket, message, sizeof(message), 0) == kReplySize, "recv");
}

Echo::Echo() {
    int ends[2];
    require(socketpair(AF_UNIX, SOCK_SEQPACKET | SOCK_CLOEXEC, 0, ends) == 0, "socketpair");
    server = forked([server = ends[1]] {
        while (pongPing(server, 0)) {
        }
    });
    close(ends[1]);
    socket = ends[0];
}

EchoForMany::EchoForMany(size_t clients) {
    std::vector<int> serverEnds;
    for (size_t i = 0; i < clients; ++i) {
        int ends[2];
        require(socketpair(AF_UNIX, SOCK_SEQPACKET | SOCK_CLOEXEC, 0, ends) == 0, "socketpair");
        sockets.push_back(ends[0]);
        serverEnds.push_back(ends[1]);
    }
    server = forked([&] { serveMany(serverEnds); });
    for (int end : serverEnds) close(end);
}

EchoForMany::~EchoForMany() {
    for (int socket : sockets) close(socket);
}

} // namespace vendor::korvan::bex::wifi::benchmarks
