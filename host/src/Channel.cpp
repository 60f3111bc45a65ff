// Copyright 2026 The BEX Wi-Fi Authors
// SPDX-License-Identifier: Apache-2.0

#include "host/src/Channel.h"

#include <android-base/unique_fd.h>
#include <errno.h>
#include <fcntl.h>
#include <sys/mman.h>
#include <sys/socket.h>
#include <sys/stat.h>
#include <unistd.h>

#include <cstring>
#include <memory>
#include <utility>

#include "host/src/Closing.h"
#include "host/src/ReceivedBuffer.h"

namespace android::hardware::host {
namespace {

using base::unique_fd;

union DescriptorMessage {
    cmsghdr header;
    char bytes[CMSG_SPACE(sizeof(int))];
};

status_t sendMessage(int socket, const void* message, size_t size, int flags) {
    const ssize_t sent = TEMP_FAILURE_RETRY(send(socket, message, size, flags | MSG_NOSIGNAL));
    return sent == static_cast<ssize_t>(size) ? OK : DEAD_OBJECT;
}

status_t sendDescriptor(int socket, int descriptor, int flags) {
    char byte = 0;
    iovec part = {&byte, sizeof(byte)};
    DescriptorMessage control = {};
    control.header.cmsg_level = SOL_SOCKET;
    control.header.cmsg_type = SCM_RIGHTS;
    control.header.cmsg_len = CMSG_LEN(sizeof(int));
    memcpy(CMSG_DATA(&control.header), &descriptor, sizeof(descriptor));
    msghdr head = {};
    head.msg_iov = &part;
    head.msg_iovlen = 1;
    head.msg_control = &control;
    head.msg_controllen = sizeof(control);
    const ssize_t sent = TEMP_FAILURE_RETRY(sendmsg(socket, &head, flags | MSG_NOSIGNAL));
    return sent == sizeof(byte) ? OK : DEAD_OBJECT;
}

/** What a receive call that returned `size` <= 0 means. */
Receipt nothingReceived(ssize_t size) {
    return size < 0 && (errno == EAGAIN || errno == EWOULDBLOCK) ? Receipt::kNothing
                                                                 : Receipt::kClosed;
}

unique_fd fileWith(const uint8_t* bytes, size_t size) {
    unique_fd file(memfd_create("hidl-transaction", MFD_CLOEXEC));
    size_t done = 0;
    while (file.ok() && done < size) {
        const ssize_t written = TEMP_FAILURE_RETRY(write(file.get(), bytes + done, size - done));
        if (written <= 0) return unique_fd();
        done += static_cast<size_t>(written);
    }
    return file;
}

/** Whether the next message brings descriptors. It stays where it is. */
bool bringsDescriptors(int socket) {
    msghdr head = {};
    const ssize_t size = TEMP_FAILURE_RETRY(recvmsg(socket, &head, MSG_PEEK | MSG_DONTWAIT));
    return size >= 0 && (head.msg_flags & MSG_CTRUNC) != 0;
}

/** Whether a thread can read and close a file without waiting for another process. */
bool isInMemory(int file) {
    return fcntl(file, F_GET_SEALS) >= 0;
}

bool readFile(int file, uint8_t* bytes, size_t size) {
    size_t done = 0;
    while (done < size) {
        const ssize_t got = TEMP_FAILURE_RETRY(
                pread(file, bytes + done, size - done, static_cast<off_t>(done)));
        if (got <= 0) return false;
        done += static_cast<size_t>(got);
    }
    return true;
}

} // namespace

status_t sendFrame(int socket, FrameHeader header, const Parcel* parcel, int flags) {
    const Parcel none;
    if (parcel == nullptr) parcel = &none;
    status_t measured = ParcelAccess::measure(*parcel, &header);
    if (measured != OK) return measured;
    const size_t payloadSize = header.payloadSize();
    if (sizeof(header) + payloadSize <= kMaxInlineFrame) {
        alignas(8) uint8_t message[kMaxInlineFrame];
        memcpy(message, &header, sizeof(header));
        ParcelAccess::serialise(*parcel, header, message + sizeof(header));
        return sendMessage(socket, message, sizeof(header) + payloadSize, flags);
    }
    std::unique_ptr<uint8_t[]> payload(new uint8_t[payloadSize]);
    ParcelAccess::serialise(*parcel, header, payload.get());
    unique_fd file = fileWith(payload.get(), payloadSize);
    if (!file.ok()) return FAILED_TRANSACTION;
    header.flags |= FrameHeader::kPayloadBeside;
    status_t sent = sendMessage(socket, &header, sizeof(header), flags);
    return sent == OK ? sendDescriptor(socket, file.get(), flags) : sent;
}

Receipt FrameReader::receive(int flags, FrameHeader* header, Parcel* parcel) {
    if (mAwaitsPayload) return receiveBeside(flags, header, parcel);
    // Taking the message would close them, and the thread might have to wait for that.
    if ((flags & MSG_DONTWAIT) != 0 && bringsDescriptors(mSocket)) return Receipt::kMalformed;

    alignas(8) uint8_t message[kMaxInlineFrame];
    // With MSG_TRUNC the length is the sender's, also when the message was longer than the room.
    const ssize_t got =
            TEMP_FAILURE_RETRY(recv(mSocket, message, sizeof(message), flags | MSG_TRUNC));
    if (got <= 0) return nothingReceived(got);
    const auto size = static_cast<size_t>(got);
    if (size < sizeof(*header) || size > sizeof(message)) return Receipt::kMalformed;
    memcpy(header, message, sizeof(*header));
    if (!header->isPlausible()) return Receipt::kMalformed;
    if ((header->flags & FrameHeader::kPayloadBeside) != 0) {
        if (size != sizeof(*header)) return Receipt::kMalformed;
        mAnnounced = *header;
        mAwaitsPayload = true;
        return receiveBeside(flags, header, parcel);
    }
    const size_t payloadSize = header->payloadSize();
    if (size != sizeof(*header) + payloadSize) return Receipt::kMalformed;
    ReceivedBuffer payload;
    payload.reservation = Reservation(header->accountedSize());
    if (!payload.reservation) return Receipt::kNoRoom;
    payload.bytes.reset(new uint8_t[payloadSize]);
    memcpy(payload.bytes.get(), message + sizeof(*header), payloadSize);
    return ParcelAccess::adopt(*header, std::move(payload), parcel) ? Receipt::kFrame
                                                                    : Receipt::kMalformed;
}

Receipt FrameReader::receiveBeside(int flags, FrameHeader* header, Parcel* parcel) {
    char byte;
    iovec part = {&byte, sizeof(byte)};
    DescriptorMessage control = {};
    msghdr head = {};
    head.msg_iov = &part;
    head.msg_iovlen = 1;
    head.msg_control = &control;
    // Room for one descriptor and no padding, in which the kernel would put a second one. The
    // message stays where it is until the descriptor proves harmless.
    head.msg_controllen = CMSG_LEN(sizeof(int));
    const ssize_t got =
            TEMP_FAILURE_RETRY(recvmsg(mSocket, &head, flags | MSG_PEEK | MSG_CMSG_CLOEXEC));
    unique_fd file;
    if (const cmsghdr* first = CMSG_FIRSTHDR(&head); got >= 0 && first != nullptr &&
                                                     first->cmsg_level == SOL_SOCKET &&
                                                     first->cmsg_type == SCM_RIGHTS) {
        int descriptor;
        memcpy(&descriptor, CMSG_DATA(first), sizeof(descriptor));
        file.reset(descriptor);
    }
    if (file.ok() && !isInMemory(file.get())) {
        closeElsewhere(std::move(file));
        return Receipt::kMalformed;
    }
    if (got <= 0) return nothingReceived(got);
    if (!file.ok() || (head.msg_flags & (MSG_TRUNC | MSG_CTRUNC)) != 0) return Receipt::kMalformed;
    recv(mSocket, &byte, sizeof(byte), MSG_DONTWAIT);
    mAwaitsPayload = false;
    *header = mAnnounced;

    ReceivedBuffer payload;
    payload.reservation = Reservation(header->accountedSize());
    if (!payload.reservation) return Receipt::kNoRoom;
    const size_t payloadSize = header->payloadSize();
    payload.bytes.reset(new uint8_t[payloadSize]);
    if (!readFile(file.get(), payload.bytes.get(), payloadSize)) return Receipt::kMalformed;
    return ParcelAccess::adopt(*header, std::move(payload), parcel) ? Receipt::kFrame
                                                                    : Receipt::kMalformed;
}

} // namespace android::hardware::host
