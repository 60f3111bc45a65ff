// Copyright 2026 The BEX Wi-Fi Authors
// SPDX-License-Identifier: Apache-2.0

#pragma once

#include <cutils/native_handle.h>
#include <hidl/HidlInternal.h>
#include <hidl/Status.h>
#include <utils/Errors.h>
#include <utils/RefBase.h>
#include <utils/StrongPointer.h>

#include <algorithm>
#include <array>
#include <cstddef>
#include <cstdint>
#include <string>
#include <type_traits>
#include <utility>
#include <vector>

namespace android::hidl::base::V1_0 {
struct IBase;
}

namespace android::hardware {

/** Receives the notice that the process behind an interface has died. See IBase::linkToDeath(). */
struct hidl_death_recipient : public virtual RefBase {
    virtual void serviceDied(uint64_t cookie, const wp<hidl::base::V1_0::IBase>& who) = 0;
};

/**
 * Text as HIDL carries it: 16 bytes in memory and on the wire, always NUL-terminated, with a size
 * (so that it may contain NULs). Owns its bytes unless it borrows them with setToExternal(); what
 * is received in a call is borrowed from the call's buffer.
 *
 *     hidl_string channel = "36";
 *     std::string copy = channel;
 */
class hidl_string {
  public:
    hidl_string();
    ~hidl_string();
    hidl_string(const hidl_string& other);
    hidl_string(hidl_string&& other) noexcept;
    /** The text up to its NUL; a null pointer gives the empty text. */
    hidl_string(const char* text); // NOLINT(google-explicit-constructor)
    /** The first `length` bytes, NULs included. */
    hidl_string(const char* text, size_t length);
    hidl_string(const std::string& text); // NOLINT(google-explicit-constructor)

    hidl_string& operator=(const hidl_string& other);
    hidl_string& operator=(hidl_string&& other) noexcept;
    hidl_string& operator=(const char* text);
    hidl_string& operator=(const std::string& text);

    operator std::string() const; // NOLINT(google-explicit-constructor)

    const char* c_str() const { return mBuffer; }
    size_t size() const { return mSize; }
    bool empty() const { return mSize == 0; }
    void clear();

    /** Borrows bytes that outlive this object. Aborts unless data[size] is NUL. */
    void setToExternal(const char* data, size_t size);

    /** For the reader of a received text: the bytes belong to the call's buffer. */
    void disown() { mOwnsBuffer = false; }

    static constexpr size_t kOffsetOfBuffer = 0;

  private:
    void copyFrom(const char* data, size_t size);
    void moveFrom(hidl_string& other);

    alignas(8) const char* mBuffer;
    uint32_t mSize;
    bool mOwnsBuffer;
    // Explicit padding, so that a call never carries three undefined bytes to another process.
    uint8_t mPad[3] = {};
};
static_assert(sizeof(hidl_string) == 16, "the wire carries 16 bytes");

// Comparisons read both sides as C strings, up to the first NUL.
bool operator==(const hidl_string& left, const hidl_string& right);
bool operator==(const hidl_string& left, const char* right);
bool operator==(const char* left, const hidl_string& right);
bool operator!=(const hidl_string& left, const hidl_string& right);
bool operator!=(const hidl_string& left, const char* right);
bool operator!=(const char* left, const hidl_string& right);
bool operator<(const hidl_string& left, const hidl_string& right);

std::ostream& operator<<(std::ostream& out, const hidl_string& text);

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
        if (size > UINT32_MAX) details::logAlwaysFatal("hidl_vec too long");
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

/** A file handle in an argument list. Never owns the handle here: no handle crosses processes. */
struct hidl_handle {
    hidl_handle() = default;
    hidl_handle(const native_handle_t* handle) : mHandle(handle) {} // NOLINT

    operator const native_handle_t*() const { return mHandle; } // NOLINT
    const native_handle_t* getNativeHandle() const { return mHandle; }

  private:
    alignas(8) const native_handle_t* mHandle = nullptr;
    uint64_t mPad = 0;
};

/** A shared memory block; only its layout is known here. */
struct hidl_memory {
    hidl_handle handle;
    alignas(8) uint64_t size = 0;
    hidl_string name;
};

/** The type that a bit set of the enumeration is carried in. */
template <typename Enum>
using hidl_bitfield = std::underlying_type_t<Enum>;

template <typename T, std::enable_if_t<std::is_arithmetic_v<T>, int> = 0>
std::string toString(T value) {
    return std::to_string(value);
}
std::string toString(const hidl_string& text);

namespace details {

/** "0x" and the number in lower-case hexadecimal. */
std::string toHexString(uint64_t value);

template <typename>
inline constexpr std::array<int, 0> hidl_enum_values = {};

} // namespace details
} // namespace android::hardware
