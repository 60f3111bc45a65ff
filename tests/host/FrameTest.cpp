// Copyright 2026 The BEX Wi-Fi Authors
// SPDX-License-Identifier: Apache-2.0

// Peers that do not keep to the protocol: each loses its own connection and harms nothing else.

#include <hidl/HidlBinderSupport.h>
#include <sys/mman.h>
#include <sys/socket.h>
#include <unistd.h>

#include <cstring>
#include <filesystem>
#include <random>

#include "host/src/Frame.h"
#include "host/src/ReceivedBuffer.h"
#include "host/src/RemoteBinder.h"
#include "host/src/Session.h"
#include "host/src/SocketFile.h"
#include "tests/host/PeerTest.h"

namespace vendor::korvan::bex::wifi::tests {
namespace {

using namespace ::android::hardware; // NOLINT: half of it, below
using ::android::OK;
using ::android::base::unique_fd;
using host::FrameHeader;
using host::ParcelAccess;

class FrameTest : public PeerTest {};

TEST_F(FrameTest, ValidByHand) {
    unique_fd peer = connectToServer();
    sendBytes(peer.get(), validFrame("by hand"));
    EXPECT_EQ(answerTo(peer.get()).status, OK);
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

// The payload's message comes late, or never: the thread is free all the time.
TEST_F(FrameTest, PeersThatOnlyAnnounce) {
    const FrameInTwo frame("text");
    std::vector<unique_fd> peers;
    for (int i = 0; i < 8; ++i) {
        peers.push_back(connectToServer());
        sendBytes(peers.back().get(), frame.header);
    }
    EXPECT_EQ(call(service, "alive"), "alive");
    unique_fd file(memfd_create("payload", MFD_CLOEXEC));
    ASSERT_EQ(::write(file.get(), frame.payload.data(), frame.payload.size()),
              static_cast<ssize_t>(frame.payload.size()));
    for (unique_fd& peer : peers) {
        sendBytes(peer.get(), Bytes(1), {file.get()});
        EXPECT_EQ(answerTo(peer.get()).status, OK);
    }
}

// The header's sizes tell where the buffers begin: the text's struct is the first of them.
uint64_t addressOfText(const Bytes& frame) {
    FrameHeader header;
    memcpy(&header, frame.data(), sizeof(header));
    uint64_t address;
    memcpy(&address, frame.data() + frame.size() - header.bufferSize, sizeof(address));
    return address;
}

TEST_F(FrameTest, AddressesDoNotCrossTheWire) {
    const Bytes request = validFrame("text");
    EXPECT_EQ(addressOfText(request), 0u);

    unique_fd peer = connectToServer();
    sendBytes(peer.get(), request);
    Bytes reply(4'096);
    const ssize_t got = recv(peer.get(), reply.data(), reply.size(), 0);
    ASSERT_GT(got, static_cast<ssize_t>(sizeof(FrameHeader)));
    reply.resize(static_cast<size_t>(got));
    EXPECT_EQ(addressOfText(reply), 0u);
}

// A listening socket in the service's place.
TEST_F(HostTest, OnlyAReplyIsTakenForAnAnswer) {
    const std::string path = host::socketPath(IWifiService::descriptor, "default");
    std::filesystem::create_directories(socketFolder());
    sockaddr_un address;
    ASSERT_EQ(host::socketAddress(path, &address), OK);
    unique_fd listener(socket(AF_UNIX, SOCK_SEQPACKET | SOCK_CLOEXEC, 0));
    ASSERT_EQ(bind(listener.get(), reinterpret_cast<sockaddr*>(&address), sizeof(address)), 0);
    ASSERT_EQ(listen(listener.get(), 1), 0);

    sp<IBinder> binder = new host::RemoteBinder(host::Session::open(path));
    unique_fd server(accept4(listener.get(), nullptr, nullptr, SOCK_CLOEXEC));
    Bytes frame = validFrame("text");
    ASSERT_EQ(send(server.get(), frame.data(), frame.size(), 0),
              static_cast<ssize_t>(frame.size()));
    Parcel call;
    const hidl_string text = "text";
    fillCall(&call, text);
    Parcel reply;
    EXPECT_EQ(binder->transact(16, call, &reply), ::android::DEAD_OBJECT);
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
