// Copyright 2026 The BEX Wi-Fi Authors
// SPDX-License-Identifier: Apache-2.0

// What the service's handling of a tool's output costs as the output grows, beside a copy of it.

#include <android/log.h>
#include <benchmark/benchmark.h>
#include <malloc.h>

#include <string>
#include <utility>

#include "suites/BrcmTestSuit.h"
#include "suites/Qca639xTestSuit.h"
#include "suites/QcaTestSuit.h"
#include "suites/Wcn39xxTestSuit.h"
#include "suites/Wcn6750TestSuit.h"
#include "suites/WcnTestSuit.h"

namespace {

using namespace vendor::korvan::bex::wifi::V1_0::implementation;

/** At least `size` bytes of lines as the tools print them, without any suite's label. */
std::string listing(size_t size) {
    std::string text;
    for (int i = 0; text.size() < size; ++i) {
        text += "rxframe " + std::to_string(i) +
                " txbyte 2308 reset 1 pktengrxducast 0 wlan1 good 1\n";
    }
    return text;
}

size_t megabytes(const benchmark::State& state) {
    return static_cast<size_t>(state.range(0)) * 1024 * 1024;
}

void copyFloor(benchmark::State& state) {
    const std::string text = listing(megabytes(state));
    while (state.KeepRunning()) {
        std::string copy = text;
        benchmark::DoNotOptimize(copy.data());
    }
}

void replaceNewlines(benchmark::State& state) {
    const std::string text = listing(megabytes(state));
    BrcmTestSuit suit;
    while (state.KeepRunning()) {
        std::string joined = suit.replaceSubString(text, "\n", "");
        benchmark::DoNotOptimize(joined.data());
    }
}

/** A suite whose first command line has printed a text and whose others print nothing. */
template <typename Suit>
class AnsweredSuit : public Suit {
  public:
    void runCmdCom(const std::string&, VendorTestSuit::CmdRunResult& result) override {
        result.status = 0;
        result.output = std::exchange(mOutput, "");
    }
    std::string mOutput;
};

enum class Label { AtStart, NearEnd };

using StopReception = void (*)(std::string& printed, std::string& out);

template <typename Suit>
void stopReception(std::string& printed, std::string& out) {
    static AnsweredSuit<Suit> suit;
    suit.mOutput = std::move(printed);
    suit.RunRxStop("6", out);
}

void packets(benchmark::State& state, StopReception stop, const char* label, Label place) {
    const std::string line = std::string(label) + "48 badPackets 3\n";
    const std::string rest = listing(megabytes(state));
    const std::string text = place == Label::AtStart ? line + rest : rest + line + listing(100);
    std::string out;
    while (state.KeepRunning()) {
        state.PauseTiming();
        std::string printed = text;
        out = std::string();
        state.ResumeTiming();
        stop(printed, out);
        benchmark::DoNotOptimize(out.data());
    }
    if (out.find("48") == std::string::npos) state.SkipWithError("no count");
}

// clang-format off
// NOLINTBEGIN(bugprone-macro-parentheses): the suite is a type.
#define BEX_SIZES ->Arg(1)->Arg(16)->Unit(benchmark::kMillisecond)
#define BEX_PACKETS(name, suit, label)                                                       \
    BENCHMARK_CAPTURE(packets, name/start, stopReception<suit>, label, Label::AtStart)     \
    BEX_SIZES;                                                                               \
    BENCHMARK_CAPTURE(packets, name/end, stopReception<suit>, label, Label::NearEnd) BEX_SIZES

BENCHMARK(copyFloor)->Name("copy") BEX_SIZES;
BENCHMARK(replaceNewlines)->Name("replace") BEX_SIZES;
BEX_PACKETS(broadcom, BrcmTestSuit, "pktengrxdmcast ");
BEX_PACKETS(wcn, WcnTestSuit, "wlan0     get_rxpktcnt:");
BEX_PACKETS(qca, QcaTestSuit, "goodPackets ");
BEX_PACKETS(wcn39xx, Wcn39xxTestSuit, "goodPackets ");
BEX_PACKETS(qca639x, Qca639xTestSuit, "goodPackets = ");
BEX_PACKETS(wcn6750, Wcn6750TestSuit, "goodPackets = ");
// NOLINTEND(bugprone-macro-parentheses)
// clang-format on

} // namespace

int main(int argc, char** argv) {
    __android_log_set_minimum_priority(ANDROID_LOG_SILENT);
    // Every text in fresh memory, the floor's too, as in a service that reads such an output once.
    // The phone's C library has no such threshold, and maps large texts afresh as it is.
#ifdef M_MMAP_THRESHOLD
    mallopt(M_MMAP_THRESHOLD, 128 * 1024);
#endif
    benchmark::Initialize(&argc, argv);
    benchmark::RunSpecifiedBenchmarks();
    return 0;
}
