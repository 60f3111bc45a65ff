// Copyright 2026 The BEX Wi-Fi Authors
// SPDX-License-Identifier: Apache-2.0

#include "tests/fuzz/Frames.h"

#include <vendor/korvan/bex/wifi/1.0/IWifiService.h>

#include <algorithm>
#include <cstring>
#include <map>

#include "host/src/BufferObject.h"
#include "host/src/Frame.h"
#include "host/src/TransactionBuffer.h"

namespace fuzz {

using android::hardware::hidl_string;
using android::hardware::Parcel;
using android::hardware::host::BufferObject;
using android::hardware::host::FrameHeader;
using vendor::korvan::bex::wifi::V1_0::IWifiService;

namespace {

uint64_t padded(uint64_t size) {
    return (size + 7) / 8 * 8;
}

template <typename T>
T at(const Bytes& bytes, size_t offset) {
    T value;
    memcpy(&value, bytes.data() + offset, sizeof(value));
    return value;
}

Bytes joined(const FrameHeader& header, const Bytes& payload) {
    Bytes frame(sizeof(header) + payload.size());
    memcpy(frame.data(), &header, sizeof(header));
    std::copy(payload.begin(), payload.end(), frame.begin() + sizeof(header));
    return frame;
}

/** A number at most `reach` away from one that matters. */
uint64_t near(Input& input, uint64_t value, uint64_t reach) {
    return value + input.number(2 * reach + 1) - reach;
}

BufferObject readObject(Input& input, const std::vector<BufferObject>& before) {
    BufferObject object;
    object.buffer = input.number(8) == 7 ? 0 : 1;
    object.length = input.number(64);
    object.hasParent = before.empty() ? 0 : static_cast<uint32_t>(input.number(2));
    if (object.hasParent == 0) return object;
    object.parent = input.number(before.size() + 1);
    const uint64_t room = object.parent < before.size() ? before[object.parent].length : 8;
    object.parentOffset = near(input, input.number(2) == 0 ? 0 : room - 8, 8);
    return object;
}

} // namespace

/** A call with some texts, as its proxy writes it. */
Bytes frameOf(uint32_t code, uint32_t flags, const std::vector<std::string>& texts) {
    const std::vector<hidl_string> arguments(texts.begin(), texts.end());
    Parcel parcel;
    parcel.writeInterfaceToken(IWifiService::descriptor);
    for (const hidl_string& text : arguments) writeText(text, &parcel);
    FrameHeader header;
    header.code = code;
    header.flags = flags;
    const Bytes payload = payloadOf(parcel, &header).value();
    return joined(header, payload);
}

/** Any call, patched or not. */
Bytes readFrame(Input& input) {
    const auto code = static_cast<uint32_t>(input.number(18));
    const uint32_t flags[] = {0, 0, 0, FrameHeader::kOneway, FrameHeader::kReply};
    std::vector<std::string> texts(input.number(7));
    const uint32_t chosen = input.oneOf(flags);
    for (std::string& text : texts) text = input.text();
    Bytes frame = frameOf(code, chosen, texts);
    patch(input, frame);
    return frame;
}

Bytes readLayout(Input& input) {
    FrameHeader header;
    header.dataSize = static_cast<uint32_t>(input.number(256));
    std::vector<BufferObject> objects;
    std::vector<uint32_t> offsets;
    uint64_t free = 0;
    for (size_t count = input.number(5); count > 0; --count) {
        const uint64_t last = header.dataSize - sizeof(BufferObject);
        offsets.push_back(
                static_cast<uint32_t>(near(input, input.number(2) == 0 ? free : last, 8)));
        free = offsets.back() + sizeof(BufferObject);
        objects.push_back(readObject(input, objects));
        if (objects.back().buffer != 0) header.bufferSize += padded(objects.back().length);
    }
    header.objectCount = static_cast<uint32_t>(objects.size());
    if (input.number(8) == 7) header.bufferSize += 8;

    Bytes payload(header.payloadSize());
    const size_t table = padded(header.dataSize);
    for (size_t i = 0; i < objects.size(); ++i) {
        // Where the frame has room for them: the rules are asked what they make of it.
        if (offsets[i] + sizeof(BufferObject) <= payload.size()) {
            memcpy(payload.data() + offsets[i], &objects[i], sizeof(BufferObject));
        }
    }
    if (!offsets.empty()) memcpy(payload.data() + table, offsets.data(), 4 * offsets.size());
    return joined(header, payload);
}

bool keepsTheRules(const Bytes& frame) {
    if (frame.size() < sizeof(FrameHeader)) return false;
    const auto header = at<FrameHeader>(frame, 0);
    const uint64_t count = header.objectCount;
    const uint64_t table = sizeof(header) + padded(header.dataSize);
    const uint64_t buffers = table + padded(4 * count);
    if (header.magic != FrameHeader::kMagic || header.reserved != 0 || header.flags > 3)
        return false;
    if (header.bufferSize % 8 != 0 || frame.size() != buffers + header.bufferSize) return false;
    if (padded(header.dataSize) + 8 * count + header.bufferSize >
        android::hardware::host::kTransactionBufferSize) {
        return false;
    }
    uint64_t free = 0;
    uint64_t carried = 0;
    std::vector<uint64_t> rooms;
    std::map<uint64_t, uint64_t> open;
    for (size_t i = 0; i < count; ++i) {
        const uint64_t offset = at<uint32_t>(frame, table + 4 * i);
        if (offset % 4 != 0 || offset < free) return false;
        free = offset + sizeof(BufferObject);
        if (free > header.dataSize) return false;
        const auto object = at<BufferObject>(frame, sizeof(header) + offset);
        if (object.type != BufferObject::kType || object.hasParent > 1 || object.buffer > 1) {
            return false;
        }
        // A null buffer carries nothing, whatever length it claims.
        const uint64_t length = object.buffer == 0 ? 0 : object.length;
        if (length > header.bufferSize) return false;
        if (object.hasParent == 1) {
            if (object.parent >= rooms.size() || rooms[object.parent] < 8) return false;
            if (object.parentOffset > rooms[object.parent] - 8) return false;
            // Only the last buffer and its ancestors are open, from the last place in them on.
            if (open.count(object.parent) == 0) return false;
            if (object.parentOffset < open[object.parent]) return false;
            open.erase(open.upper_bound(object.parent), open.end());
            open[object.parent] = object.parentOffset + 8;
        } else {
            open.clear();
        }
        open[i] = 0;
        rooms.push_back(length);
        carried += padded(length);
    }
    return carried == header.bufferSize;
}

} // namespace fuzz
