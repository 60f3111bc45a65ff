// Copyright 2026 The BEX Wi-Fi Authors
// SPDX-License-Identifier: Apache-2.0

#pragma once

#include <log/log.h>

#include <algorithm>
#include <array>
#include <cstddef>
#include <cstdint>
#include <cstring>
#include <initializer_list>
#include <limits>
#include <utility>
#include <vector>

namespace android::hardware {

/** A sequence as HIDL carries it: 16 bytes that own, or in a received call borrow, the elements. */
template <typename T>
class hidl_vec {
  public:
    using value_type = T;

    hidl_vec() = default;
    hidl_vec(const hidl_vec& other) { copyFrom(other.begin(), other.end()); }
    hidl_vec(hidl_vec&& other) noexcept { swap(other); }
    hidl_vec(std::initializer_list<T> list) { copyFrom(list.begin(), list.end()); }
    hidl_vec(const std::vector<T>& other) { // NOLINT(google-explicit-constructor)
        copyFrom(other.begin(), other.end());
    }
    ~hidl_vec() { free(); }

    hidl_vec& operator=(const hidl_vec& other) {
        hidl_vec copy(other);
        swap(copy);
        return *this;
    }
    hidl_vec& operator=(hidl_vec&& other) noexcept {
        hidl_vec taken(std::move(other));
        swap(taken);
        return *this;
    }

    operator std::vector<T>() const { // NOLINT(google-explicit-constructor)
        return std::vector<T>(begin(), end());
    }

    size_t size() const { return mSize; }
    T* data() { return mBuffer; }
    const T* data() const { return mBuffer; }
    T& operator[](size_t index) { return mBuffer[index]; }
    const T& operator[](size_t index) const { return mBuffer[index]; }
    T* begin() { return mBuffer; }
    T* end() { return mBuffer + mSize; }
    const T* begin() const { return mBuffer; }
    const T* end() const { return mBuffer + mSize; }

    /** Keeps the leading elements, value-initialises the new ones. */
    void resize(size_t size) {
        hidl_vec larger;
        larger.allocate(size);
        std::move(begin(), begin() + std::min<size_t>(size, mSize), larger.begin());
        swap(larger);
    }

    /** For the reader of a received sequence: the elements belong to the call's buffer. */
    void disown() { mOwnsBuffer = false; }

    static constexpr size_t kOffsetOfBuffer = 0;

  private:
    void allocate(size_t size) {
        LOG_ALWAYS_FATAL_IF(size > std::numeric_limits<uint32_t>::max(), "hidl_vec too long");
        mBuffer = size == 0 ? nullptr : new T[size]();
        mSize = static_cast<uint32_t>(size);
        mOwnsBuffer = true;
    }
    template <typename Iterator>
    void copyFrom(Iterator first, Iterator last) {
        allocate(static_cast<size_t>(std::distance(first, last)));
        std::copy(first, last, begin());
    }
    void free() {
        if (mOwnsBuffer) delete[] mBuffer;
    }
    void swap(hidl_vec& other) noexcept {
        std::swap(mBuffer, other.mBuffer);
        std::swap(mSize, other.mSize);
        std::swap(mOwnsBuffer, other.mOwnsBuffer);
    }

    alignas(8) T* mBuffer = nullptr;
    uint32_t mSize = 0;
    bool mOwnsBuffer = true;
    uint8_t mPad[3] = {};
};

template <typename T>
bool operator==(const hidl_vec<T>& left, const hidl_vec<T>& right) {
    return std::equal(left.begin(), left.end(), right.begin(), right.end());
}

/** A one-dimensional array, carried inline. */
template <typename T, size_t SIZE>
class hidl_array {
  public:
    hidl_array() = default;
    hidl_array(const T (&source)[SIZE]) { // NOLINT(google-explicit-constructor)
        std::copy(source, source + SIZE, mBuffer);
    }
    hidl_array(const std::array<T, SIZE>& source) { // NOLINT(google-explicit-constructor)
        std::copy(source.begin(), source.end(), mBuffer);
    }

    T* data() { return mBuffer; }
    const T* data() const { return mBuffer; }
    T& operator[](size_t index) { return mBuffer[index]; }
    const T& operator[](size_t index) const { return mBuffer[index]; }
    static constexpr size_t size() { return SIZE; }

    bool operator==(const hidl_array& other) const {
        return std::equal(mBuffer, mBuffer + SIZE, other.mBuffer);
    }

  private:
    T mBuffer[SIZE] = {};
};

} // namespace android::hardware
