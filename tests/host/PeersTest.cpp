// Copyright 2026 The BEX Wi-Fi Authors
// SPDX-License-Identifier: Apache-2.0

// Peers that come in great number, fall silent, leave, or do not read.

#include <sys/mman.h>
#include <sys/socket.h>
#include <unistd.h>

#include <future>

#include "host/src/RemoteBinder.h"
#include "host/src/Session.h"
#include "host/src/SocketFile.h"
#include "tests/host/PeerTest.h"

namespace vendor::korvan::bex::wifi::tests {
namespace {

using ::android::OK;
using ::android::WOULD_BLOCK;
using ::android::base::unique_fd;
using ::android::hardware::hidl_string;
using ::android::hardware::IBinder;
using ::android::hardware::Parcel;
using ::android::hardware::Return;
using ::android::hardware::host::FrameHeader;
using ::android::hardware::host::RemoteBinder;
using ::android::hardware::host::Session;
using ::android::hardware::host::socketPath;

class PeersTest : public PeerTest {};

// More of them than threads: none holds one.
TEST_F(PeersTest, PeersThatNeverReadTheirReplies) {
    std::vector<unique_fd> peers;
    for (int i = 0; i < 8; ++i) {
        peers.push_back(connectToServer());
        for (int j = 0; j < 4; ++j) sendBytes(peers.back().get(), validFrame("large 900000"));
    }
    EXPECT_EQ(call(service, "alive"), "alive");
}

TEST_F(PeersTest, PeersThatSayNothing) {
    std::vector<unique_fd> peers;
    for (int i = 0; i < 64; ++i) peers.push_back(connectToServer());
    EXPECT_EQ(call(service, "alive"), "alive");
    EXPECT_EQ(call(IWifiService::tryGetService(), "alive"), "alive");
}

TEST_F(PeersTest, PeersThatLeaveAtOnceLeaveNothingBehind) {
    const size_t before = descriptorsOfIdleServer();
    for (int i = 0; i < 300; ++i) {
        unique_fd peer = connectToServer();
        if (i % 3 == 1) sendBytes(peer.get(), validFrame("unread"));
        if (i % 3 == 2) sendBytes(peer.get(), with(validFrame("x"), 4, FrameHeader::kOneway));
    }
    EXPECT_TRUE(comesDownTo(before));
}

TEST_F(PeersTest, SecondCallBeforeTheFirstAnswer) {
    unique_fd peer = connectToServer();
    sendBytes(peer.get(), validFrame("wait"));
    ASSERT_EQ(server->report(), "entered");
    sendBytes(peer.get(), validFrame("second"));
    // The other thread comes by, sees that the connection has an owner, and serves this.
    EXPECT_EQ(call(service, "alive"), "alive");
    server->openGate();
    for (int i = 0; i < 2; ++i) {
        EXPECT_EQ(answerTo(peer.get()).status, OK);
    }
}

// The call and the hang-up reach the server as one piece of news.
TEST_F(PeersTest, PeersThatLeaveBeforeTheirAnswer) {
    std::vector<unique_fd> peers;
    for (int i = 0; i < 8; ++i) {
        peers.push_back(connectToServer());
        sendBytes(peers.back().get(), validFrame("accepted"));
        EXPECT_EQ(answerTo(peers.back().get()).status, OK);
    }
    auto first = std::async(std::launch::async, [&] { return call(service, "wait"); });
    ASSERT_EQ(server->report(), "entered");
    auto second = std::async(std::launch::async, [&] { return call(service, "wait"); });
    ASSERT_EQ(server->report(), "entered");
    const size_t before = descriptorsOfServer();
    for (unique_fd& peer : peers) sendBytes(peer.get(), validFrame("unanswered"));
    peers.clear();
    server->openGate();
    server->openGate();
    EXPECT_EQ(first.get() + second.get(), "donedone");
    EXPECT_TRUE(comesDownTo(before - 8));
    EXPECT_EQ(descriptorsOfServer(), before - 8);
}

// Who gives up while the threads are busy finds nothing running later.
TEST_F(PeersTest, CallsOfPeersThatHaveLeftAreDropped) {
    unique_fd busy[] = {connectToServer(), connectToServer()};
    for (unique_fd& peer : busy) {
        sendBytes(peer.get(), validFrame("wait"));
        ASSERT_EQ(server->report(), "entered");
    }
    const FrameInTwo large("queued");
    unique_fd memory(memfd_create("payload", MFD_CLOEXEC));
    ASSERT_EQ(::write(memory.get(), large.payload.data(), large.payload.size()),
              static_cast<ssize_t>(large.payload.size()));
    for (int i = 0; i < 8; ++i) {
        unique_fd leaver = connectToServer();
        if (i % 2 == 0) {
            sendBytes(leaver.get(), validFrame("queued"));
        } else {
            sendBytes(leaver.get(), large.header);
            sendBytes(leaver.get(), Bytes(1), {memory.get()});
        }
    }
    // Comes after them, and only waits for its answer from now on.
    unique_fd stays = connectToServer();
    sendBytes(stays.get(), validFrame("queued"));
    ASSERT_EQ(shutdown(stays.get(), SHUT_WR), 0);

    server->openGate();
    server->openGate();
    for (unique_fd& peer : busy) EXPECT_EQ(answerTo(peer.get()).status, OK);
    EXPECT_EQ(answerTo(stays.get()).status, OK);
    EXPECT_EQ(call(service, "count"), "3");
}

// Too many at once: the server keeps descriptors for its own work, says so and goes on.
class FullServerTest : public PeerTest {
  protected:
    void SetUp() override {
        PeerTest::SetUp();
        std::vector<std::string> steps = {"descriptors", "64"};
        steps.insert(steps.end(), kUsualServer.begin(), kUsualServer.end());
        serve(steps);
        EXPECT_EQ(call(service, "first"), "first");
        for (int i = 0; i < 200; ++i) peers.push_back(connectToServer());
        EXPECT_EQ(answerTo(peers.back().get()).status, WOULD_BLOCK);
        EXPECT_TRUE(isTurnedAway(peers.back().get()));
    }

