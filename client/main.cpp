// Copyright 2026 The BEX Wi-Fi Authors
// SPDX-License-Identifier: Apache-2.0

#include <android/log.h>
#include <fcntl.h>
#include <signal.h>
#include <unistd.h>

#include <iostream>

#include "client/Client.h"
#include "client/Terminal.h"

using vendor::korvan::bex::wifi::client::IWifiService;
using vendor::korvan::bex::wifi::client::runClient;
using vendor::korvan::bex::wifi::client::terminalColumns;

namespace {

// The connection with the service would get the number of a closed standard stream, and the result
// would go there. So the stream is opened in the wrong direction: using it still fails.
void occupyStandardStreams() {
    for (int fd = STDIN_FILENO; fd <= STDERR_FILENO; ++fd) {
        if (fcntl(fd, F_GETFD) == -1) open("/dev/null", fd == STDIN_FILENO ? O_WRONLY : O_RDONLY);
    }
}

} // namespace

int main(int argc, char** argv) {
    occupyStandardStreams();
    signal(SIGPIPE, SIG_IGN);
    // Where the platform logs to stderr, its lines would appear among the client's own, which say
    // the same.
    __android_log_set_minimum_priority(ANDROID_LOG_SILENT);
    const std::vector<std::string> arguments(argv + (argc > 0), argv + argc);
    std::function<size_t()> columns;
    if (isatty(STDERR_FILENO) != 0) columns = [] { return terminalColumns(STDERR_FILENO); };
    const int exitCode = runClient(arguments, {std::cout, std::cerr,
                                               [] { return IWifiService::tryGetService(); },
                                               [] { return IWifiService::getService(); }, columns});
    // Everything is flushed; a thread may still wait for the service (see base/Worker.h).
    _exit(exitCode);
}
