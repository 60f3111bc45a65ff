// Copyright 2026 The BEX Wi-Fi Authors
// SPDX-License-Identifier: Apache-2.0

#include "tests/host/ScriptedService.h"

#include <unistd.h>

#include <stdexcept>

namespace vendor::korvan::bex::wifi::tests {

using ::android::hardware::Status;
using ::android::hardware::Void;

void ScriptedService::report(const std::string& line) {
    const std::string text = line + "\n";
    if (mEvents >= 0 && write(mEvents, text.data(), text.size()) < 0) _exit(99);
}

int32_t ScriptedService::run() {
    ++mRuns;
    return 0;
}

void ScriptedService::passGate() {
    char byte;
    if (read(mGate, &byte, 1) != 1) _exit(98);
}

ScriptedService::Return<int32_t> ScriptedService::snifferStart(const hidl_string& channel,
                                                               const hidl_string& bandwidth) {
    run();
    return static_cast<int32_t>(channel.size() + bandwidth.size());
}

ScriptedService::Return<int32_t> ScriptedService::getWlanMode() {
    run();
    return mTag;
}

ScriptedService::Return<int32_t> ScriptedService::RunTxNStart(const hidl_string&,
                                                              const hidl_string&,
                                                              const hidl_string&,
                                                              const hidl_string&, bool vht,
                                                              const hidl_string&) {
    run();
    return vht ? 1 : 0;
}

ScriptedService::Return<void> ScriptedService::RunRxBgStart(const hidl_string& channel,
                                                            const hidl_string& rate,
                                                            const hidl_string& antenna,
                                                            RunRxBgStart_cb callback) {
    run();
    callback(std::string(channel) + "|" + std::string(rate) + "|" + std::string(antenna));
    return Void();
}

ScriptedService::Return<void> ScriptedService::RunRxNStart(const hidl_string& channel,
                                                           const hidl_string& bandwidth,
                                                           const hidl_string& rate, bool vht,
                                                           const hidl_string& antenna,
                                                           RunRxNStart_cb callback) {
    run();
    const hidl_string copies[] = {channel, bandwidth, rate, antenna};
    std::string all = vht ? "vht" : "ht";
    for (const hidl_string& copy : copies) all += "|" + std::string(copy);
    callback(all);
    return Void();
}

ScriptedService::Return<void> ScriptedService::RunRxAxStart(const hidl_string& channel,
                                                            const hidl_string&, const hidl_string&,
                                                            const hidl_string&,
                                                            RunRxAxStart_cb callback) {
    run();
    hidl_string borrowed;
    borrowed.setToExternal(channel.c_str(), channel.size());
    callback(borrowed);
    return Void();
}

ScriptedService::Return<void> ScriptedService::RunRxStop(const hidl_string& script,
                                                         RunRxStop_cb callback) {
    const int runs = mRuns++;
    const std::string all = script;
    const std::string word = all.substr(0, all.find(' '));
    if (word == "wait") {
        report("entered");
        passGate();
        // Reported first: after the answer another call may enter and report.
        report("leaving");
        callback("done");
    } else if (word == "late") {
        callback("early");
        report("answered");
        passGate();
        report("leaving");
    } else if (word == "never") {
    } else if (word == "twice") {
        callback("first");
        callback("second");
    } else if (word == "throw") {
        throw std::runtime_error("before the callback");
    } else if (word == "throw-late") {
        callback("first");
        throw std::runtime_error("after the callback");
    } else if (word == "status") {
        return Status::fromExceptionCode(Status::EX_ILLEGAL_STATE, "not now");
    } else if (word == "status-late") {
        callback("first");
        return Status::fromExceptionCode(Status::EX_ILLEGAL_STATE, "not now");
    } else if (word == "large") {
        callback(std::string(std::stoul(all.substr(6)), 'x'));
    } else if (word == "count") {
        callback(std::to_string(runs));
    } else {
        callback(script);
    }
    return Void();
}

} // namespace vendor::korvan::bex::wifi::tests
