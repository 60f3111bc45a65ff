// Copyright 2026 The BEX Wi-Fi Authors
// SPDX-License-Identifier: Apache-2.0

#include <hidl/HidlSupport.h>
#include <log/log.h>

#include <cstdio>
#include <cstring>
#include <limits>
#include <utility>

namespace android::hardware {

hidl_string::hidl_string() : mBuffer(""), mSize(0), mOwnsBuffer(false) {}

hidl_string::~hidl_string() {
    clear();
}

hidl_string::hidl_string(const hidl_string& other) : hidl_string() {
    copyFrom(other.c_str(), other.size());
}

hidl_string::hidl_string(hidl_string&& other) noexcept : hidl_string() {
    moveFrom(other);
}

hidl_string::hidl_string(const char* text) : hidl_string() {
    if (text != nullptr) copyFrom(text, strlen(text));
}

hidl_string::hidl_string(const char* text, size_t length) : hidl_string() {
    copyFrom(text, length);
}

hidl_string::hidl_string(const std::string& text) : hidl_string() {
    copyFrom(text.c_str(), text.size());
}

hidl_string& hidl_string::operator=(const hidl_string& other) {
    if (this != &other) {
        hidl_string copy(other);
        moveFrom(copy);
    }
    return *this;
}

hidl_string& hidl_string::operator=(hidl_string&& other) noexcept {
    if (this != &other) moveFrom(other);
    return *this;
}

// The text may lie inside this string's own bytes, so the copy is made before they go.
hidl_string& hidl_string::operator=(const char* text) {
    return *this = hidl_string(text);
}

hidl_string& hidl_string::operator=(const std::string& text) {
    return *this = hidl_string(text);
}

hidl_string::operator std::string() const {
    return std::string(mBuffer, mSize);
}

void hidl_string::clear() {
    if (mOwnsBuffer) delete[] mBuffer;
    mBuffer = "";
    mSize = 0;
    mOwnsBuffer = false;
}

void hidl_string::setToExternal(const char* data, size_t size) {
    LOG_ALWAYS_FATAL_IF(size > std::numeric_limits<uint32_t>::max(), "hidl_string too long");
    LOG_ALWAYS_FATAL_IF(data[size] != '\0', "hidl_string without a NUL at its end");
    clear();
    mBuffer = data;
    mSize = static_cast<uint32_t>(size);
}

void hidl_string::copyFrom(const char* data, size_t size) {
    LOG_ALWAYS_FATAL_IF(size >= std::numeric_limits<uint32_t>::max(), "hidl_string too long");
    char* buffer = new char[size + 1];
    memcpy(buffer, data, size);
    buffer[size] = '\0';
    mBuffer = buffer;
    mSize = static_cast<uint32_t>(size);
    mOwnsBuffer = true;
}

void hidl_string::moveFrom(hidl_string& other) {
    clear();
    std::swap(mBuffer, other.mBuffer);
    std::swap(mSize, other.mSize);
    std::swap(mOwnsBuffer, other.mOwnsBuffer);
}

bool operator==(const hidl_string& left, const hidl_string& right) {
    return left == right.c_str();
}
bool operator==(const hidl_string& left, const char* right) {
    return strcmp(left.c_str(), right) == 0;
}
bool operator==(const char* left, const hidl_string& right) {
    return right == left;
}
bool operator!=(const hidl_string& left, const hidl_string& right) {
    return !(left == right);
}
bool operator!=(const hidl_string& left, const char* right) {
    return !(left == right);
}
bool operator!=(const char* left, const hidl_string& right) {
    return !(right == left);
}
bool operator<(const hidl_string& left, const hidl_string& right) {
    return strcmp(left.c_str(), right.c_str()) < 0;
}

std::ostream& operator<<(std::ostream& out, const hidl_string& text) {
    return out << text.c_str();
}

std::string toString(const hidl_string& text) {
    return '"' + std::string(text.c_str()) + '"';
}

namespace details {

void logAlwaysFatal(const char* message) {
    LOG_ALWAYS_FATAL("%s", message);
}

std::string toHexString(uint64_t value) {
    char digits[2 + 16 + 1];
    snprintf(digits, sizeof(digits), "0x%llx", static_cast<unsigned long long>(value));
    return digits;
}

} // namespace details
} // namespace android::hardware
