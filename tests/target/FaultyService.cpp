// Copyright 2026 The BEX Wi-Fi Authors
// SPDX-License-Identifier: Apache-2.0

// A service with one fault, which the target test has to find: target-faulty-service FAULT prints
// "ready" once it is registered. Without a fault it is a phone on which everything works; "counts"
// and "broken-radio" are no faults either, but the answers of other chips and of tools that all
// fail.

#include <hidl/HidlTransportSupport.h>
#include <stdio.h>
#include <unistd.h>

#include <algorithm>
#include <functional>
#include <map>

#include "tests/client/FakeService.h"

namespace {

using ::android::sp;
using ::android::hardware::hidl_array;
using ::android::hardware::Void;
using ::vendor::korvan::bex::wifi::client::FakeService;

class FaultyService : public FakeService {
  public:
    using Fault = std::function<void(FaultyService&, const Words& call)>;

    bool monitor = false;
    int mimoCalls = 0;
    bool failedOnce = false;
    bool frozen = true;
    bool describesItself = true;

    explicit FaultyService(Fault fault) {
        onCall = [this, fault = std::move(fault)] {
            answerWell(calls.back()[0]);
            fault(*this, calls.back());
        };
    }

    Return<void> getHashChain(getHashChain_cb keep) override {
        if (frozen) return FakeService::getHashChain(keep);
        keep(std::vector<hidl_array<uint8_t, 32>>(2));
        return Void();
    }

    Return<void> interfaceChain(interfaceChain_cb keep) override {
        if (describesItself) return FakeService::interfaceChain(keep);
        keep({"vendor.korvan.bex.wifi@1.0::IWifiService"});
        return Void();
    }

  private:
    void answerWell(const std::string& method) {
        if (method == "snifferStart") monitor = true;
        if (method == "snifferStop") monitor = false;
        number = method == "getWlanMode" && monitor ? 4 : 0;
        flag = method == "isMimoSupport" || monitor;
        text = method == "RunRxStop" ? "Rx: 5" : "ok";
        silent = false;
    }
};

bool holds(const FakeService::Words& call, const char* argument) {
    return std::find(call.begin(), call.end(), argument) != call.end();
}

/** A fault of one method. */
FaultyService::Fault in(const char* method, const std::function<void(FaultyService&)>& fault) {
    return [method, fault](FaultyService& service, const FakeService::Words& call) {
        if (call[0] == method) fault(service);
    };
}

/** A service that ends when an argument is this text. */
FaultyService::Fault diesOf(const char* argument) {
    return [argument](FaultyService&, const FakeService::Words& call) {
        if (holds(call, argument)) _exit(0);
    };
}

// A call with rubbish spoils all that follow.
void staysBroken(FaultyService& service, const FakeService::Words& call) {
    if (service.failedOnce) service.number = -1;
    service.failedOnce = service.failedOnce || holds(call, "abc");
}

void answersCounts(FaultyService& service, const FakeService::Words& call) {
    service.text = call[0] == "RunRxAxStart" ? " " : call[0] == "RunRxStop" ? "48  " : "";
}

void failsInEverything(FaultyService& service, const FakeService::Words& call) {
    service.number = -1;
    service.flag = true;
    service.text = call[0] == "RunRxStop" ? "Rx: goodPackets" : "failure";
}

// clang-format off
const std::map<std::string, FaultyService::Fault> kFaults = {
    {"none",           [](FaultyService&, const FakeService::Words&) {}},
    {"counts",         answersCounts},
    {"broken-radio",   failsInEverything},
    {"status",         in("RunTxStop", [](auto& service) { service.number = 1; })},
    {"started",        in("RunRxBgStart", [](auto& service) { service.text = "maybe"; })},
    {"ax-started",     in("RunRxAxStart", [](auto& service) { service.text = ""; })},
    {"received",       in("RunRxStop", [](auto& service) { service.text = "Rx: 5\n"; })},
    {"count",          in("RunRxStop", [](auto& service) { service.text = "5 packets"; })},
    {"mode",           in("getWlanMode", [](auto& service) { service.number = 3; })},
    {"silent",         in("RunRxNStart", [](auto& service) { service.silent = true; })},
    {"mimo",           in("isMimoSupport", [](auto& service) {
                           service.flag = service.mimoCalls++ % 2 == 0;
                       })},
    {"sniffer",        in("isSnifferMode", [](auto& service) { service.flag = !service.flag; })},
    {"never-monitor",  in("snifferStart", [](auto& service) { service.monitor = false; })},
    {"always-monitor", in("snifferStop", [](auto& service) { service.monitor = true; })},
    {"stays-broken",   staysBroken},
    {"dies",           in("RunTxStop", [](auto&) { _exit(0); })},
    {"dies-of-empty",  diesOf("")},
    {"dies-of-text",   diesOf("6abc")},
    {"dies-of-1000",   diesOf("1000")},
    {"hangs",          in("RunTxStop", [](auto&) { pause(); })},
    {"not-frozen",     nullptr},
    {"no-chain",       nullptr},
};
// clang-format on

} // namespace

int main(int argc, char** argv) {
    const auto found = kFaults.find(argc == 2 ? argv[1] : "");
    if (found == kFaults.end()) {
        fprintf(stderr, "usage: target-faulty-service FAULT\n");
        return 2;
    }
    const auto& [name, fault] = *found;
    const sp<FaultyService> service = new FaultyService(fault ? fault : kFaults.at("none"));
    service->frozen = name != "not-frozen";
    service->describesItself = name != "no-chain";
    // One thread: a FakeService takes no more.
    ::android::hardware::configureRpcThreadpool(1, true);
    if (service->registerAsService() != ::android::OK) return 1;
    puts("ready");
    fflush(stdout);
    ::android::hardware::joinRpcThreadpool();
    return 1;
}
