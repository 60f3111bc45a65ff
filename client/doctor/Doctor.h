// Copyright 2026 The BEX Wi-Fi Authors
// SPDX-License-Identifier: Apache-2.0

#pragma once

#include <android/hidl/manager/1.0/IServiceManager.h>
#include <hidl/ServiceManagement.h>

#include <chrono>
#include <functional>
#include <string>

#include "client/base/Service.h"
#include "client/doctor/Check.h"

// `bex-wifi-client doctor`: which of the things that keep a client from using the service can be
// seen from where the client runs.

namespace vendor::korvan::bex::wifi::client {

/** Where the doctor looks; what stands here is the phone that it runs on. */
struct PhoneView {
    std::function<::android::sp<::android::hidl::manager::V1_0::IServiceManager>()> serviceManager =
            ::android::hardware::defaultServiceManager;
    /** What every path begins with; only a test has it other than empty. */
    std::string root;
};

/**
 * Makes all checks, in the order in which problems are to be mended.
 *
 * Returns at the latest when the timeout has passed, and the time that the files take. A question
 * that is not answered by then leaves a thread behind, as a late call does (see base/Worker.h).
 *
 * @param timeout The time for the service manager and the service, together.
 */
Checks examine(const FindService& tryFind, const PhoneView& phone,
               std::chrono::nanoseconds timeout);

} // namespace vendor::korvan::bex::wifi::client
