// Copyright 2026 The BEX Wi-Fi Authors
// SPDX-License-Identifier: Apache-2.0

#pragma once

#include <cstddef>
#include <cstdint>
#include <ostream>
#include <string>

namespace android::hardware {

/**
 * Text as HIDL carries it: 16 bytes in memory and on the wire, always NUL-terminated, its size
 * counted (so that NULs may stand inside). Owns its bytes unless it borrows them with
 * setToExternal(); what is received in a call is borrowed from the call's buffer.
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
    // Named, so that a call never carries three undefined bytes to another process.
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

} // namespace android::hardware
