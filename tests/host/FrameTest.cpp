// Copyright 2026 The BEX Wi-Fi Authors
// SPDX-License-Identifier: Apache-2.0

// Peers that do not keep to the protocol: each loses its own connection and harms nothing else.

#include <fcntl.h>
#include <hidl/HidlBinderSupport.h>
#include <sys/mman.h>
#include <sys/socket.h>
#include <unistd.h>

#include <chrono>
#include <cstring>
#include <filesystem>
#include <future>
#include <random>

#include "host/src/Channel.h"
#include "host/src/Frame.h"
#include "host/src/ReceivedBuffer.h"
#include "host/src/Session.h"
#include "host/src/SocketFile.h"
#include "tests/Message.h"
#include "tests/host/HostTest.h"

namespace vendor::korvan::bex::wifi::tests {
namespace {

using namespace ::android::hardware; // NOLINT: half of it, below
using ::android::OK;
using ::android::base::unique_fd;
using host::FrameHeader;
using host::ParcelAccess;
using host::Receipt;

using Bytes = std::vector<uint8_t>;

/** RunRxStop(text) as it goes over the wire. */
Bytes validFrame(const hidl_string& text) {
    Parcel parcel;
    fillCall(&parcel, text);
    FrameHeader header;
    header.code = 16;
    EXPECT_EQ(ParcelAccess::measure(parcel, &header), OK);
    Bytes frame(sizeof(header) + header.payloadSize());
    memcpy(frame.data(), &header, sizeof(header));
    ParcelAccess::serialise(parcel, header, frame.data() + sizeof(header));
    return frame;
}

/** Changes 32 bits at an offset. */
Bytes with(Bytes frame, size_t offset, uint32_t value) {
    memcpy(frame.data() + offset, &value, sizeof(value));
    return frame;
}

class FrameTest : public ServedTest {
  protected:
    unique_fd connectToServer() {
        sockaddr_un address;
        EXPECT_EQ(host::socketAddress(host::socketPath(IWifiService::descriptor, "default"),
                                      &address),
                  OK);
        unique_fd peer(socket(AF_UNIX, SOCK_SEQPACKET | SOCK_CLOEXEC, 0));
        const timeval patience = {20, 0};
        EXPECT_EQ(setsockopt(peer.get(), SOL_SOCKET, SO_RCVTIMEO, &patience, sizeof(patience)), 0);
        EXPECT_EQ(connect(peer.get(), reinterpret_cast<sockaddr*>(&address), sizeof(address)), 0);
        return peer;
    }

    void sendBytes(int peer, const Bytes& bytes, const std::vector<int>& descriptors = {}) {
        ASSERT_EQ(sendMessage(peer, bytes, descriptors, 0), static_cast<ssize_t>(bytes.size()));
    }

    /** Waits until the server has turned the peer away. */
    bool isTurnedAway(int peer) {
        char byte;
        const ssize_t got = recv(peer, &byte, 1, 0);
        return got == 0 || (got < 0 && errno != EAGAIN);
    }

    size_t descriptorsOfServer() {
        size_t count = 0;
        const std::string folder = "/proc/" + std::to_string(server->pid()) + "/fd";
        for ([[maybe_unused]] auto& entry : std::filesystem::directory_iterator(folder)) ++count;
        return count;
    }

    /** The same with the proxy's connection taken in. */
    size_t descriptorsOfIdleServer() {
        EXPECT_EQ(call(service, "idle"), "idle");
        return descriptorsOfServer();
    }

