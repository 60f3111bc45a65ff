// Copyright 2026 The BEX Wi-Fi Authors
// SPDX-License-Identifier: Apache-2.0

// The way from the start of the service's program to its first answer, and what it has resident
// then, beside a program that is linked with the same libraries and answers a bare ping-pong.

#include <benchmark/benchmark.h>
#include <sys/socket.h>
#include <unistd.h>
#include <vendor/korvan/bex/wifi/1.0/IWifiService.h>

#include <fstream>
#include <string>

#include "benchmarks/Clock.h"
#include "benchmarks/PingPong.h"
#include "benchmarks/ServiceTree.h"

namespace {

using namespace vendor::korvan::bex::wifi::benchmarks;
using ::android::sp;
using ::vendor::korvan::bex::wifi::V1_0::IWifiService;

/** What a process has resident, in bytes. */
double residentMemory(pid_t pid) {
    std::ifstream status("/proc/" + std::to_string(pid) + "/status");
    for (std::string word; status >> word;) {
        double kilobytes;
        if (word == "VmRSS:" && status >> kilobytes) return kilobytes * 1024;
    }
    return 0;
}

void startFloor(benchmark::State& state) {
    while (state.KeepRunning()) {
        int ends[2];
        require(socketpair(AF_UNIX, SOCK_SEQPACKET | SOCK_CLOEXEC, 0, ends) == 0, "socketpair");
        const Clock::time_point start = Clock::now();
        const Child program = startEmptyProgram(ends[1]);
        pingPong(ends[0]);
        state.SetIterationTime(secondsSince(start));
        state.counters["resident"] = residentMemory(program.pid());
        close(ends[0]);
        close(ends[1]);
    }
}

void start(benchmark::State& state) {
    static const ServiceTree tree;
    while (state.KeepRunning()) {
        const Clock::time_point start = Clock::now();
        const Child program = ServiceTree::startService();
        const sp<IWifiService> service = IWifiService::getService();
        const bool answer = service->isMimoSupport();
        require(answer, "isMimoSupport");
        state.SetIterationTime(secondsSince(start));
        state.counters["resident"] = residentMemory(program.pid());
    }
}

BENCHMARK(startFloor)->Name("start/floor")->UseManualTime();
BENCHMARK(start)->Name("start/service")->UseManualTime();

} // namespace

BENCHMARK_MAIN();
