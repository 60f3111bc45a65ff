// Copyright 2026 The BEX Wi-Fi Authors
// SPDX-License-Identifier: Apache-2.0

#pragma once

#include <android/hidl/base/1.0/IBase.h>
#include <android/hidl/manager/1.0/IServiceNotification.h>
#include <hidl/Status.h>

#include <string>

namespace android::hidl::manager::V1_0 {

/** The part of the service manager that generated code names. A host has none of its kind. */
struct IServiceManager : public base::V1_0::IBase {
    virtual hardware::Return<bool> registerForNotifications(
            const hardware::hidl_string& fqName, const hardware::hidl_string& name,
            const sp<IServiceNotification>& callback) = 0;
};

} // namespace android::hidl::manager::V1_0
