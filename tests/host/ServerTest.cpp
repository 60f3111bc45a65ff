// Copyright 2026 The BEX Wi-Fi Authors
// SPDX-License-Identifier: Apache-2.0

// What a misbehaving, busy or idle server does, and what its client sees.

#include <hidl/HidlTransportSupport.h>
#include <hwbinder/Parcel.h>
#include <poll.h>
#include <signal.h>
#include <sys/resource.h>

#include <chrono>
#include <cstdio>
#include <future>
#include <thread>

#include "host/src/Channel.h"
#include "host/src/Session.h"
#include "host/src/SocketFile.h"
#include "tests/host/HostTest.h"

namespace vendor::korvan::bex::wifi::tests {
namespace {

using ::android::OK;
using ::android::hardware::host::FrameHeader;
using ::android::hardware::host::Session;

const std::string kDead = transportFailure("DEAD_OBJECT");

class ServerTest : public ServedTest {};

/** A call from a client of its own: it has certainly come when this returns. */
std::unique_ptr<Session> startCall(const char* script) {
    auto session =
            Session::open(android::hardware::host::socketPath(IWifiService::descriptor, "default"));
    EXPECT_NE(session, nullptr);
    android::hardware::Parcel data;
    const android::hardware::hidl_string text = script;
    fillCall(&data, text);
    FrameHeader header;
    header.code = 16;
    EXPECT_EQ(sendFrame(session->first(), header, &data, 0), OK);
    return session;
}

void expectAnswer(const Session& session) {
    FrameHeader header;
    android::hardware::Parcel reply;
    EXPECT_EQ(android::hardware::host::FrameReader(session.first()).receive(0, &header, &reply),
              android::hardware::host::Receipt::kFrame);
    EXPECT_EQ(header.status, OK);
}

struct Misbehaviour {
    const char* script;
    const char* firstAnswer; // null for a dead server
};

// Names the test.
void PrintTo(const Misbehaviour& misbehaviour, std::ostream* out) {
    *out << misbehaviour.script;
}

class MisbehaviourTest : public ServedTest, public ::testing::WithParamInterface<Misbehaviour> {};

TEST_P(MisbehaviourTest, AbortsTheServer) {
    const char* answer = GetParam().firstAnswer;
    EXPECT_EQ(call(service, GetParam().script), answer != nullptr ? answer : kDead);
    EXPECT_EQ(server->end(), SIGABRT);
    EXPECT_EQ(call(service, "later"), kDead);
}

INSTANTIATE_TEST_SUITE_P(Host, MisbehaviourTest,
                         ::testing::Values(Misbehaviour{"never", nullptr},
                                           Misbehaviour{"throw", nullptr},
                                           Misbehaviour{"status", nullptr},
                                           Misbehaviour{"twice", "first"},
                                           Misbehaviour{"throw-late", "first"},
                                           Misbehaviour{"status-late", "first"}));

TEST_F(ServerTest, ReplyGoesOutWithTheCallback) {
    EXPECT_EQ(call(service, "late"), "early");
    EXPECT_EQ(server->report(), "answered");
    // The method still runs, and the same connection is served by the other thread.
    EXPECT_EQ(call(service, "meanwhile"), "meanwhile");
    server->openGate();
    EXPECT_EQ(server->report(), "leaving");
}

TEST_F(ServerTest, ThirdCallWaitsForAThread) {
    auto first = std::async(std::launch::async, [&] { return call(service, "wait"); });
    ASSERT_EQ(server->report(), "entered");
    auto second = std::async(std::launch::async, [&] { return call(service, "wait"); });
    ASSERT_EQ(server->report(), "entered");

    auto third = startCall("wait");

    server->openGate();
    EXPECT_EQ(server->report(), "leaving");
    EXPECT_EQ(server->report(), "entered");
    server->openGate();
    server->openGate();
    EXPECT_EQ(server->report(), "leaving");
    EXPECT_EQ(server->report(), "leaving");
    EXPECT_EQ(first.get(), "done");
    EXPECT_EQ(second.get(), "done");
    expectAnswer(*third);
}

TEST_F(ServerTest, ASearchWaitsForAThread) {
    auto first = std::async(std::launch::async, [&] { return call(service, "wait"); });
    auto second = std::async(std::launch::async, [&] { return call(service, "wait"); });
    ASSERT_EQ(server->report(), "entered");
    ASSERT_EQ(server->report(), "entered");

    auto search = std::async(std::launch::async, [] { return IWifiService::tryGetService(); });
    EXPECT_EQ(search.wait_for(std::chrono::milliseconds(200)), std::future_status::timeout);
    server->openGate();
    EXPECT_NE(search.get(), nullptr);
    server->openGate();
    EXPECT_EQ(first.get(), "done");
    EXPECT_EQ(second.get(), "done");
}

// Calls that all wait at once, from more clients than threads.
TEST_F(ServerTest, ManyClientsAreAllServed) {
    std::vector<std::thread> clients;
    std::atomic<int> failures{0};
    for (int client = 0; client < 64; ++client) {
        clients.emplace_back([&failures, client] {
            sp<IWifiService> own = IWifiService::tryGetService();
            for (int i = 0; i < 50; ++i) {
                const std::string text = std::to_string(client) + "." + std::to_string(i);
                if (own == nullptr || call(own, text) != text) ++failures;
            }
        });
    }
    for (std::thread& client : clients) client.join();
    EXPECT_EQ(failures, 0);
}

// A client for whom there was no descriptor need not wait until the others are silent.
TEST_F(HostTest, ARefusedClientIsServedBesideABusyOne) {
    ServerProcess server({"pool", "1", "register", "default", "ready", "join"});
    ASSERT_EQ(server.report(), "0");
    ASSERT_EQ(server.report(), "ready");
    sp<IWifiService> busy = IWifiService::tryGetService();
    ASSERT_NE(busy, nullptr);
    EXPECT_EQ(call(busy, "warm"), "warm");

    rlimit usual = {};
    ASSERT_EQ(prlimit(server.pid(), RLIMIT_NOFILE, nullptr, &usual), 0);
    const rlimit none = {0, usual.rlim_max};
    ASSERT_EQ(prlimit(server.pid(), RLIMIT_NOFILE, &none, nullptr), 0);
    auto refused = startCall("here");
    EXPECT_EQ(call(busy, "after it"), "after it");
    ASSERT_EQ(prlimit(server.pid(), RLIMIT_NOFILE, &usual, nullptr), 0);

    pollfd answer = {refused->first(), POLLIN, 0};
    const auto patience = std::chrono::steady_clock::now() + std::chrono::seconds(60);
    while (poll(&answer, 1, 0) == 0 && std::chrono::steady_clock::now() < patience) {
        EXPECT_EQ(call(busy, "again"), "again");
    }
    ASSERT_NE(answer.revents, 0);
    expectAnswer(*refused);
}

TEST_F(ServerTest, ThreadsShareOneProxy) {
    std::vector<std::thread> threads;
    std::atomic<int> failures{0};
    for (int thread = 0; thread < 32; ++thread) {
        threads.emplace_back([&, thread] {
            for (int i = 0; i < 100; ++i) {
                const std::string text = std::to_string(thread) + "." + std::to_string(i);
                if (call(service, text) != text) ++failures;
            }
        });
    }
    for (std::thread& thread : threads) thread.join();
    EXPECT_EQ(failures, 0);
}

TEST_F(ServerTest, IdleServerIsSmall) {
#if defined(__SANITIZE_ADDRESS__) || defined(__SANITIZE_THREAD__)
    GTEST_SKIP() << "A sanitizer brings memory and threads of its own";
#endif
    if (kEmulated) GTEST_SKIP() << "The emulator brings memory and a thread of its own";
    EXPECT_EQ(call(service, "warm"), "warm");
    int threads = 0;
    for (const std::string& line : server->proc("status")) {
        sscanf(line.c_str(), "Threads: %d", &threads);
    }
    EXPECT_EQ(threads, 2);
    int anonymousKb = -1;
    for (const std::string& line : server->proc("smaps_rollup")) {
        sscanf(line.c_str(), "Anonymous: %d kB", &anonymousKb);
    }
    EXPECT_GE(anonymousKb, 0);
    EXPECT_LT(anonymousKb, 5 * 1024);
}

TEST_F(ServerTest, TermEndsIt) {
    server->signal(SIGTERM);
    EXPECT_EQ(server->end(), SIGTERM);
}

TEST_F(HostTest, JoinWithoutConfigureAborts) {
    ServerProcess server({"register", "default", "join"});
    EXPECT_EQ(server.report(), "0");
    EXPECT_EQ(server.end(), SIGABRT);
}

TEST_F(HostTest, PoolOfNoThreadsAborts) {
    ServerProcess server({"pool", "0"});
    EXPECT_EQ(server.end(), SIGABRT);
}

// What a client that never asked for a pool gets when it registers something.
TEST_F(HostTest, UnconfiguredProcessServesWithOneThread) {
    ServerProcess server({"register", "default", "call", "inside"});
    EXPECT_EQ(server.report(), "0");
    EXPECT_EQ(server.report(), "inside");
}

// Nothing of the transport leaks into the shells that the service starts.
TEST_F(ServerTest, EveryDescriptorClosesOnExec) {
    EXPECT_EQ(call(service, "warm"), "warm");
    FILE* list = popen(("cd /proc/" + std::to_string(server->pid()) +
                        "/fdinfo && for fd in *; do test $fd -gt 4 && grep ^flags $fd; done")
                               .c_str(),
                       "r");
    ASSERT_NE(list, nullptr);
    unsigned flags;
    int seen = 0;
    while (fscanf(list, " flags: %o", &flags) == 1) {
        EXPECT_NE(flags & O_CLOEXEC, 0u) << flags;
        ++seen;
    }
    pclose(list);
    EXPECT_GE(seen, 4); // the listener, the connection, the epoll instance, its timer
}

} // namespace
} // namespace vendor::korvan::bex::wifi::tests
