// Copyright 2026 The BEX Wi-Fi Authors
// SPDX-License-Identifier: Apache-2.0

#pragma once

#include <android-base/unique_fd.h>

#include <cstddef>

// The process that made a descriptor can delay its closing: a TCP socket that lingers waits for its
// other end. The same is true of a socket with unread messages, as they may carry such descriptors.
// So a thread that serves calls never closes a descriptor of another process.

namespace android::hardware::host {

/** Closes another process's descriptor, now or later, on a thread that does nothing else. */
void closeElsewhere(base::unique_fd descriptor);

/** Ends the connection with another process, and closes it on this thread when that cannot wait. */
void closeConnection(base::unique_fd socket);

/** How many descriptors closeElsewhere() has not closed yet. */
size_t closingElsewhere();

} // namespace android::hardware::host
