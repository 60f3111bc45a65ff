// Copyright 2026 The BEX Wi-Fi Authors
// SPDX-License-Identifier: Apache-2.0

#include <hwbinder/Parcel.h>

#include <cstring>

#include "host/src/BufferObject.h"
#include "host/src/ReceivedBuffer.h"

namespace android::hardware {
namespace {

constexpr size_t pad4(size_t size) {
    return (size + 3) & ~size_t{3};
}

} // namespace

Parcel::Parcel() = default;
Parcel::~Parcel() = default;

status_t Parcel::writeInterfaceToken(const char* interface) {
    return writeCString(interface);
}

bool Parcel::enforceInterface(const char* interface) const {
    const char* token = readCString();
    return token != nullptr && strcmp(token, interface) == 0;
}

status_t Parcel::write(const void* data, size_t length) {
    if (mReceived) return INVALID_OPERATION;
    if (mData.empty()) mData.reserve(host::kUsualDataSize);
    const auto* bytes = static_cast<const uint8_t*>(data);
    mData.insert(mData.end(), bytes, bytes + length);
    mData.resize(pad4(mData.size()));
    return OK;
}

// Small integers take a whole unit, as a C++ int does.
status_t Parcel::writeInt8(int8_t value) {
    return writeInt32(value);
}
status_t Parcel::writeInt32(int32_t value) {
    return write(&value, sizeof(value));
}
status_t Parcel::writeUint32(uint32_t value) {
    return write(&value, sizeof(value));
}
status_t Parcel::writeInt64(int64_t value) {
    return write(&value, sizeof(value));
}
status_t Parcel::writeUint64(uint64_t value) {
    return write(&value, sizeof(value));
}
status_t Parcel::writeBool(bool value) {
    return writeInt8(value ? 1 : 0);
}
status_t Parcel::writeCString(const char* text) {
    return write(text, strlen(text) + 1);
}

template <typename T>
status_t Parcel::readAligned(T* value) const {
    if (mPosition > dataSize() || dataSize() - mPosition < sizeof(T)) return NOT_ENOUGH_DATA;
    memcpy(value, data() + mPosition, sizeof(T));
    mPosition += pad4(sizeof(T));
    return OK;
}

status_t Parcel::readInt8(int8_t* value) const {
    return readAligned(value);
}
status_t Parcel::readInt32(int32_t* value) const {
    return readAligned(value);
}
status_t Parcel::readUint32(uint32_t* value) const {
    return readAligned(value);
}
status_t Parcel::readInt64(int64_t* value) const {
    return readAligned(value);
}
status_t Parcel::readUint64(uint64_t* value) const {
    return readAligned(value);
}
status_t Parcel::readBool(bool* value) const {
    int8_t byte = 0;
    status_t result = readInt8(&byte);
    *value = byte != 0;
    return result;
}

const char* Parcel::readCString() const {
    if (mPosition >= dataSize()) return nullptr;
    const char* text = reinterpret_cast<const char*>(data() + mPosition);
    const void* end = memchr(text, '\0', dataSize() - mPosition);
    if (end == nullptr) return nullptr;
    mPosition += pad4(static_cast<const char*>(end) - text + 1);
    return text;
}

status_t Parcel::writeBuffer(const void* buffer, size_t length, size_t* handle) {
    return writeObject(buffer, length, handle, false, 0, 0);
}

status_t Parcel::writeEmbeddedBuffer(const void* buffer, size_t length, size_t* handle,
                                     size_t parentHandle, size_t parentOffset) {
    if (parentHandle >= mObjects.size()) return BAD_VALUE;
    const host::BufferObject parent = host::objectAt(mData.data(), mObjects[parentHandle]);
    if (parent.length < sizeof(uint64_t)) return BAD_VALUE;
    if (parentOffset > parent.length - sizeof(uint64_t)) return BAD_VALUE;
    return writeObject(buffer, length, handle, true, parentHandle, parentOffset);
}

status_t Parcel::writeObject(const void* buffer, size_t length, size_t* handle, bool hasParent,
                             size_t parentHandle, size_t parentOffset) {
    host::BufferObject object;
    object.hasParent = hasParent ? 1 : 0;
    object.buffer = reinterpret_cast<uintptr_t>(buffer);
    object.length = length;
    object.parent = parentHandle;
    object.parentOffset = parentOffset;
    const size_t offset = mData.size();
    status_t result = write(&object, sizeof(object));
    if (result != OK) return result;
    if (mObjects.empty()) mObjects.reserve(host::kUsualObjectCount);
    *handle = mObjects.size();
    mObjects.push_back(static_cast<uint32_t>(offset));
    return OK;
}

status_t Parcel::readBuffer(size_t size, size_t* handle, const void** buffer) const {
    status_t result = readObject(size, handle, false, 0, 0, buffer);
    return result == OK && *buffer == nullptr ? UNEXPECTED_NULL : result;
}

status_t Parcel::readEmbeddedBuffer(size_t size, size_t* handle, size_t parentHandle,
                                    size_t parentOffset, const void** buffer) const {
    status_t result = readObject(size, handle, true, parentHandle, parentOffset, buffer);
    return result == OK && *buffer == nullptr ? UNEXPECTED_NULL : result;
}

status_t Parcel::readNullableEmbeddedBuffer(size_t size, size_t* handle, size_t parentHandle,
                                            size_t parentOffset, const void** buffer) const {
    status_t result = readObject(size, handle, true, parentHandle, parentOffset, buffer);
    return result == OK && *buffer == nullptr && size != 0 ? BAD_VALUE : result;
}

status_t Parcel::readObject(size_t size, size_t* handle, bool hasParent, size_t parentHandle,
                            size_t parentOffset, const void** buffer) const {
    // Objects are read in order, though plain data between them may have been skipped.
    while (mNextObject < mObjects.size() && mObjects[mNextObject] < mPosition) ++mNextObject;
    if (mNextObject == mObjects.size() || mObjects[mNextObject] != mPosition) return BAD_VALUE;

    const host::BufferObject object = host::objectAt(data(), mObjects[mNextObject]);
    if (object.length != size || (object.hasParent != 0) != hasParent) return BAD_VALUE;
    if (hasParent) {
        if (object.parent != parentHandle || object.parentOffset != parentOffset) return BAD_VALUE;
        // Two buffers may claim the same place in the parent: the pointer there must be this one's.
        const host::BufferObject parent = host::objectAt(data(), mObjects[parentHandle]);
        uint64_t pointer;
        memcpy(&pointer, reinterpret_cast<const uint8_t*>(parent.buffer) + parentOffset,
               sizeof(pointer));
        if (pointer != object.buffer) return BAD_VALUE;
    }
    *handle = mNextObject;
    *buffer = reinterpret_cast<const void*>(object.buffer);
    mPosition += sizeof(object);
    ++mNextObject;
    return OK;
}

status_t Parcel::writeNativeHandleNoDup(const native_handle_t* handle) {
    return handle == nullptr ? writeUint64(0) : static_cast<status_t>(FDS_NOT_ALLOWED);
}

status_t Parcel::readNullableNativeHandleNoDup(const native_handle_t** handle) const {
    uint64_t size;
    status_t result = readUint64(&size);
    if (result == OK && size != 0) result = BAD_VALUE;
    *handle = nullptr;
    return result;
}

} // namespace android::hardware