    /**
     * Waits until the server has so few: it lets go of a connection after it told the peer. Each
     * call lets a thread of its own come by.
     */
    bool comesDownTo(size_t descriptors) {
        const auto patience = std::chrono::steady_clock::now() + std::chrono::seconds(20);
        while (descriptorsOfServer() > descriptors) {
            if (std::chrono::steady_clock::now() > patience) return false;
            EXPECT_EQ(call(service, "alive"), "alive");
        }
        return true;
    }
};

TEST_F(FrameTest, ValidByHand) {
    unique_fd peer = connectToServer();
    sendBytes(peer.get(), validFrame("by hand"));
    FrameHeader header;
    Parcel reply;
    ASSERT_EQ(host::FrameReader(peer.get()).receive(0, &header, &reply), Receipt::kFrame);
    EXPECT_EQ(header.status, OK);
}

TEST_F(FrameTest, MalformedIsTurnedAway) {
    const Bytes valid = validFrame("text");
    // The header's fields, then the token of 44 bytes, then the first object's, then the table.
    const size_t object = sizeof(FrameHeader) + 44;
    const size_t table = sizeof(FrameHeader) + 128;
    const std::vector<Bytes> cases = {Bytes(1),
                                      Bytes(31),
                                      Bytes(32),
                                      Bytes(5'000, 0xff),
                                      Bytes(20'000, 0x55),
                                      Bytes(valid.begin(), valid.end() - 8),
                                      Bytes(valid.begin(), valid.begin() + 32),
                                      with(valid, 0, 0x32584542),
                                      with(valid, 4, 0x8),
                                      with(valid, 4, FrameHeader::kReply),
                                      with(valid, 4, FrameHeader::kPayloadBeside),
                                      with(valid, 28, 1),
                                      with(valid, 16, 0xffffffff),
                                      with(valid, 16, 124 - 8),
                                      with(valid, 20, 0xffffffff),
                                      with(valid, 20, 1),
                                      with(valid, 20, 3),
                                      with(valid, 24, 0xfffffff8),
                                      with(valid, 24, 16),
                                      with(valid, 24, 23),
                                      with(valid, object, 1),
                                      with(valid, object + 4, 2),
                                      with(valid, object + 8, 2),
                                      with(valid, object + 12, 1),
                                      with(valid, object + 16, 0xffffffff),
                                      with(valid, object + 20, 1),
                                      with(valid, object + 40 + 24, 1),
                                      with(valid, object + 40 + 24, 0xffffffff),
                                      with(valid, object + 40 + 28, 1),
                                      with(valid, object + 40 + 32, 9),
                                      with(valid, object + 40 + 36, 1),
                                      with(valid, table, 45),
                                      with(valid, table, 4),
                                      with(valid, table, 0xfffffffc),
                                      with(valid, table + 4, 44),
                                      with(valid, table + 4, 48),
                                      with(valid, table + 4, 88)};
    for (size_t i = 0; i < cases.size(); ++i) {
        unique_fd peer = connectToServer();
        sendBytes(peer.get(), cases[i]);
        EXPECT_TRUE(isTurnedAway(peer.get())) << "case " << i;
    }
    EXPECT_EQ(call(service, "alive"), "alive");
}

TEST_F(FrameTest, DescriptorsThatAreNotMemory) {
    int ends[2];
    ASSERT_EQ(pipe2(ends, O_CLOEXEC), 0);
    unique_fd readEnd(ends[0]);
    unique_fd writeEnd(ends[1]);
    unique_fd disk(open("/proc/self/exe", O_RDONLY | O_CLOEXEC));
    unique_fd tooShort(memfd_create("short", MFD_CLOEXEC));
    Bytes header = with(validFrame("text"), 4, FrameHeader::kPayloadBeside);
    header.resize(sizeof(FrameHeader));
    const size_t before = descriptorsOfIdleServer();
    for (const int descriptor : {readEnd.get(), disk.get(), tooShort.get()}) {
        unique_fd peer = connectToServer();
        sendBytes(peer.get(), header);
        sendBytes(peer.get(), Bytes(1), {descriptor});
        EXPECT_TRUE(isTurnedAway(peer.get()));
    }
    // No descriptor where one is announced; and one that is not announced, which is dropped.
    unique_fd without = connectToServer();
    sendBytes(without.get(), header);
    sendBytes(without.get(), Bytes(1));
    EXPECT_TRUE(isTurnedAway(without.get()));
    unique_fd unannounced = connectToServer();
    sendBytes(unannounced.get(), validFrame("text"), {disk.get()});
    FrameHeader reply;
    Parcel parcel;
    EXPECT_EQ(host::FrameReader(unannounced.get()).receive(0, &reply, &parcel), Receipt::kFrame);
    EXPECT_EQ(call(service, "alive"), "alive");
    EXPECT_TRUE(comesDownTo(before + 1)) << "with the unannounced one";
}

// Good bytes, and a file or two too many.
TEST_F(FrameTest, MoreDescriptorsThanOne) {
    if (kEmulated) {
        GTEST_SKIP()
                << "The emulator's recvmsg() asks for twice the room that the program gave, keeps "
                   "the descriptors that came too many, and does not say MSG_CTRUNC";
    }
    Bytes header = with(validFrame("text"), 4, FrameHeader::kPayloadBeside);
    const Bytes payload(header.begin() + sizeof(FrameHeader), header.end());
    header.resize(sizeof(FrameHeader));
    unique_fd memory(memfd_create("payload", MFD_CLOEXEC));
    ASSERT_EQ(::write(memory.get(), payload.data(), payload.size()),
              static_cast<ssize_t>(payload.size()));
    const size_t before = descriptorsOfIdleServer();
    for (const size_t count : {2, 3}) {
        unique_fd peer = connectToServer();
        sendBytes(peer.get(), header);
        sendBytes(peer.get(), Bytes(1), std::vector<int>(count, memory.get()));
        EXPECT_TRUE(isTurnedAway(peer.get()));
    }
    EXPECT_EQ(call(service, "alive"), "alive");
    EXPECT_TRUE(comesDownTo(before));
}

// Good bytes in a file that may make its reader wait.
TEST_F(FrameTest, PayloadInTheWrongPlace) {
    Bytes header = with(validFrame("text"), 4, FrameHeader::kPayloadBeside);
    const Bytes payload(header.begin() + sizeof(FrameHeader), header.end());
    header.resize(sizeof(FrameHeader));
    unique_fd disk(open((root() + "/payload").c_str(), O_RDWR | O_CREAT | O_CLOEXEC, 0600));
    ASSERT_EQ(::write(disk.get(), payload.data(), payload.size()),
              static_cast<ssize_t>(payload.size()));
    if (fcntl(disk.get(), F_GET_SEALS) >= 0) GTEST_SKIP() << "/tmp is memory here";
    unique_fd slow = connectToServer();
    sendBytes(slow.get(), header);
    sendBytes(slow.get(), Bytes(1), {disk.get()});
    EXPECT_TRUE(isTurnedAway(slow.get()));
}

// The payload's message comes late, or never: the thread is free all the time.
TEST_F(FrameTest, PeersThatOnlyAnnounce) {
    Bytes header = with(validFrame("text"), 4, FrameHeader::kPayloadBeside);
    const Bytes payload(header.begin() + sizeof(FrameHeader), header.end());
    header.resize(sizeof(FrameHeader));
    std::vector<unique_fd> peers;
    for (int i = 0; i < 8; ++i) {
        peers.push_back(connectToServer());
        sendBytes(peers.back().get(), header);
    }
    EXPECT_EQ(call(service, "alive"), "alive");
    unique_fd file(memfd_create("payload", MFD_CLOEXEC));
    ASSERT_EQ(::write(file.get(), payload.data(), payload.size()),
              static_cast<ssize_t>(payload.size()));
    for (unique_fd& peer : peers) {
        sendBytes(peer.get(), Bytes(1), {file.get()});
        FrameHeader reply;
        Parcel parcel;
        EXPECT_EQ(host::FrameReader(peer.get()).receive(0, &reply, &parcel), Receipt::kFrame);
        EXPECT_EQ(reply.status, OK);
    }
}

// More of them than threads: none holds one.
TEST_F(FrameTest, PeersThatNeverReadTheirReplies) {
    std::vector<unique_fd> peers;
    for (int i = 0; i < 8; ++i) {
        peers.push_back(connectToServer());
        for (int j = 0; j < 4; ++j) sendBytes(peers.back().get(), validFrame("large 900000"));
    }
    EXPECT_EQ(call(service, "alive"), "alive");
}

TEST_F(FrameTest, PeersThatSayNothing) {
    std::vector<unique_fd> peers;
    for (int i = 0; i < 64; ++i) peers.push_back(connectToServer());
    EXPECT_EQ(call(service, "alive"), "alive");
    EXPECT_EQ(call(IWifiService::tryGetService(), "alive"), "alive");
}

TEST_F(FrameTest, PeersThatLeaveAtOnceLeaveNothingBehind) {
    const size_t before = descriptorsOfIdleServer();
    for (int i = 0; i < 300; ++i) {
        unique_fd peer = connectToServer();
        if (i % 3 == 1) sendBytes(peer.get(), validFrame("unread"));
        if (i % 3 == 2) sendBytes(peer.get(), with(validFrame("x"), 4, FrameHeader::kOneway));
    }
    EXPECT_TRUE(comesDownTo(before));
}

TEST_F(FrameTest, SecondCallBeforeTheFirstAnswer) {
    unique_fd peer = connectToServer();
    sendBytes(peer.get(), validFrame("wait"));
    ASSERT_EQ(server->report(), "entered");
    sendBytes(peer.get(), validFrame("second"));
    // The other thread comes by, sees that the connection has an owner, and serves this.
    EXPECT_EQ(call(service, "alive"), "alive");
    server->openGate();
    for (int i = 0; i < 2; ++i) {
        FrameHeader header;
        Parcel reply;
        EXPECT_EQ(host::FrameReader(peer.get()).receive(0, &header, &reply), Receipt::kFrame);
    }
}

// The call and the hang-up reach the server as one piece of news.
TEST_F(FrameTest, PeersThatLeaveBeforeTheirAnswer) {
    std::vector<unique_fd> peers;
    for (int i = 0; i < 8; ++i) {
        peers.push_back(connectToServer());
        sendBytes(peers.back().get(), validFrame("accepted"));
        FrameHeader header;
        Parcel reply;
        ASSERT_EQ(host::FrameReader(peers.back().get()).receive(0, &header, &reply),
                  Receipt::kFrame);
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

// Too many at once: the server keeps descriptors for its own work and goes on.
TEST_F(FrameTest, FloodOfConnections) {
    std::vector<std::string> steps = {"descriptors", "64"};
    steps.insert(steps.end(), kUsualServer.begin(), kUsualServer.end());
    server = std::make_unique<ServerProcess>(steps);
    ASSERT_EQ(server->report(), "0");
    ASSERT_EQ(server->report(), "ready");
    service = IWifiService::tryGetService();
    EXPECT_EQ(call(service, "first"), "first");
    {
        std::vector<unique_fd> peers;
        for (int i = 0; i < 200; ++i) peers.push_back(connectToServer());
        EXPECT_TRUE(isTurnedAway(peers.back().get()));
        EXPECT_EQ(call(service, "alive"), "alive");
        EXPECT_LT(descriptorsOfServer(), 48u);
    }
    EXPECT_TRUE(comesDownTo(16));
    EXPECT_EQ(call(IWifiService::tryGetService(), "anew"), "anew");
}

// Whatever a frame says, reading it touches nothing but its own memory (run under ASan to see).
TEST(FrameFuzzTest, ChangedFramesAreReadSafely) {
    std::mt19937 random(1);
    const Bytes valid = validFrame("some text");
    int accepted = 0;
    for (int round = 0; round < 100'000; ++round) {
        Bytes frame = valid;
        for (int changes = static_cast<int>(random() % 4) + 1; changes > 0; --changes) {
            const size_t place = random() % frame.size();
            frame[place] = random() % 2 != 0 ? static_cast<uint8_t>(random())
                                             : static_cast<uint8_t>(random() % 64);
        }
        FrameHeader header;
        memcpy(&header, frame.data(), sizeof(header));
        const size_t size = frame.size() - sizeof(header);
        if (!header.isPlausible() || header.payloadSize() != size) continue;
        host::ReceivedBuffer payload;
        payload.bytes.reset(new uint8_t[size]);
        memcpy(payload.bytes.get(), frame.data() + sizeof(header), size);
        Parcel parcel;
        if (!ParcelAccess::adopt(header, std::move(payload), &parcel)) continue;
        parcel.enforceInterface(IWifiService::descriptor);
        parcel.setDataPosition(44);
        const void* buffer;
        size_t handle;
        if (parcel.readBuffer(sizeof(hidl_string), &handle, &buffer) != OK) continue;
        auto& text = *static_cast<hidl_string*>(const_cast<void*>(buffer));
        if (readEmbeddedFromParcel(text, parcel, handle, 0) != OK) continue;
        EXPECT_LT(std::string(text).size(), size);
        ++accepted;
    }
    EXPECT_GT(accepted, 1'000);
}

} // namespace
} // namespace vendor::korvan::bex::wifi::tests
