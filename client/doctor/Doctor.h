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

// `bex-wifi-client doctor`: looks for what keeps a client from using the service, as far as the
// client can see it.

namespace vendor::korvan::bex::wifi::client {

/** Where the doctor looks; the defaults are the phone that it runs on. */
struct PhoneView {
    std::function<::android::sp<::android::hidl::manager::V1_0::IServiceManager>()> serviceManager =
            ::android::hardware::defaultServiceManager;
    /** The beginning of every path; only a test sets it. */
    std::string root;
};

/**
 * Makes all checks, in the order in which problems should be solved.
 *
 * Takes at most the timeout and the time for reading files. A question that has no answer by then
 * leaves its thread running, as a late call does (see base/Worker.h).
 *
 * @param timeout The time for the service manager and the service, together.
 */
Checks examine(const FindService& tryFind, const PhoneView& phone,
               std::chrono::nanoseconds timeout);

} // namespace vendor::korvan::bex::wifi::client
