// Copyright 2026 The BEX Wi-Fi Authors
// SPDX-License-Identifier: Apache-2.0

#include "host/src/Frame.h"

#include <cstring>
#include <memory>
#include <utility>

#include "host/src/BufferObject.h"
#include "host/src/ReceivedBuffer.h"

namespace android::hardware::host {
namespace {

constexpr uint64_t pad8(uint64_t size) {
    return (size + 7) & ~uint64_t{7};
}

/** Copies and pads with zeros to a multiple of 8; returns where the next thing goes. */
uint8_t* put(uint8_t* out, const void* data, size_t size) {
    if (size != 0) memcpy(out, data, size);
    memset(out + size, 0, pad8(size) - size);
    return out + pad8(size);
}

uint64_t carriedLength(const BufferObject& object) {
    return object.buffer == 0 ? 0 : object.length;
}

/**
 * Whether the parent is an earlier object, of `count` so far, and the address fits into it. As for
 * the driver of a phone, the parent is the object before or one of its ancestors, and the places in
 * a parent ascend: no address is written twice.
 */
bool hasValidParent(const BufferObject& object, const uint8_t* data, const uint32_t* offsets,
                    size_t count) {
    if (object.hasParent == 0) return true;
    if (object.parent >= count) return false;
    const uint64_t room = carriedLength(objectAt(data, offsets[object.parent]));
    if (room < sizeof(uint64_t) || object.parentOffset > room - sizeof(uint64_t)) return false;
    uint64_t lowest = 0;
    for (size_t last = count - 1; last != object.parent;) {
        const BufferObject before = objectAt(data, offsets[last]);
        if (before.hasParent == 0) return false;
        lowest = before.parentOffset + sizeof(uint64_t);
        last = before.parent;
    }
    return object.parentOffset >= lowest;
}

} // namespace

size_t FrameHeader::payloadSize() const {
    return pad8(dataSize) + pad8(uint64_t{objectCount} * sizeof(uint32_t)) + bufferSize;
}

size_t FrameHeader::accountedSize() const {
    return pad8(dataSize) + uint64_t{objectCount} * sizeof(uint64_t) + bufferSize;
}

bool FrameHeader::isPlausible() const {
    return magic == kMagic && (flags & ~kAllFlags) == 0 && reserved == 0 &&
           objectCount <= dataSize / sizeof(BufferObject) && bufferSize % 8 == 0 &&
           accountedSize() <= kTransactionBufferSize;
}

status_t ParcelAccess::measure(const Parcel& parcel, FrameHeader* header) {
    const uint8_t* data = parcel.data();
    const auto& offsets = parcel.mObjects;
    uint64_t buffers = 0;
    for (size_t i = 0; i < offsets.size(); ++i) {
        const BufferObject object = objectAt(data, offsets[i]);
        if (!hasValidParent(object, data, offsets.data(), i)) return FAILED_TRANSACTION;
        // This check comes before the sum, which could overflow.
        if (carriedLength(object) > kTransactionBufferSize) return FAILED_TRANSACTION;
        buffers += pad8(carriedLength(object));
        if (buffers > kTransactionBufferSize) return FAILED_TRANSACTION;
    }
    if (parcel.dataSize() > kTransactionBufferSize) return FAILED_TRANSACTION;
    header->dataSize = static_cast<uint32_t>(parcel.dataSize());
    header->objectCount = static_cast<uint32_t>(offsets.size());
    header->bufferSize = static_cast<uint32_t>(buffers);
    return header->accountedSize() <= kTransactionBufferSize ? OK : FAILED_TRANSACTION;
}

void ParcelAccess::serialise(const Parcel& parcel, const FrameHeader& header, uint8_t* payload) {
    const uint8_t* data = parcel.data();
    const auto& offsets = parcel.mObjects;
    uint8_t* out = put(payload, data, header.dataSize);
    out = put(out, offsets.data(), offsets.size() * sizeof(offsets[0]));
    std::vector<uint8_t*> buffers;
    buffers.reserve(offsets.size());
    for (uint32_t offset : offsets) {
        BufferObject object = objectAt(data, offset);
        const auto* bytes = reinterpret_cast<const uint8_t*>(object.buffer);
        buffers.push_back(out);
        out = put(out, bytes, carriedLength(object));
        // No other process gets to see the addresses in this one.
        if (object.hasParent != 0) {
            memset(buffers[object.parent] + object.parentOffset, 0, sizeof(object.buffer));
        }
        object.buffer = bytes == nullptr ? 0 : 1;
        memcpy(payload + offset, &object, sizeof(object));
    }
}

bool ParcelAccess::adopt(const FrameHeader& header, ReceivedBuffer&& payload, Parcel* parcel) {
    uint8_t* data = payload.bytes.get();
    uint8_t* table = data + pad8(header.dataSize);
    uint8_t* buffers = table + pad8(uint64_t{header.objectCount} * sizeof(uint32_t));

    std::vector<uint32_t> offsets(header.objectCount);
    if (!offsets.empty()) memcpy(offsets.data(), table, offsets.size() * sizeof(offsets[0]));
    uint64_t used = 0;
    uint64_t free = 0; // where the next object may begin
    for (size_t i = 0; i < offsets.size(); ++i) {
        const uint64_t offset = offsets[i];
        if (offset < free || offset % 4 != 0) return false;
        if (offset + sizeof(BufferObject) > header.dataSize) return false;
        free = offset + sizeof(BufferObject);

        BufferObject object = objectAt(data, offset);
        if (object.type != BufferObject::kType || object.hasParent > 1 || object.buffer > 1) {
            return false;
        }
        if (carriedLength(object) > header.bufferSize) return false;
        if (pad8(carriedLength(object)) > header.bufferSize - used) return false;
        if (!hasValidParent(object, data, offsets.data(), i)) return false;
        if (object.buffer != 0) object.buffer = reinterpret_cast<uintptr_t>(buffers + used);
        used += pad8(carriedLength(object));
        memcpy(data + offset, &object, sizeof(object));
    }
    if (used != header.bufferSize) return false;

    for (uint32_t offset : offsets) {
        const BufferObject object = objectAt(data, offset);
        if (object.hasParent == 0) continue;
        const BufferObject parent = objectAt(data, offsets[object.parent]);
        memcpy(reinterpret_cast<uint8_t*>(parent.buffer) + object.parentOffset, &object.buffer,
               sizeof(object.buffer));
    }

    parcel->mReceivedData = data;
    parcel->mReceivedSize = header.dataSize;
    parcel->mReceived = std::make_unique<ReceivedBuffer>(std::move(payload));
    parcel->mObjects = std::move(offsets);
    parcel->mPosition = 0;
    parcel->mNextObject = 0;
    return true;
}

void ParcelAccess::releaseReservation(Parcel* parcel) {
    if (parcel->mReceived) parcel->mReceived->reservation.release();
}

} // namespace android::hardware::host
