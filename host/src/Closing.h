// Copyright 2026 The BEX Wi-Fi Authors
// SPDX-License-Identifier: Apache-2.0

#pragma once

#include <android-base/unique_fd.h>

#include <cstddef>

// Closing a descriptor takes as long as its maker likes: a TCP socket that lingers waits for its
// other end. The same goes for a socket with messages that nobody has taken, as they may bring such
// descriptors. So nothing of another process is closed on a thread that serves calls.

namespace android::hardware::host {

/** Closes another process's descriptor, now or later, on a thread that does nothing else. */
void closeElsewhere(base::unique_fd descriptor);

/** Ends the connection with another process, and closes it here when that costs nothing. */
void closeConnection(base::unique_fd socket);

/** How many descriptors closeElsewhere() has not closed yet. */
size_t closingElsewhere();

} // namespace android::hardware::host
