// Copyright 2026 The BEX Wi-Fi Authors
// SPDX-License-Identifier: Apache-2.0

#pragma once

#include <android/hidl/base/1.0/IBase.h>
#include <android/hidl/manager/1.0/IServiceNotification.h>
#include <hidl/Status.h>

#include <cstdint>

namespace android::hidl::manager::V1_0 {

/** The part of the service manager that generated code and clients name. */
struct IServiceManager : public base::V1_0::IBase {
    /** How a declared instance is reached. */
    enum class Transport : uint8_t {
        /** It is not declared. */
        EMPTY = 0,
        HWBINDER,
        PASSTHROUGH,
    };

    /** What the VINTF manifest says about an instance. */
    virtual hardware::Return<Transport> getTransport(const hardware::hidl_string& fqName,
                                                     const hardware::hidl_string& name) = 0;

    /** There are no notifications on a host: always false. */
    virtual hardware::Return<bool> registerForNotifications(
            const hardware::hidl_string& fqName, const hardware::hidl_string& name,
            const sp<IServiceNotification>& callback) = 0;
};

} // namespace android::hidl::manager::V1_0
