// Copyright 2026 The BEX Wi-Fi Authors
// SPDX-License-Identifier: Apache-2.0

// A process for the tests to talk to, or to kill. See usage().

#include <android-base/properties.h>
#include <android/log.h>
#include <fcntl.h>
#include <hidl/HidlTransportSupport.h>
#include <signal.h>
#include <stdio.h>
#include <stdlib.h>
#include <sys/prctl.h>
#include <sys/resource.h>
#include <unistd.h>

#include <cstring>
#include <string>

#include "tests/host/ScriptedService.h"

namespace {

using ::android::sp;
using ::android::hardware::configureRpcThreadpool;
using ::android::hardware::joinRpcThreadpool;
using ::vendor::korvan::bex::wifi::tests::ScriptedService;
using ::vendor::korvan::bex::wifi::V1_0::IWifiService;

int usage() {
    fprintf(stderr,
            "usage: hidl-test-server EVENTS GATE TAG STEP...\n"
            "  descriptors N      the most that this process may have open\n"
            "  pool N             configureRpcThreadpool(N, true)\n"
            "  register NAME      the same object each time; reports its status\n"
            "  register-new NAME  an object of its own, whose tag is one more\n"
            "  property KEY       reports its value\n"
            "  log-level          reports liblog's least priority\n"
            "  unread-log         has the log go into a pipe that nobody reads any more\n"
            "  log TEXT           logs it as an error\n"
            "  shell LINE         runs it; reports pclose()'s result and a line of output\n"
            "  call SCRIPT        getService()->RunRxStop(SCRIPT) as a client; reports its result\n"
            "  ready              reports \"ready\"\n"
            "  gate               waits for the gate\n"
            "  join               joinRpcThreadpool()\n");
    return 2;
}

std::string callAsClient(const char* script) {
    sp<IWifiService> service = IWifiService::getService();
    if (service == nullptr) return "null";
    std::string result;
    auto called = service->RunRxStop(script, [&](const auto& out) { result = out; });
    return called.isOk() ? result : called.description();
}

void logIntoUnreadPipe() {
    int ends[2];
    if (pipe2(ends, O_CLOEXEC) != 0 || dup2(ends[1], STDERR_FILENO) != STDERR_FILENO) abort();
    close(ends[0]);
    close(ends[1]);
}

std::string runInShell(const char* line) {
    FILE* stream = popen(line, "re");
    char output[256] = "";
    if (stream == nullptr) return "no shell";
    if (fgets(output, sizeof(output), stream) == nullptr) output[0] = '\0';
    output[strcspn(output, "\n")] = '\0';
    return std::to_string(pclose(stream)) + " " + output;
}

} // namespace

int main(int argc, char** argv) {
    if (argc < 4) return usage();
    // Goes with its test, and aborts without a core file: both are part of the tests.
    prctl(PR_SET_PDEATHSIG, SIGKILL);
    const rlimit none = {};
    setrlimit(RLIMIT_CORE, &none);

    const int events = atoi(argv[1]);
    const int gate = atoi(argv[2]);
    int32_t tag = atoi(argv[3]);
    sp<ScriptedService> service = new ScriptedService(events, gate, tag);
    for (int i = 4; i < argc; ++i) {
        const std::string step = argv[i];
        if (step == "join") joinRpcThreadpool();
        if (step == "ready") {
            service->report("ready");
        } else if (step == "gate") {
            service->passGate();
        } else if (step == "log-level") {
            service->report(std::to_string(__android_log_get_minimum_priority()));
        } else if (step == "unread-log") {
            logIntoUnreadPipe();
        } else if (++i == argc) { // NOLINT(bugprone-branch-clone): the last one takes the rest
            return usage();
        } else if (step == "descriptors") {
            const auto most = static_cast<rlim_t>(atoi(argv[i]));
            const rlimit limit = {most, most};
            setrlimit(RLIMIT_NOFILE, &limit);
        } else if (step == "pool") {
            configureRpcThreadpool(static_cast<size_t>(atoi(argv[i])), true);
        } else if (step == "register") {
            service->report(std::to_string(service->registerAsService(argv[i])));
        } else if (step == "register-new") {
            sp<ScriptedService> another = new ScriptedService(events, gate, ++tag);
            service->report(std::to_string(another->registerAsService(argv[i])));
        } else if (step == "property") {
            service->report(android::base::GetProperty(argv[i], "(unset)"));
        } else if (step == "log") {
            __android_log_write(ANDROID_LOG_ERROR, "hidl-test-server", argv[i]);
        } else if (step == "shell") {
            service->report(runInShell(argv[i]));
        } else if (step == "call") {
            service->report(callAsClient(argv[i]));
        } else {
            return usage();
        }
    }
    return 0;
}
