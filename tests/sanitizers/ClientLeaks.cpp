// Copyright 2026 The BEX Wi-Fi Authors
// SPDX-License-Identifier: Apache-2.0

// The client ends with _exit(), past LeakSanitizer's own look for leaks. The linker puts this
// function in the place of that call.

#include <sanitizer/lsan_interface.h>

extern "C" {

[[noreturn]] void __real__exit(int exitCode);

[[noreturn]] void __wrap__exit(int exitCode) {
    __lsan_do_leak_check();
    __real__exit(exitCode);
}
}
