// Copyright 2026 The BEX Wi-Fi Authors
// SPDX-License-Identifier: Apache-2.0

#pragma once

#include <map>
#include <mutex>

namespace android::hardware {

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

} // namespace android::hardware
