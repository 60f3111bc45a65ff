// Copyright 2026 The BEX Wi-Fi Authors
// SPDX-License-Identifier: Apache-2.0

#pragma once

#include <cstddef>
#include <cstdint>
#include <cstring>

namespace android::hardware::host {

/** A buffer in a parcel's data. 40 bytes, as the kernel's struct for it: sizes count the same. */
struct BufferObject {
    static constexpr uint32_t kType = 0x70742a85; // "pt*" and 0x85, the kernel's own mark

    uint32_t type = kType;
    uint32_t hasParent = 0;
    /** The memory's address; on the wire 1, or 0 for null. */
    uint64_t buffer = 0;
    uint64_t length = 0;
    /**
     * The index of an earlier object, which has this buffer's address in its memory at
     * parentOffset.
     */
    uint64_t parent = 0;
    uint64_t parentOffset = 0;
};
static_assert(sizeof(BufferObject) == 40, "the limits of a transaction count 40 bytes");

/** Room for what most calls carry, so that writing one allocates once: six strings. */
constexpr size_t kUsualDataSize = 640;
constexpr size_t kUsualObjectCount = 16;

inline BufferObject objectAt(const uint8_t* data, size_t offset) {
    BufferObject object;
    memcpy(&object, data + offset, sizeof(object));
    return object;
}

} // namespace android::hardware::host
