// Copyright 2026 The BEX Wi-Fi Authors
// SPDX-License-Identifier: Apache-2.0

#pragma once

#include <cutils/native_handle.h>
#include <hidl/HidlString.h>
#include <hidl/HidlVec.h>
#include <utils/Errors.h>
#include <utils/RefBase.h>
#include <utils/StrongPointer.h>

#include <array>
#include <cstddef>
#include <cstdint>
#include <functional>
#include <map>
#include <mutex>
#include <string>
#include <type_traits>
#include <vector>

namespace android::hidl::base::V1_0 {
struct IBase;
}

namespace android::hardware {

/** Receives the notice that the process behind an interface has died. See IBase::linkToDeath(). */
struct hidl_death_recipient : public virtual RefBase {
    virtual void serviceDied(uint64_t cookie, const wp<hidl::base::V1_0::IBase>& who) = 0;
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

/** A map with a lock: the generated code's static tables. */
template <typename Key, typename Value>
class ConcurrentMap {
  public:
    void set(const Key& key, const Value& value) {
        std::lock_guard<std::mutex> lock(mMutex);
        mMap[key] = value;
    }

    Value get(const Key& key, const Value& fallback) const {
        std::lock_guard<std::mutex> lock(mMutex);
        auto found = mMap.find(key);
        return found == mMap.end() ? fallback : found->second;
    }

    void erase(const Key& key) {
        std::lock_guard<std::mutex> lock(mMutex);
        mMap.erase(key);
    }

    void eraseIfEqual(const Key& key, const Value& value) {
        std::lock_guard<std::mutex> lock(mMutex);
        auto found = mMap.find(key);
        if (found != mMap.end() && found->second == value) mMap.erase(found);
    }

  private:
    mutable std::mutex mMutex;
    std::map<Key, Value> mMap;
};

template <typename T, std::enable_if_t<std::is_arithmetic_v<T>, int> = 0>
std::string toString(T value) {
    return std::to_string(value);
}
std::string toString(const hidl_string& text);

namespace details {

// What kind of class a generated class is.
struct i_tag {};
struct bnhw_tag {};
struct bphw_tag {};
struct bs_tag {};

/** "0x" and the number in lower-case hexadecimal. */
std::string toHexString(uint64_t value);

template <typename>
inline constexpr std::array<int, 0> hidl_enum_values = {};

/** The generated classes' hook for call tracing, which debuggable builds of a phone use. */
class HidlInstrumentor {
  public:
    HidlInstrumentor(const std::string& /*package*/, const std::string& /*interface*/) {}
    virtual ~HidlInstrumentor() = default;
    void configureInstrumentation(bool /*log*/ = true) {}
};

} // namespace details
} // namespace android::hardware
