// Copyright 2026 The BEX Wi-Fi Authors
// SPDX-License-Identifier: Apache-2.0

// The floor of the service's start and of its memory: linked with the same libraries, and answers
// its standard input as a peer of pingPong().

#include <sys/socket.h>

#include "benchmarks/PingPong.h"

int main() {
    using namespace vendor::korvan::bex::wifi::benchmarks;
    char message[kRequestSize];
    while (recv(0, message, sizeof(message), 0) == kRequestSize) {
        if (send(0, message, kReplySize, MSG_NOSIGNAL) != kReplySize) return 1;
    }
    return 0;
}
