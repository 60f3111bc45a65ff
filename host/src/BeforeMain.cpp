// Copyright 2026 The BEX Wi-Fi Authors
// SPDX-License-Identifier: Apache-2.0

#include "host/src/BeforeMain.h"

#include <signal.h>

namespace android::hardware::host {
namespace {

// Sets SIGCHLD back to the default, as init does for its services. Some programs start others with
// SIGCHLD ignored, and then pclose() cannot tell how a command ended.
void stopIgnoringChildren() {
    struct sigaction inherited = {};
    sigaction(SIGCHLD, nullptr, &inherited);
    if (inherited.sa_handler == SIG_IGN) signal(SIGCHLD, SIG_DFL);
}

} // namespace
} // namespace android::hardware::host

// What init does on a phone before any service runs. The build names this function to the linker,
// so that every program of the host layer carries it.
extern "C" __attribute__((constructor)) void bexBeforeMain() {
    using namespace android::hardware::host;
    stopIgnoringChildren();
    outliveLogReader();
    seedProperties();
    setLogLevel();
}
