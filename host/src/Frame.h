// Copyright 2026 The BEX Wi-Fi Authors
// SPDX-License-Identifier: Apache-2.0

#pragma once

#include <hwbinder/Parcel.h>
#include <utils/Errors.h>

#include <cstddef>
#include <cstdint>

namespace android::hardware::host {

/**
 * The head of a message between two processes: a call or its answer. A payload follows in the same
 * message, or beside it in a memory file when the two together are longer than kMaxInlineFrame:
 *
 *     data         dataSize bytes, padded to 8
 *     offsets      objectCount times 32 bits, padded to 8: where in the data the buffer objects are
 *     buffers      bufferSize bytes: each buffer in the objects' order, each padded to 8
 *
 * All numbers are in the machine's own order: both ends run on it.
 */
struct FrameHeader {
    static constexpr uint32_t kMagic = 0x31584542; // "BEX1"

    enum Flags : uint32_t {
        kReply = 1u << 0,
        kOneway = 1u << 1,
        kPayloadBeside = 1u << 2,
        kAllFlags = kReply | kOneway | kPayloadBeside,
    };

    uint32_t magic = kMagic;
    uint32_t flags = 0;
    /** A call's transaction code; 0 in an answer. */
    uint32_t code = 0;
    /** An answer's outcome: OK with a payload, else what stands in the payload's place. */
    int32_t status = OK;
    uint32_t dataSize = 0;
    uint32_t objectCount = 0;
    uint32_t bufferSize = 0;
    uint32_t reserved = 0;

    /** The payload's length. */
    size_t payloadSize() const;
    /** What the payload takes of the receiver's transaction buffer, counted as the phone's driver.
     */
    size_t accountedSize() const;
    /** Whether the numbers are consistent. Check this before you use any of them. */
    bool isPlausible() const;
};
static_assert(sizeof(FrameHeader) == 32, "both ends agree on 32 bytes");

/** Longest message that carries its payload itself. Any socket buffer takes it in one piece. */
constexpr size_t kMaxInlineFrame = 16'384;

/** Gives the transport access to a parcel's members. */
struct ParcelAccess {
    /**
     * Fills the header's three sizes. FAILED_TRANSACTION when the parcel is larger than the
     * transaction buffer, or a buffer's parent is not an earlier one with room for the address.
     */
    static status_t measure(const Parcel& parcel, FrameHeader* header);

    /** Writes header.payloadSize() bytes. The header comes from measure(). */
    static void serialise(const Parcel& parcel, const FrameHeader& header, uint8_t* payload);

    /**
     * Turns a payload that came from another process into a parcel to read from: checks all of it,
     * then sets the addresses that it implies. When it is malformed, the result is false and the
     * parcel empty.
     */
    static bool adopt(const FrameHeader& header, ReceivedBuffer&& payload, Parcel* parcel);

    /** Gives the received parcel's share of the transaction buffer back before its memory. */
    static void releaseReservation(Parcel* parcel);
};

} // namespace android::hardware::host
