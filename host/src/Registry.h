// Copyright 2026 The BEX Wi-Fi Authors
// SPDX-License-Identifier: Apache-2.0

#pragma once

#include <android/hidl/base/1.0/IBase.h>
#include <hwbinder/Binder.h>

#include <cstdint>
#include <map>
#include <mutex>
#include <string>

#include "host/src/SocketFile.h"

namespace android::hardware::host {

/** The instances that this process has registered. */
class Registry {
  public:
    static Registry& get();

    /**
     * Makes a local object reachable at the path, in place of what was there before. The engine
     * serves it from then on.
     */
    status_t add(const std::string& path, const sp<hidl::base::V1_0::IBase>& object,
                 const sp<BHwBinder>& stub);

    /** The object whose socket this is, null when it is another process's. */
    sp<hidl::base::V1_0::IBase> find(const FileIdentity& socket);

  private:
    struct Entry {
        uint64_t listener = 0;
        FileIdentity socket;
        sp<hidl::base::V1_0::IBase> object;
    };

    std::mutex mMutex;
    std::map<std::string, Entry> mEntries;
};

} // namespace android::hardware::host
