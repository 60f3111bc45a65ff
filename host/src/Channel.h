// Copyright 2026 The BEX Wi-Fi Authors
// SPDX-License-Identifier: Apache-2.0

#pragma once

#include <hwbinder/Parcel.h>

#include "host/src/Frame.h"

namespace android::hardware::host {

// Frames over a SOCK_SEQPACKET socket: one frame is one message, so no frame arrives in parts. When
// a payload is too long for a message, a second message follows the frame, of one byte, which
// carries the descriptor of a memory file with the payload.

/**
 * Sends a frame with the parcel, or without a payload when it is null.
 *
 * @param flags Flags of send(): MSG_DONTWAIT where the thread must not wait for the peer.
 * @return OK; FAILED_TRANSACTION, with nothing sent, when the parcel cannot be carried; DEAD_OBJECT
 *     when the peer is gone, or with MSG_DONTWAIT has not taken what it was sent before.
 */
status_t sendFrame(int socket, FrameHeader header, const Parcel* parcel, int flags);

enum class Receipt {
    kFrame,
    /** MSG_DONTWAIT, and there is nothing yet. */
    kNothing,
    /** A frame whose payload does not fit what is left of this process's transaction buffer. */
    kNoRoom,
    /** The peer is gone. */
    kClosed,
    /** Not a frame: nothing further from this peer can be trusted. */
    kMalformed,
};

/** Receives the frames of one socket. */
class FrameReader {
  public:
    explicit FrameReader(int socket) : mSocket(socket) {}

    /**
     * Receives one frame. The header is valid after kFrame and kNoRoom, the parcel after kFrame.
     *
     * @param flags Flags of recv(): MSG_DONTWAIT where the thread must not wait for the peer.
     */
    Receipt receive(int flags, FrameHeader* header, Parcel* parcel);

  private:
    Receipt receiveBeside(int flags, FrameHeader* header, Parcel* parcel);

    const int mSocket;
    // Set between a frame's message and the one with its payload.
    bool mAwaitsPayload = false;
    FrameHeader mAnnounced;
};

} // namespace android::hardware::host
