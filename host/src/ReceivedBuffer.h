// Copyright 2026 The BEX Wi-Fi Authors
// SPDX-License-Identifier: Apache-2.0

#pragma once

#include <cstdint>
#include <memory>

#include "host/src/TransactionBuffer.h"

namespace android::hardware::host {

/** What a received parcel reads from: its data and its buffers in one block. */
struct ReceivedBuffer {
    std::unique_ptr<uint8_t[]> bytes;
    Reservation reservation;
};

} // namespace android::hardware::host
