// Copyright 2026 The BEX Wi-Fi Authors
// SPDX-License-Identifier: Apache-2.0

#pragma once

#include <hidl/HidlSupport.h>
#include <hwbinder/Parcel.h>

#include <cstdint>
#include <optional>
#include <string>
#include <vector>

#include "host/src/Frame.h"
#include "tests/fuzz/Input.h"

namespace fuzz {

using Bytes = std::vector<uint8_t>;

/** A parcel's payload as it travels; nothing when it cannot be carried. Fills the header's sizes.
 */
std::optional<Bytes> payloadOf(const android::hardware::Parcel& parcel,
                               android::hardware::host::FrameHeader* header);

/** The parcel that a receiver makes of a payload; false when it is malformed. */
bool receive(const android::hardware::host::FrameHeader& header, const Bytes& payload,
             android::hardware::Parcel* parcel);

/** Writes 32 bits over the bytes at some offset, up to three times, as the input says. */
void patch(Input& input, Bytes& bytes);

/** Writes a text as a proxy does. The text must outlive the parcel. */
void writeText(const android::hardware::hidl_string& text, android::hardware::Parcel* parcel);

/** Reads a text as a proxy does; nothing when there is none. */
std::optional<std::string> readText(const android::hardware::Parcel& parcel);

} // namespace fuzz
