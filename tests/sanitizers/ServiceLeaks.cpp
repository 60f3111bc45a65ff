// Copyright 2026 The BEX Wi-Fi Authors
// SPDX-License-Identifier: Apache-2.0

// The service never ends by itself, so LeakSanitizer would never look for its leaks. Here a thread
// does, each time that somebody opens the pipe kRequests; a phone without the pipe asks for
// nothing.

#include <fcntl.h>
#include <sanitizer/lsan_interface.h>
#include <stdio.h>
#include <unistd.h>

#include <thread>

namespace {

constexpr char kRequests[] = "/phone/leaks";

void serveRequests() {
    for (;;) {
        const int requests = open(kRequests, O_RDONLY | O_CLOEXEC);
        if (requests < 0) return;
        for (char byte; read(requests, &byte, 1) > 0;) {
        }
        close(requests);
        __lsan_do_recoverable_leak_check();
        fprintf(stderr, "looked for leaks\n");
    }
}

[[maybe_unused]] const bool started = [] {
    std::thread(serveRequests).detach();
    return true;
}();

} // namespace
