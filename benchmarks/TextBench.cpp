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
    for (auto _ : state) {
        std::string copy = text;
        benchmark::DoNotOptimize(copy.data());
    }
}

void replaceNewlines(benchmark::State& state) {
    const std::string text = listing(megabytes(state));
    BrcmTestSuit suit;
    for (auto _ : state) {
        std::string joined = suit.replaceSubString(text, "\n", "");
        benchmark::DoNotOptimize(joined.data());
    }
}

/** A suite whose first command line has printed a text and whose others print nothing. */
template <typename Suit>
class AnsweredSuit : public Suit {
  public:
    void runCmdCom(const std::string&, CommandResult& result) override {
        result.status = 0;
        result.output = std::exchange(mOutput, "");
    }
    std::string mOutput;
};

enum class Label { AtStart, NearEnd };

template <typename Suit>
void packetCount(benchmark::State& state, const char* label, Label place) {
    const std::string line = std::string(label) + "48 badPackets 3\n";
    const std::string rest = listing(megabytes(state));
    const std::string text = place == Label::AtStart ? line + rest : rest + line + listing(100);
    AnsweredSuit<Suit> suit;
    std::string out;
    for (auto _ : state) {
        state.PauseTiming();
        suit.mOutput = text;
        out = std::string();
        state.ResumeTiming();
        suit.RunRxStop("6", out);
        benchmark::DoNotOptimize(out.data());
    }
    if (out.find("48") == std::string::npos) state.SkipWithError("no count");
}

template <typename... Args>
void measure(const std::string& name, Args... args) {
    benchmark::RegisterBenchmark(name.c_str(), args...)
            ->Arg(1)
            ->Arg(4)
            ->Arg(16)
            ->Unit(benchmark::kMillisecond);
}

template <typename Suit>
void measurePacketCount(const std::string& suit, const char* label) {
    measure("packets/" + suit + "/start", packetCount<Suit>, label, Label::AtStart);
    measure("packets/" + suit + "/end", packetCount<Suit>, label, Label::NearEnd);
}

} // namespace

int main(int argc, char** argv) {
    __android_log_set_minimum_priority(ANDROID_LOG_SILENT);
    // Every text in fresh memory, the floor's too, as in a service that reads such an output once.
    mallopt(M_MMAP_THRESHOLD, 128 * 1024);
    benchmark::Initialize(&argc, argv);
    measure("copy", copyFloor);
    measure("replace", replaceNewlines);
    measurePacketCount<BrcmTestSuit>("broadcom", "pktengrxdmcast ");
    measurePacketCount<WcnTestSuit>("wcn", "wlan0     get_rxpktcnt:");
    measurePacketCount<QcaTestSuit>("qca", "goodPackets ");
    measurePacketCount<Wcn39xxTestSuit>("wcn39xx", "goodPackets ");
    measurePacketCount<Qca639xTestSuit>("qca639x", "goodPackets = ");
    measurePacketCount<Wcn6750TestSuit>("wcn6750", "goodPackets = ");
    benchmark::RunSpecifiedBenchmarks();
    return 0;
}
