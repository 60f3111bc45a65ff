// Copyright 2026 The BEX Wi-Fi Authors
// SPDX-License-Identifier: Apache-2.0

#pragma once

#include <android/hidl/base/1.0/IBase.h>

namespace android::hidl::manager::V1_0 {

/** Would be notified of registrations; see IServiceManager. */
struct IServiceNotification : public base::V1_0::IBase {};

} // namespace android::hidl::manager::V1_0
