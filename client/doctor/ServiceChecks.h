// Copyright 2026 The BEX Wi-Fi Authors
// SPDX-License-Identifier: Apache-2.0

#pragma once

#include "client/doctor/Doctor.h"

namespace vendor::korvan::bex::wifi::client {

/**
 * Checks what VINTF says about the service, whether it runs, and whether it is the one that this
 * client was built for.
 *
 * @param timeout As for examine().
 */
Checks checkService(const FindService& tryFind, const PhoneView& phone,
                    std::chrono::nanoseconds timeout);

} // namespace vendor::korvan::bex::wifi::client
