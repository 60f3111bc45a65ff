// Copyright 2026 The BEX Wi-Fi Authors
// SPDX-License-Identifier: Apache-2.0

#include "tests/fuzz/Wire.h"

#include <hidl/HidlBinderSupport.h>

#include <cstring>
#include <utility>

#include "host/src/ReceivedBuffer.h"

namespace fuzz {

using android::OK;
using android::hardware::hidl_string;
using android::hardware::Parcel;
using android::hardware::host::FrameHeader;
using android::hardware::host::ParcelAccess;
using android::hardware::host::ReceivedBuffer;
using android::hardware::host::Reservation;

std::optional<Bytes> payloadOf(const Parcel& parcel, FrameHeader* header) {
    if (ParcelAccess::measure(parcel, header) != OK) return {};
    Bytes payload(header->payloadSize());
    if (payload.empty()) return payload; // has no memory to write to
    ParcelAccess::serialise(parcel, *header, payload.data());
    return payload;
}

bool receive(const FrameHeader& header, const Bytes& payload, Parcel* parcel) {
    ReceivedBuffer received;
    received.reservation = Reservation(header.accountedSize());
    // To the byte: a reader that goes beyond it is found.
    received.bytes.reset(new uint8_t[payload.size()]);
    if (!payload.empty()) memcpy(received.bytes.get(), payload.data(), payload.size());
    return ParcelAccess::adopt(header, std::move(received), parcel);
}

void patch(Input& input, Bytes& bytes) {
    for (size_t count = input.number(4); count > 0; --count) {
        const uint32_t values[] = {0, 1, 0xffffffff, input.word()};
        const uint32_t value = input.oneOf(values);
        if (bytes.size() < sizeof(value)) return;
        memcpy(&bytes[input.word() % (bytes.size() - 3)], &value, sizeof(value));
    }
}

void writeText(const hidl_string& text, Parcel* parcel) {
    size_t parent;
    parcel->writeBuffer(&text, sizeof(text), &parent);
    writeEmbeddedToParcel(text, parcel, parent, 0);
}

std::optional<std::string> readText(const Parcel& parcel) {
    size_t parent;
    const void* buffer;
    if (parcel.readBuffer(sizeof(hidl_string), &parent, &buffer) != OK) return {};
    auto& text = *static_cast<hidl_string*>(const_cast<void*>(buffer));
    if (readEmbeddedFromParcel(text, parcel, parent, 0) != OK) return {};
    return text;
}

} // namespace fuzz
