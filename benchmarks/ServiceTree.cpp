// Copyright 2026 The BEX Wi-Fi Authors
// SPDX-License-Identifier: Apache-2.0

#include "benchmarks/ServiceTree.h"

#include <errno.h>
#include <spawn.h>
#include <stdlib.h>
#include <unistd.h>

#include <filesystem>
#include <fstream>

namespace vendor::korvan::bex::wifi::benchmarks {

namespace {

Child spawned(const char* program, int input) {
    posix_spawn_file_actions_t actions;
    posix_spawn_file_actions_init(&actions);
    if (input >= 0) posix_spawn_file_actions_adddup2(&actions, input, STDIN_FILENO);
    std::string name = program;
    char* const arguments[] = {name.data(), nullptr};
    pid_t pid;
    errno = posix_spawn(&pid, program, &actions, nullptr, arguments, environ);
    require(errno == 0, "posix_spawn");
    posix_spawn_file_actions_destroy(&actions);
    return Child(pid);
}

} // namespace

ServiceTree::ServiceTree() {
    char root[] = "/tmp/bex-bench-XXXXXX";
    require(mkdtemp(root) != nullptr, "mkdtemp");
    mRoot = root;
    const std::string manifest = mRoot + "/vendor/etc/vintf/manifest";
    std::filesystem::create_directories(mRoot + "/dev/socket");
    std::filesystem::create_directories(manifest);
    std::filesystem::copy_file(BEX_SERVICE_MANIFEST, manifest + "/service.xml");
    std::ofstream(mRoot + "/vendor/build.prop") << "ro.hardware.wlan.vendor=broadcom\n"
                                                   "ro.hardware.wlan.mimo=1\n"
                                                   "log.tag=E\n";
    setenv("HIDL_HOST_ROOT", root, 1);
}

ServiceTree::~ServiceTree() {
    std::filesystem::remove_all(mRoot);
}

Child ServiceTree::startService() {
    return spawned(BEX_SERVICE, -1);
}

Child startEmptyProgram(int socket) {
    return spawned(BEX_EMPTY_PROGRAM, socket);
}

} // namespace vendor::korvan::bex::wifi::benchmarks
