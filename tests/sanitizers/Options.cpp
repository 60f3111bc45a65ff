// Copyright 2026 The BEX Wi-Fi Authors
// SPDX-License-Identifier: Apache-2.0

// What the sanitizers' runtimes ask every program for. Compiled in: no environment variable of the
// machine reaches a program in a simulated phone.

extern "C" {

// The exit code of a report is none that a program of this project ends with.

const char* __asan_default_options() {
    return "exitcode=66:detect_stack_use_after_return=1:check_initialization_order=1:"
           "strict_init_order=1:strict_string_checks=1";
}

const char* __ubsan_default_options() {
    return "exitcode=66:print_stacktrace=1";
}

const char* __tsan_default_options() {
    return "exitcode=66:halt_on_error=1:second_deadlock_stack=1";
}
}
