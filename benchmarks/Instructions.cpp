// Copyright 2026 The BEX Wi-Fi Authors
// SPDX-License-Identifier: Apache-2.0

// Runs under callgrind, which then holds a count of instructions for each case: what the service
// itself executes for every operation on every chip, and how its handling of output grows. The
// commands are the recorder's; their start, their reading, their end and the log are not counted.
//
// Each case is a dump whose name tells what to divide the count by:
//
//     lines broadcom RunTxStop 3

#include <android-base/properties.h>
#include <stdio.h>
#include <valgrind/callgrind.h>

#include <functional>
#include <string>

#include "chips/ChipFamily.h"
#include "chips/ModuleFiles.h"
#include "recorder/RecordedShell.h"
#include "service/WifiService.h"
#include "shell/Command.h"

namespace {

using namespace vendor::korvan::bex::wifi::V1_0::implementation;
using namespace vendor::korvan::bex::wifi;
using recorder::RecordedShell;

// Between count() and its end: callgrind's switch only turns over, so it must stand the right way.
bool gCounting = false;
// Whether the reading of a command's output counts, for a floor that reads it too.
bool gReadingCounts = false;

/** Leaves out what runs while it lives. */
class NotCounted {
  public:
    NotCounted() {
        if (gCounting) CALLGRIND_TOGGLE_COLLECT;
    }
    ~NotCounted() {
        if (gCounting) CALLGRIND_TOGGLE_COLLECT;
    }
};

void count(const std::string& name, const std::function<void()>& work) {
    // Once before, so that nothing is counted that only the first time needs.
    work();
    CALLGRIND_ZERO_STATS;
    gCounting = true;
    CALLGRIND_TOGGLE_COLLECT;
    work();
    CALLGRIND_TOGGLE_COLLECT;
    gCounting = false;
    CALLGRIND_DUMP_STATS_AT(name.c_str());
}

} // namespace

// The linker leads the service's calls of these functions here, under its own kind of names. The
// log is dropped. NOLINTBEGIN(clang-diagnostic-reserved-identifier)
extern "C" {

FILE* __real_popen(const char* line, const char* mode);
int __real_pclose(FILE* stream);
char* __real_fgets(char* piece, int size, FILE* stream);

FILE* __wrap_popen(const char* line, const char* mode) {
    const NotCounted here;
    return __real_popen(line, mode);
}

int __wrap_pclose(FILE* stream) {
    const NotCounted here;
    return __real_pclose(stream);
}

char* __wrap_fgets(char* piece, int size, FILE* stream) {
    if (gReadingCounts) return __real_fgets(piece, size, stream);
    const NotCounted here;
    return __real_fgets(piece, size, stream);
}

int __wrap___android_log_print(int, const char*, const char*, ...) {
    return 0;
}
}
// NOLINTEND(clang-diagnostic-reserved-identifier)

