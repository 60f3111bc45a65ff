// Copyright 2026 The BEX Wi-Fi Authors
// SPDX-License-Identifier: Apache-2.0

#include "host/src/TransactionBuffer.h"

#include <atomic>

namespace android::hardware::host {
namespace {

std::atomic<size_t> gUsed{0};

} // namespace

Reservation::Reservation(size_t size) : mSize(size) {
    size_t used = gUsed.load();
    do {
        if (size > kTransactionBufferSize - used) return;
    } while (!gUsed.compare_exchange_weak(used, used + size));
    mTaken = true;
}

void Reservation::release() {
    if (std::exchange(mTaken, false)) gUsed -= mSize;
}

} // namespace android::hardware::host
