// Copyright 2026 The BEX Wi-Fi Authors
// SPDX-License-Identifier: Apache-2.0

#pragma once

#include <cstddef>
#include <utility>

namespace android::hardware::host {

/**
 * The bytes that the calls and replies in progress may occupy in one process, together: 1 MiB less
 * two pages, as a phone's driver maps for each process.
 */
constexpr size_t kTransactionBufferSize = 1024 * 1024 - 2 * 4096;

/** A share of this process's transaction buffer, given back when the object goes. */
class Reservation {
  public:
    Reservation() = default;
    /** Takes `size` bytes. The object is false when fewer were left. */
    explicit Reservation(size_t size);
    Reservation(Reservation&& other) noexcept
          : mSize(std::exchange(other.mSize, 0)), mTaken(std::exchange(other.mTaken, false)) {}
    Reservation& operator=(Reservation&& other) noexcept {
        std::swap(mSize, other.mSize);
        std::swap(mTaken, other.mTaken);
        return *this;
    }
    ~Reservation() { release(); }

    explicit operator bool() const { return mTaken; }
    void release();

  private:
    size_t mSize = 0;
    bool mTaken = false;
};

} // namespace android::hardware::host
