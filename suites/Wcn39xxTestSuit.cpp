// Copyright 2026 The BEX Wi-Fi Authors
// SPDX-License-Identifier: Apache-2.0

#include "suites/Wcn39xxTestSuit.h"

#include <android/log.h>

#include "suites/DriverModules.h"
#include "suites/Rates.h"

namespace vendor::korvan::bex::wifi::V1_0::implementation {

namespace {

constexpr const char* kLogTag = "wifi@1.0-Wcn39xxTestSuit.wcn39xx";

FirmwarePathStrings strings;

} // namespace

Wcn39xxTestSuit::Wcn39xxTestSuit() {
    if (strings.FwPath.empty() && getFwPath() != 0) {
        __android_log_print(ANDROID_LOG_ERROR, kLogTag, "cannot find wlan driver : %s",
                            "Wcn39xxTestSuit");
    }
    __android_log_print(ANDROID_LOG_DEBUG, kLogTag, "function at: %s", "Wcn39xxTestSuit");
}

Wcn39xxTestSuit::~Wcn39xxTestSuit() {
    __android_log_print(ANDROID_LOG_DEBUG, kLogTag, "function at: %s", "~Wcn39xxTestSuit");
}

int Wcn39xxTestSuit::getFwPath() {
    return findFwPath(kLogTag, strings);
}

std::string Wcn39xxTestSuit::getBgRateIndex(const std::string& rate) {
    return bgRateIndex(rate);
}

std::string Wcn39xxTestSuit::getAbgProtocalIndex(const std::string& rate) {
    return abgProtocolIndex(rate);
}

std::string Wcn39xxTestSuit::ParseReceivedPacketNum(const std::string& output) {
    return operations().parseReceivedPacketNum(output);
}

FirmwarePathOperations Wcn39xxTestSuit::operations() {
    return {*this, kLogTag, kWcn39xxChip, strings.FwPath};
}

} // namespace vendor::korvan::bex::wifi::V1_0::implementation
