// Copyright 2026 The BEX Wi-Fi Authors
// SPDX-License-Identifier: Apache-2.0

#pragma once

#include <android-base/unique_fd.h>

#include <chrono>

namespace android::hardware::host {

/**
 * Notices registrations from its construction on, so that one between a lookup and a wait is not
 * lost.
 */
class RegistrationWatch {
  public:
    RegistrationWatch();
    ~RegistrationWatch();
    RegistrationWatch(const RegistrationWatch&) = delete;
    RegistrationWatch& operator=(const RegistrationWatch&) = delete;
    /** Returns after a registration, with true, or when the time has passed, with false. */
    bool wait(std::chrono::milliseconds timeout);

  private:
    base::unique_fd mNotices;
};

} // namespace android::hardware::host
