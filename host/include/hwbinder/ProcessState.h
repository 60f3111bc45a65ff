// Copyright 2026 The BEX Wi-Fi Authors
// SPDX-License-Identifier: Apache-2.0

#pragma once

#include <utils/RefBase.h>
#include <utils/StrongPointer.h>

namespace android::hardware {

/**
 * What the generated code asks of the process. Its one request, a thread for death notices, does
 * nothing here, as the watcher's thread starts with the first linkToDeath().
 */
class ProcessState : public RefBase {
  public:
    static sp<ProcessState> self();
    void startThreadPool() {}
};

} // namespace android::hardware