    std::vector<unique_fd> peers;
};

TEST_F(FullServerTest, GoesOn) {
    EXPECT_EQ(call(service, "alive"), "alive");
    EXPECT_LT(descriptorsOfServer(), 48u);
    peers.clear();
    EXPECT_TRUE(comesDownTo(16));
    EXPECT_EQ(call(IWifiService::tryGetService(), "anew"), "anew");
}

TEST_F(FullServerTest, TellsARefusedClient) {
    const std::string path = socketPath(IWifiService::descriptor, "default");
    for (const size_t size : {10, 100'000}) {
        sp<IBinder> binder = new RemoteBinder(Session::open(path));
        Parcel call;
        const hidl_string text = std::string(size, 'x');
        fillCall(&call, text);
        for (int i = 0; i < 3; ++i) {
            Parcel reply;
            EXPECT_EQ(binder->transact(16, call, &reply), WOULD_BLOCK) << size;
        }
    }
}

TEST_F(FullServerTest, IsFoundByAClientThatItRefuses) {
    const sp<IWifiService> found = IWifiService::tryGetService();
    ASSERT_NE(found, nullptr);
    const Return<int32_t> result = found->getWlanMode();
    EXPECT_FALSE(result.isOk());
    EXPECT_NE(result.description().find("WOULD_BLOCK"), std::string::npos) << result.description();
}

// Those that the proxy's other connection serves: nobody is told that the service is dead.
TEST_F(FullServerTest, ServesAClientThatWantsMoreConnections) {
    auto held = std::async(std::launch::async, [&] { return call(service, "wait"); });
    ASSERT_EQ(server->report(), "entered");
    auto other = std::async(std::launch::async, [&] { return call(service, "other"); });
    server->openGate();
    EXPECT_EQ(held.get(), "done");
    EXPECT_EQ(other.get(), "other");
}

} // namespace
} // namespace vendor::korvan::bex::wifi::tests
