// Copyright 2026 The BEX Wi-Fi Authors
// SPDX-License-Identifier: Apache-2.0

#pragma once

#include <cutils/native_handle.h>
#include <hwbinder/IInterface.h>
#include <utils/Errors.h>

#include <cstddef>
#include <cstdint>
#include <memory>
#include <vector>

namespace android::hardware {

namespace host {
struct ParcelAccess;
struct ReceivedBuffer;
} // namespace host

/**
 * The arguments or results of one call: flat data in units of 4 bytes, and buffers. A buffer is an
 * object in the data that refers to memory of the writer, copied when the call is carried; one with
 * a parent also says where in the parent's memory the pointer to it is, so that the receiver gets
 * the same structure. Reading follows the order of writing.
 *
 *     parcel.writeInterfaceToken(IWifiService::descriptor);
 *     parcel.writeBuffer(&text, sizeof(text), &handle);
 *     parcel.writeEmbeddedBuffer(text.c_str(), text.size() + 1, &child, handle, 0);
 *
 * A read returns NOT_ENOUGH_DATA past the end of the data, BAD_VALUE where the next thing is not
 * the buffer that the reader expects, and UNEXPECTED_NULL where it is null.
 */
class Parcel {
  public:
    Parcel();
    ~Parcel();
    Parcel(const Parcel&) = delete;
    Parcel& operator=(const Parcel&) = delete;

    /** The interface's name, which leads every call. */
    status_t writeInterfaceToken(const char* interface);
    /** Reads it. */
    bool enforceInterface(const char* interface) const;

    /** Raw bytes, padded with zeros to a multiple of 4. */
    status_t write(const void* data, size_t length);
    status_t writeInt8(int8_t value);
    status_t writeInt32(int32_t value);
    status_t writeUint32(uint32_t value);
    status_t writeInt64(int64_t value);
    status_t writeUint64(uint64_t value);
    status_t writeBool(bool value);
    status_t writeCString(const char* text);

    status_t readInt8(int8_t* value) const;
    status_t readInt32(int32_t* value) const;
    status_t readUint32(uint32_t* value) const;
    status_t readInt64(int64_t* value) const;
    status_t readUint64(uint64_t* value) const;
    /** Anything but 0 is true. */
    status_t readBool(bool* value) const;
    /** The text up to its NUL, null when there is none. Lives as long as the parcel. */
    const char* readCString() const;

    status_t writeBuffer(const void* buffer, size_t length, size_t* handle);
    /** BAD_VALUE unless the parent has room for the pointer there. */
    status_t writeEmbeddedBuffer(const void* buffer, size_t length, size_t* handle,
                                 size_t parentHandle, size_t parentOffset);

    /** The next buffer, which must have this size and no parent. */
    status_t readBuffer(size_t size, size_t* handle, const void** buffer) const;
    /** The next buffer, which must have this size and this parent. */
    status_t readEmbeddedBuffer(size_t size, size_t* handle, size_t parentHandle,
                                size_t parentOffset, const void** buffer) const;
    /** The same, and null is fine for a size of 0. */
    status_t readNullableEmbeddedBuffer(size_t size, size_t* handle, size_t parentHandle,
                                        size_t parentOffset, const void** buffer) const;

    /** No handle crosses processes here: FDS_NOT_ALLOWED unless it is null. */
    status_t writeNativeHandleNoDup(const native_handle_t* handle);
    status_t readNullableNativeHandleNoDup(const native_handle_t** handle) const;

    size_t dataSize() const { return mReceived ? mReceivedSize : mData.size(); }
    size_t dataPosition() const { return mPosition; }
    void setDataPosition(size_t position) const { mPosition = position; }

  private:
    friend struct host::ParcelAccess;

    const uint8_t* data() const { return mReceived ? mReceivedData : mData.data(); }
    template <typename T>
    status_t readAligned(T* value) const;
    status_t writeObject(const void* buffer, size_t length, size_t* handle, bool hasParent,
                         size_t parentHandle, size_t parentOffset);
    status_t readObject(size_t size, size_t* handle, bool hasParent, size_t parentHandle,
                        size_t parentOffset, const void** buffer) const;

    std::vector<uint8_t> mData;
    // The places of the buffer objects in the data, ascending. A handle is an index into it.
    std::vector<uint32_t> mObjects;
    mutable size_t mPosition = 0;
    mutable size_t mNextObject = 0;

    // A received parcel reads from the transport's buffer instead of mData.
    std::unique_ptr<host::ReceivedBuffer> mReceived;
    const uint8_t* mReceivedData = nullptr;
    size_t mReceivedSize = 0;
};

} // namespace android::hardware