namespace {

struct Operation {
    const char* name;
    std::function<void(WifiService&)> call;
};

using Text = android::hardware::hidl_string;

// A stub borrows the arguments' bytes from the call, so making them is not the service's work.
const Text kChannel24 = "6", kChannel5 = "36", kWidth = "80", kBgRate = "54", kMcs = "7",
           kPower = "15", kInterval = "0", kAntenna = "1", kSsid = "line-7",
           kAddress = "192.168.1.2";

void ignore(const Text&) {}

// clang-format off
const Operation kOperations[] = {
    {"snifferStart",   [](WifiService& s) { s.snifferStart(kChannel5, kWidth); }},
    {"snifferStop",    [](WifiService& s) { s.snifferStop(); }},
    {"isSnifferMode",  [](WifiService& s) { s.isSnifferMode(); }},
    {"getWlanMode",    [](WifiService& s) { s.getWlanMode(); }},
    {"RunTxBGStart",   [](WifiService& s) { s.RunTxBGStart(kChannel24, kBgRate, kPower, kAntenna); }},
    {"RunTxNStart",    [](WifiService& s) { s.RunTxNStart(kChannel5, kWidth, kMcs, kPower, true, kAntenna); }},
    {"RunTxAxStart",   [](WifiService& s) { s.RunTxAxStart(kChannel5, kWidth, kMcs, kPower, kInterval, kAntenna); }},
    {"RunTxStop",      [](WifiService& s) { s.RunTxStop(kChannel5); }},
    {"RunTxStStart",   [](WifiService& s) { s.RunTxStStart(kChannel5, kWidth, kAntenna); }},
    {"RunTxStStop",    [](WifiService& s) { s.RunTxStStop(kChannel5); }},
    {"RunRxApJoinHoc", [](WifiService& s) { s.RunRxApJoinHoc(kSsid, kAddress); }},
    {"RunRxBgStart",   [](WifiService& s) { s.RunRxBgStart(kChannel24, kBgRate, kAntenna, ignore); }},
    {"RunRxNStart",    [](WifiService& s) { s.RunRxNStart(kChannel5, kWidth, kMcs, true, kAntenna, ignore); }},
    {"RunRxAxStart",   [](WifiService& s) { s.RunRxAxStart(kChannel5, kWidth, kMcs, kAntenna, ignore); }},
    {"RunRxStop",      [](WifiService& s) { s.RunRxStop(kChannel5, ignore); }},
};
// clang-format on

/** At least `kilobytes` of lines as the tools print them, and one with every label. */
std::string listing(int kilobytes) {
    std::string text;
    for (int i = 0; text.size() < static_cast<size_t>(kilobytes) * 1024; ++i) {
        text += "rxframe " + std::to_string(i) + " txbyte 2308 pktengrxducast 0 wlan1 good 1\n";
    }
    return text + "goodPackets = 48 badPackets 3\n";
}

void countLines(const ChipFamily& family, const RecordedShell& shell, WifiService& service) {
    for (const Operation& operation : kOperations) {
        const size_t before = shell.lines().size();
        operation.call(service);
        const size_t lines = shell.lines().size() - before;
        if (lines == 0) continue;
        count(std::string("lines ") + family.name + " " + operation.name + " " +
                      std::to_string(lines),
              [&] { operation.call(service); });
    }
}

void countPackets(const ChipFamily& family, RecordedShell& shell, WifiService& service) {
    for (int kilobytes : {256, 1024}) {
        const std::string text = listing(kilobytes);
        for (const char* counter : {"wl counters", "get_rxpktcnt", "myftm"}) {
            shell.answer(counter, {text});
        }
        count(std::string("packets ") + family.name + " " + std::to_string(kilobytes),
              [&] { service.RunRxStop(kChannel5, ignore); });
    }
}

void countFamily(const ChipFamily& family) {
    RecordedShell shell;
    if (family.modules == DriverModules::oneOfSeveral) {
        shell.readable(kModuleCandidates[std::size(kModuleCandidates) - 1]);
    }
    if (family.modules == DriverModules::allOfAFolder) {
        shell.directory(kModuleFolder, {"qca_cld3_a.ko", "qca_cld3_b.ko"});
    }
    shell.answer("con_mode", {"4\n"});
    shell.answer("counters", {"pktengrxdmcast 48\n"});
    shell.answer("get_rxpktcnt", {"wlan0     get_rxpktcnt:48\n"});
    shell.answer("myftm", {"goodPackets = 48 badPackets 3\n"});
    android::base::SetProperty("ro.hardware.wlan.vendor", family.vendor);
    android::base::SetProperty("ro.hardware.wlan.chip", family.partOfName);
    const android::sp<WifiService> service = new WifiService();
    countLines(family, shell, *service);
    countPackets(family, shell, *service);
}

/** What the switches for one command cost, which is not the service's. */
void countSwitches() {
    RecordedShell shell;
    count("switches 1", [] {
        FILE* stream = popen(":", "r");
        char piece[256];
        fgets(piece, sizeof(piece), stream);
        pclose(stream);
    });
}

void countOutput() {
    RecordedShell shell;
    shell.answer("tool", {listing(1024)});
    gReadingCounts = true;
    count("output floor 1024", [] {
        FILE* stream = popen("tool", "r");
        std::string collected;
        char piece[256];
        while (fgets(piece, sizeof(piece), stream) != nullptr) collected += piece;
        pclose(stream);
    });
    count("output runCommand 1024", [] { runCommand("tool", "tag"); });
    gReadingCounts = false;
}

void countReplacing() {
    for (int kilobytes : {256, 1024}) {
        const std::string text = listing(kilobytes);
        count("replace newlines " + std::to_string(kilobytes),
              [&] { vendorTestSuit->replaceSubString(text, "\n", ""); });
    }
}

} // namespace

int main() {
    // Callgrind starts with the counting on or off as it is told; it is told off.
    for (const ChipFamily& family : chipFamilies()) countFamily(family);
    countSwitches();
    countOutput();
    android::base::SetProperty("ro.hardware.wlan.vendor", "broadcom");
    const android::sp<WifiService> service = new WifiService();
    countReplacing();
    return 0;
}
