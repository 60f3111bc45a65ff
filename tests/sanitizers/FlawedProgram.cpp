// Copyright 2026 The BEX Wi-Fi Authors
// SPDX-License-Identifier: Apache-2.0

// flawed-program FLAW [_exit]: commits the flaw, and ends as most programs do or as the client
// does.

#include <unistd.h>

#include <cstring>

#include "tests/sanitizers/Flaws.h"

int main(int argc, char** argv) {
    if (argc < 2) return 2;
    commitFlaw(argv[1]);
    if (argc > 2 && strcmp(argv[2], "_exit") == 0) _exit(0);
    return 0;
}
