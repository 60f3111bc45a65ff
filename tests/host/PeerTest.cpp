// Copyright 2026 The BEX Wi-Fi Authors
// SPDX-License-Identifier: Apache-2.0

#include "tests/host/PeerTest.h"

#include <sys/socket.h>

#include <chrono>
#include <cstring>
#include <filesystem>

#include "host/src/Channel.h"
#include "host/src/SocketFile.h"
#include "tests/Message.h"

namespace vendor::korvan::bex::wifi::tests {

using android::OK;
using android::base::unique_fd;
using android::hardware::hidl_string;
using android::hardware::Parcel;
using android::hardware::host::FrameHeader;
using android::hardware::host::FrameReader;
using android::hardware::host::ParcelAccess;
using android::hardware::host::Receipt;
using android::hardware::host::socketAddress;
using android::hardware::host::socketPath;

namespace {

constexpr int kPatienceSeconds = 60;

} // namespace

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

Bytes with(Bytes frame, size_t offset, uint32_t value) {
    memcpy(frame.data() + offset, &value, sizeof(value));
    return frame;
}

FrameInTwo::FrameInTwo(const hidl_string& text)
      : header(with(validFrame(text), 4, FrameHeader::kPayloadBeside)),
        payload(header.begin() + sizeof(FrameHeader), header.end()) {
    header.resize(sizeof(FrameHeader));
}

unique_fd PeerTest::connectToServer() {
    sockaddr_un address;
    EXPECT_EQ(socketAddress(socketPath(IWifiService::descriptor, "default"), &address), OK);
    unique_fd peer(socket(AF_UNIX, SOCK_SEQPACKET | SOCK_CLOEXEC, 0));
    const timeval patience = {kPatienceSeconds, 0};
    EXPECT_EQ(setsockopt(peer.get(), SOL_SOCKET, SO_RCVTIMEO, &patience, sizeof(patience)), 0);
    EXPECT_EQ(connect(peer.get(), reinterpret_cast<sockaddr*>(&address), sizeof(address)), 0);
    return peer;
}

void PeerTest::sendBytes(int peer, const Bytes& bytes, const std::vector<int>& descriptors) {
    ASSERT_EQ(sendMessage(peer, bytes, descriptors, 0), static_cast<ssize_t>(bytes.size()));
}

FrameHeader PeerTest::answerTo(int peer) {
    FrameHeader header;
    Parcel reply;
    EXPECT_EQ(FrameReader(peer).receive(0, &header, &reply), Receipt::kFrame);
    return header;
}

bool PeerTest::isTurnedAway(int peer) {
    char byte;
    const ssize_t got = recv(peer, &byte, 1, 0);
    return got == 0 || (got < 0 && errno != EAGAIN);
}

size_t PeerTest::descriptorsOfServer() {
    size_t count = 0;
    const std::string folder = "/proc/" + std::to_string(server->pid()) + "/fd";
    for ([[maybe_unused]] auto& entry : std::filesystem::directory_iterator(folder)) ++count;
    return count;
}

size_t PeerTest::descriptorsOfIdleServer() {
    EXPECT_EQ(call(service, "idle"), "idle");
    return descriptorsOfServer();
}

bool PeerTest::comesDownTo(size_t descriptors) {
    const auto patience = std::chrono::steady_clock::now() + std::chrono::seconds(kPatienceSeconds);
    while (descriptorsOfServer() > descriptors) {
        if (std::chrono::steady_clock::now() > patience) return false;
        EXPECT_EQ(call(service, "alive"), "alive");
    }
    return true;
}

} // namespace vendor::korvan::bex::wifi::tests
