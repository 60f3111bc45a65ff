// Copyright 2026 The BEX Wi-Fi Authors
// SPDX-License-Identifier: Apache-2.0

// What the service adds to the commands that it runs, beside a bare loop that runs the same ones
// with popen, fgets and pclose. No command of the service's own runs: see gQuiet.

#include <android/log.h>
#include <benchmark/benchmark.h>
#include <fcntl.h>
#include <stdio.h>
#include <unistd.h>

#include <fstream>
#include <string>

#include "benchmarks/PingPong.h"
#include "benchmarks/Turns.h"
#include "suites/BrcmTestSuit.h"
#include "suites/Qca639xTestSuit.h"

namespace {

using namespace vendor::korvan::bex::wifi::V1_0::implementation;
using vendor::korvan::bex::wifi::benchmarks::forked;
using vendor::korvan::bex::wifi::benchmarks::measureByTurns;
using vendor::korvan::bex::wifi::benchmarks::require;

constexpr size_t kOutputSize = 100'000'000;
constexpr int kLinesOfTxN = 20;

/** Every command line becomes one that does nothing: a whole operation in a shell without effect.
 */
bool gQuiet = false;

/** No command line runs: what is left of an operation is the service's own work. */
bool gNoShell = false;

/** The command lines so far. */
int gLines = 0;

} // namespace

// The linker leads all calls of these functions in this program here, under its own kind of names.
// NOLINTBEGIN(clang-diagnostic-reserved-identifier)
extern "C" {
FILE* __real_popen(const char* line, const char* mode);
int __real_pclose(FILE* stream);
char* __real_fgets(char* piece, int size, FILE* stream);

FILE* __wrap_popen(const char* line, const char* mode) {
    ++gLines;
    return gNoShell ? stdin : __real_popen(gQuiet ? ":" : line, mode);
}

int __wrap_pclose(FILE* stream) {
    return gNoShell ? 0 : __real_pclose(stream);
}

char* __wrap_fgets(char* piece, int size, FILE* stream) {
    return gNoShell ? nullptr : __real_fgets(piece, size, stream);
}
}
// NOLINTEND(clang-diagnostic-reserved-identifier)

namespace {

std::string bareLoop(const char* line) {
    FILE* stream = popen(line, "r");
    require(stream != nullptr, "popen");
    std::string collected;
    char piece[256];
    while (fgets(piece, sizeof(piece), stream) != nullptr) collected += piece;
    require(pclose(stream) == 0, "the command");
    return collected;
}

std::string throughSuite(const char* line) {
    static BrcmTestSuit suit;
    VendorTestSuit::CmdRunResult result;
    suit.runCmdCom(line, result);
    require(result.status == 0, "the command");
    return std::move(result.output);
}

using Runner = std::string (*)(const char* line);

void nothing(benchmark::State& state) {
    measureByTurns(
            state, 1, [] { bareLoop(":"); }, [] { throughSuite(":"); });
}

/** A file of lines, which cat prints faster than anybody reads. */
class PrintedFile {
  public:
    PrintedFile() {
        char name[] = "/tmp/bex-bench-XXXXXX";
        require(mkstemp(name) >= 0, "mkstemp");
        mName = name;
        std::ofstream file(name);
        const std::string line = "rxframe 8 txbyte 2308 pktengrxducast 0 wlan1 up and running\n";
        for (size_t size = 0; size < kOutputSize; size += line.size()) file << line;
    }
    ~PrintedFile() { unlink(mName.c_str()); }
    std::string command() const { return "cat " + mName; }

  private:
    std::string mName;
};

const std::string& printing() {
    static const PrintedFile file;
    static const std::string command = file.command();
    return command;
}

void output(benchmark::State& state, Runner run) {
    const std::string& line = printing();
    while (state.KeepRunning()) require(run(line.c_str()).size() >= kOutputSize, "the output");
}

/** The most memory that this process has had resident, in bytes. */
double peakMemory() {
    std::ifstream status("/proc/self/status");
    for (std::string word; status >> word;) {
        double kilobytes;
        if (word == "VmHWM:" && status >> kilobytes) return kilobytes * 1024;
    }
    return 0;
}

void peak(benchmark::State& state) {
    const std::string& line = printing();
    double grown = 0;
    while (state.KeepRunning()) {
        int ends[2];
        require(pipe2(ends, O_CLOEXEC) == 0, "pipe2");
        const auto child = forked([&] {
            const double before = peakMemory();
            throughSuite(line.c_str());
            const double more = peakMemory() - before;
            require(write(ends[1], &more, sizeof(more)) == sizeof(more), "write");
        });
        close(ends[1]);
        require(read(ends[0], &grown, sizeof(grown)) == sizeof(grown), "read");
        close(ends[0]);
    }
    state.counters["outputs"] = grown / kOutputSize;
}

void operation(benchmark::State& state) {
    BrcmTestSuit suit;
    gQuiet = true;
    measureByTurns(
            state, 1,
            [] {
                for (int i = 0; i < kLinesOfTxN; ++i) bareLoop("");
            },
            [&] { suit.RunTxNStart("36", "80", "7", "15", true, "1"); });
    gQuiet = false;
}

using Operation = void (*)();

void transmitN() {
    static BrcmTestSuit suit;
    suit.RunTxNStart("36", "80", "7", "15", true, "1");
}

void transmitAx() {
    static Qca639xTestSuit suit;
    suit.RunTxAxStart("36", "80", "7", "15", "0", "1");
}

/** The service's own work for one line, in bare loops that run a line that does nothing. */
void own(benchmark::State& state, Operation operation) {
    const auto withoutShell = [operation] {
        gNoShell = true;
        operation();
        gNoShell = false;
    };
    const int before = gLines;
    withoutShell();
    const int lines = gLines - before;
    measureByTurns(
            state, 1, [] { bareLoop(":"); }, withoutShell);
    state.counters["p50"] = state.counters["p50"] / lines;
}

BENCHMARK_CAPTURE(own, table, transmitN)->Iterations(100);
BENCHMARK_CAPTURE(own, logged, transmitAx)->Iterations(100);
BENCHMARK(nothing)->Iterations(100);
BENCHMARK(operation)->Iterations(5);
BENCHMARK_CAPTURE(output, floor, bareLoop)->UseRealTime();
BENCHMARK_CAPTURE(output, service, throughSuite)->UseRealTime();
BENCHMARK(peak)->Iterations(1);

} // namespace

int main(int argc, char** argv) {
    __android_log_set_minimum_priority(ANDROID_LOG_SILENT);
    benchmark::Initialize(&argc, argv);
    benchmark::RunSpecifiedBenchmarks();
    return 0;
}
