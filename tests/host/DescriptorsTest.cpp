// Copyright 2026 The BEX Wi-Fi Authors
// SPDX-License-Identifier: Apache-2.0

// Peers that send descriptors: the one that a payload needs, and any others.

#include <arpa/inet.h>
#include <fcntl.h>
#include <sys/mman.h>
#include <sys/socket.h>
#include <unistd.h>

#include "tests/Message.h"
#include "tests/host/PeerTest.h"

namespace vendor::korvan::bex::wifi::tests {
namespace {

using ::android::OK;
using ::android::base::unique_fd;

class DescriptorsTest : public PeerTest {};

unique_fd memoryWith(const Bytes& bytes) {
    unique_fd memory(memfd_create("payload", MFD_CLOEXEC));
    EXPECT_EQ(::write(memory.get(), bytes.data(), bytes.size()),
              static_cast<ssize_t>(bytes.size()));
    return memory;
}

/**
 * A socket that cannot be closed before its other end has read what was sent to it, or is closed
 * itself.
 */
class LingeringSocket {
  public:
    LingeringSocket() {
        sockaddr_in address = {};
        address.sin_family = AF_INET;
        address.sin_addr.s_addr = htonl(INADDR_LOOPBACK);
        socklen_t size = sizeof(address);
        auto* named = reinterpret_cast<sockaddr*>(&address);
        unique_fd listener(socket(AF_INET, SOCK_STREAM | SOCK_CLOEXEC, 0));
        EXPECT_EQ(bind(listener.get(), named, size), 0);
        EXPECT_EQ(getsockname(listener.get(), named, &size), 0);
        EXPECT_EQ(listen(listener.get(), 1), 0);
        mSocket.reset(socket(AF_INET, SOCK_STREAM | SOCK_CLOEXEC, 0));
        EXPECT_EQ(connect(mSocket.get(), named, size), 0);
        mOtherEnd.reset(accept4(listener.get(), nullptr, nullptr, SOCK_CLOEXEC));
        EXPECT_TRUE(mOtherEnd.ok());
        const Bytes unsent(65'536);
        while (send(mSocket.get(), unsent.data(), unsent.size(), MSG_DONTWAIT) > 0) {
        }
        const linger anHour = {1, 3'600};
        EXPECT_EQ(setsockopt(mSocket.get(), SOL_SOCKET, SO_LINGER, &anHour, sizeof(anHour)), 0);
    }

    /** Sends it with others beside a message: whoever receives it is the one who closes it. */
    void giveTo(int peer, const Bytes& message, std::vector<int> others = {}) {
        others.push_back(mSocket.get());
        EXPECT_EQ(sendMessage(peer, message, others, 0), static_cast<ssize_t>(message.size()));
        mSocket.reset();
    }

  private:
    unique_fd mSocket;
    unique_fd mOtherEnd;
};

TEST_F(DescriptorsTest, ThatAreNotMemory) {
    int ends[2];
    ASSERT_EQ(pipe2(ends, O_CLOEXEC), 0);
    unique_fd readEnd(ends[0]);
    unique_fd writeEnd(ends[1]);
    unique_fd disk(open("/proc/self/exe", O_RDONLY | O_CLOEXEC));
    unique_fd tooShort(memfd_create("short", MFD_CLOEXEC));
    const FrameInTwo frame("text");
    const size_t before = descriptorsOfIdleServer();
    for (const int descriptor : {readEnd.get(), disk.get(), tooShort.get()}) {
        unique_fd peer = connectToServer();
        sendBytes(peer.get(), frame.header);
        sendBytes(peer.get(), Bytes(1), {descriptor});
        EXPECT_TRUE(isTurnedAway(peer.get()));
    }
    // No descriptor where one is announced,
    unique_fd without = connectToServer();
    sendBytes(without.get(), frame.header);
    sendBytes(without.get(), Bytes(1));
    EXPECT_TRUE(isTurnedAway(without.get()));
    // and one that is not announced, of which an emulator's recvmsg() does not tell: no MSG_CTRUNC.
    unique_fd unannounced = connectToServer();
    if (!kEmulated) {
        sendBytes(unannounced.get(), validFrame("text"), {disk.get()});
        EXPECT_TRUE(isTurnedAway(unannounced.get()));
    }
    unannounced.reset();
    EXPECT_EQ(call(service, "alive"), "alive");
    EXPECT_TRUE(comesDownTo(before));
}

// Good bytes, and a file or two too many.
TEST_F(DescriptorsTest, MoreThanOne) {
    if (kEmulated) {
        GTEST_SKIP()
                << "The emulator's recvmsg() asks for twice the room that the program gave, keeps "
                   "the descriptors that came too many, and does not say MSG_CTRUNC";
    }
    const FrameInTwo frame("text");
    const unique_fd memory = memoryWith(frame.payload);
    const size_t before = descriptorsOfIdleServer();
    for (const size_t count : {2, 3}) {
        unique_fd peer = connectToServer();
        sendBytes(peer.get(), frame.header);
        sendBytes(peer.get(), Bytes(1), std::vector<int>(count, memory.get()));
        EXPECT_TRUE(isTurnedAway(peer.get()));
    }
    EXPECT_EQ(call(service, "alive"), "alive");
    EXPECT_TRUE(comesDownTo(before));
}

// Good bytes in a file that may make its reader wait.
TEST_F(DescriptorsTest, PayloadInTheWrongPlace) {
    const FrameInTwo frame("text");
    unique_fd disk(open((root() + "/payload").c_str(), O_RDWR | O_CREAT | O_CLOEXEC, 0600));
    ASSERT_EQ(::write(disk.get(), frame.payload.data(), frame.payload.size()),
              static_cast<ssize_t>(frame.payload.size()));
    if (fcntl(disk.get(), F_GET_SEALS) >= 0) GTEST_SKIP() << "/tmp is memory here";
    unique_fd slow = connectToServer();
    sendBytes(slow.get(), frame.header);
    sendBytes(slow.get(), Bytes(1), {disk.get()});
    EXPECT_TRUE(isTurnedAway(slow.get()));
}

// However one comes, no thread that serves calls closes it.
TEST_F(DescriptorsTest, ThatTakeLongToClose) {
    if (kEmulated) GTEST_SKIP() << "The emulator takes in more descriptors than it tells of";
    const size_t before = descriptorsOfIdleServer();
    const FrameInTwo frame("text");
    const unique_fd memory = memoryWith(frame.payload);
    unique_fd busy[] = {connectToServer(), connectToServer()};
    for (unique_fd& peer : busy) {
        sendBytes(peer.get(), validFrame("wait"));
        ASSERT_EQ(server->report(), "entered");
    }
    {
        LingeringSocket sockets[10];
        unique_fd peers[10];
        for (int i = 0; i < 10; ++i) {
            peers[i] = connectToServer();
            const int peer = peers[i].get();
            switch (i / 2) {
                case 0:
                    sockets[i].giveTo(peer, validFrame("text"));
                    break;
                case 1:
                    sendBytes(peer, frame.header);
                    sockets[i].giveTo(peer, Bytes(1));
                    break;
                case 2:
                    sendBytes(peer, frame.header);
                    sockets[i].giveTo(peer, Bytes(1), {memory.get()});
                    break;
                case 3:
                    sendBytes(peer, Bytes(1));
                    sockets[i].giveTo(peer, validFrame("after what is malformed"));
                    break;
                default:
                    sendBytes(peer, Bytes());
                    sockets[i].giveTo(peer, Bytes());
            }
        }
        for (int i = 0; i < 2; ++i) server->openGate();
        for (unique_fd& peer : peers) ASSERT_TRUE(isTurnedAway(peer.get()));
        unique_fd other = connectToServer();
        sendBytes(other.get(), validFrame("alive"));
        EXPECT_EQ(answerTo(other.get()).status, OK);
    }
    for (unique_fd& peer : busy) peer.reset();
    EXPECT_TRUE(comesDownTo(before));
}

} // namespace
} // namespace vendor::korvan::bex::wifi::tests
