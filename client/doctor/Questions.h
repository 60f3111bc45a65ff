// Copyright 2026 The BEX Wi-Fi Authors
// SPDX-License-Identifier: Apache-2.0

#pragma once

#include <android/hidl/manager/1.0/IServiceManager.h>

#include <string>

#include "client/base/Service.h"

// What the doctor asks the service manager and the service. All except ownHash() may block for
// ever, so ask each on a worker thread (see base/Worker.h).

namespace vendor::korvan::bex::wifi::client {

using Transport = ::android::hidl::manager::V1_0::IServiceManager::Transport;

constexpr char kInstance[] = "default";

/** The result of one transaction. */
template <typename Value>
struct Reply {
    /** Why there is no value; empty when there is one. */
    std::string error;
    Value value{};
};

/** The bytes of an interface's own hash; empty when there is none. */
using Hash = std::string;

/** How the VINTF manifest lets clients reach the service. */
Reply<Transport> declaredTransport(
        const ::android::sp<::android::hidl::manager::V1_0::IServiceManager>& manager);

/** Pings the service: an empty text when it answers, otherwise the reason why not. */
std::string pingError(const ::android::sp<IWifiService>& service);

/** The hash that the service was built with. */
Reply<Hash> servedHash(const ::android::sp<IWifiService>& service);

/** The hash that this client was built with. */
Hash ownHash(const ::android::sp<IWifiService>& service);

/** The service's process id, -1 when the build keeps it private. */
Reply<int> servedPid(const ::android::sp<IWifiService>& service);

} // namespace vendor::korvan::bex::wifi::client
