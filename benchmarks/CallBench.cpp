// Copyright 2026 The BEX Wi-Fi Authors
// SPDX-License-Identifier: Apache-2.0

// What a call costs that runs no command, beside a bare ping-pong: one client's latency, and the
// throughput of several clients at once.

#include <benchmark/benchmark.h>
#include <sys/socket.h>
#include <unistd.h>
#include <vendor/korvan/bex/wifi/1.0/IWifiService.h>

#include "benchmarks/Clock.h"
#include "benchmarks/PingPong.h"
#include "benchmarks/ServiceTree.h"
#include "benchmarks/Turns.h"

namespace {

using namespace vendor::korvan::bex::wifi::benchmarks;
using ::android::sp;
using ::vendor::korvan::bex::wifi::V1_0::IWifiService;

void callOnce(const sp<IWifiService>& service) {
    const bool answer = service->isMimoSupport();
    require(answer, "isMimoSupport");
}

/** The service in a process of its own, for the whole run of this one. */
void haveService() {
    static const ServiceTree tree;
    static const Child service = ServiceTree::startService();
}

void latency(benchmark::State& state) {
    haveService();
    static const Echo echo;
    static const sp<IWifiService> service = IWifiService::getService();
    // In blocks: each call finds the caches as its own kind left them.
    measureByTurns(
            state, 100, [] { pingPong(echo.socket); }, [] { callOnce(service); });
}

/** Client processes that wait for a word, make their calls and say that they have. */
class Crowd {
  public:
    /** @param member What the client with a number does, to be called when it is a process. */
    Crowd(size_t size, const std::function<std::function<void()>(size_t)>& member) {
        for (size_t i = 0; i < size; ++i) {
            int ends[2];
            require(socketpair(AF_UNIX, SOCK_STREAM | SOCK_CLOEXEC, 0, ends) == 0, "socketpair");
            mClients.push_back(forked([&, control = ends[1]] {
                const std::function<void()> call = member(i);
                call();
                char word = 0;
                while (write(control, &word, 1) == 1 && read(control, &word, 1) == 1) {
                    for (size_t n = 0; n < kCalls / size; ++n) call();
                }
            }));
            close(ends[1]);
            mControls.push_back(ends[0]);
        }
        hearAll();
    }

    ~Crowd() {
        for (int control : mControls) close(control);
    }

    /** The seconds that the calls of all take. */
    double run() {
        const Clock::time_point start = Clock::now();
        const char word = 0;
        for (int control : mControls) require(write(control, &word, 1) == 1, "write");
        hearAll();
        return secondsSince(start);
    }

    static constexpr size_t kCalls = 6'400;

  private:
    void hearAll() {
        char word;
        for (int control : mControls) require(read(control, &word, 1) == 1, "read");
    }

    std::vector<Child> mClients;
    std::vector<int> mControls;
};

void measureThroughput(benchmark::State& state, Crowd& crowd) {
    while (state.KeepRunning()) state.SetIterationTime(crowd.run());
    state.SetItemsProcessed(state.iterations() * static_cast<int64_t>(Crowd::kCalls));
}

void throughputFloor(benchmark::State& state) {
    const auto clients = static_cast<size_t>(state.range(0));
    const EchoForMany echo(clients);
    Crowd crowd(clients,
                [&](size_t i) { return [socket = echo.sockets[i]] { pingPong(socket); }; });
    measureThroughput(state, crowd);
}

void throughput(benchmark::State& state) {
    haveService();
    Crowd crowd(static_cast<size_t>(state.range(0)), [](size_t) {
        return [service = IWifiService::getService()] { callOnce(service); };
    });
    measureThroughput(state, crowd);
}

BENCHMARK(latency)->Iterations(100);
BENCHMARK(throughputFloor)->Name("clients/floor")->Arg(2)->Arg(64)->UseManualTime();
BENCHMARK(throughput)->Name("clients/service")->Arg(2)->Arg(64)->UseManualTime();

} // namespace

BENCHMARK_MAIN();
