// Copyright 2026 The BEX Wi-Fi Authors
// SPDX-License-Identifier: Apache-2.0

#pragma once

#include <sys/socket.h>

#include <cstdint>
#include <cstring>
#include <vector>

namespace vendor::korvan::bex::wifi::tests {

/** Sends one message, with up to eight descriptors beside it; the result is sendmsg()'s. */
inline ssize_t sendMessage(int socket, const std::vector<uint8_t>& bytes,
                           const std::vector<int>& descriptors, int flags) {
    iovec part = {const_cast<uint8_t*>(bytes.data()), bytes.size()};
    msghdr head = {};
    head.msg_iov = &part;
    head.msg_iovlen = 1;
    alignas(cmsghdr) char control[CMSG_SPACE(sizeof(int) * 8)] = {};
    if (!descriptors.empty()) {
        const size_t size = sizeof(int) * descriptors.size();
        head.msg_control = control;
        head.msg_controllen = CMSG_SPACE(size);
        cmsghdr* message = CMSG_FIRSTHDR(&head);
        message->cmsg_level = SOL_SOCKET;
        message->cmsg_type = SCM_RIGHTS;
        message->cmsg_len = CMSG_LEN(size);
        memcpy(CMSG_DATA(message), descriptors.data(), size);
    }
    return sendmsg(socket, &head, flags | MSG_NOSIGNAL);
}

} // namespace vendor::korvan::bex::wifi::tests
