// Copyright 2026 The BEX Wi-Fi Authors
// SPDX-License-Identifier: Apache-2.0

#pragma once

#include <android-base/unique_fd.h>
#include <hidl/HidlSupport.h>

#include <cstdint>
#include <vector>

#include "host/src/Frame.h"
#include "tests/host/HostTest.h"

namespace vendor::korvan::bex::wifi::tests {

using Bytes = std::vector<uint8_t>;

/** RunRxStop(text) as it goes over the wire. */
Bytes validFrame(const android::hardware::hidl_string& text);

/** Changes 32 bits at an offset. */
Bytes with(Bytes frame, size_t offset, uint32_t value);

/** A call whose payload goes beside it: what announces it, and the payload. */
struct FrameInTwo {
    explicit FrameInTwo(const android::hardware::hidl_string& text);

    Bytes header;
    Bytes payload;
};

/** A server, and peers that talk to it without a proxy. */
class PeerTest : public ServedTest {
  protected:
    android::base::unique_fd connectToServer();
    void sendBytes(int peer, const Bytes& bytes, const std::vector<int>& descriptors = {});

    /** The header of the next answer; the test fails when none comes. */
    android::hardware::host::FrameHeader answerTo(int peer);
    /** Waits until the server has turned the peer away. */
    bool isTurnedAway(int peer);

    size_t descriptorsOfServer();
    /** The same with the proxy's connection taken in. */
    size_t descriptorsOfIdleServer();
    /**
     * Waits until the server has so few: it lets go of a connection after it told the peer. Each
     * call lets a thread of its own come by.
     */
    bool comesDownTo(size_t descriptors);
};

} // namespace vendor::korvan::bex::wifi::tests
