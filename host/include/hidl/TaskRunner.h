// Copyright 2026 The BEX Wi-Fi Authors
// SPDX-License-Identifier: Apache-2.0

#pragma once

#include <cstddef>
#include <functional>

namespace android::hardware::details {

/**
 * Runs the one-way calls of a passthrough service. No process here has such a service; the
 * generated code only needs the class to exist. A task runs at once.
 */
class TaskRunner {
  public:
    void start(size_t /*limit*/) {}
    bool push(const std::function<void()>& task) {
        task();
        return true;
    }
};

} // namespace android::hardware::details
