// Copyright 2026 The BEX Wi-Fi Authors
// SPDX-License-Identifier: Apache-2.0

#include "suites/Wcn6750TestSuit.h"

#include <android/log.h>

#include "suites/Bandwidth.h"
#include "suites/DriverModules.h"
#include "suites/Rates.h"

namespace vendor::korvan::bex::wifi::V1_0::implementation {

namespace {

constexpr const char* kLogTag = "wifi@1.0-Wcn6750TestSuit.wcn6750";

const DriverPathStrings strings;

} // namespace

Wcn6750TestSuit::Wcn6750TestSuit() {
    if (getDriverPaths() != 0) {
        __android_log_print(ANDROID_LOG_ERROR, kLogTag, "cannot find wlan driver : %s",
                            "Wcn6750TestSuit");
    }
    __android_log_print(ANDROID_LOG_DEBUG, kLogTag, "function at: %s", "Wcn6750TestSuit");
}

Wcn6750TestSuit::~Wcn6750TestSuit() {
    __android_log_print(ANDROID_LOG_DEBUG, kLogTag, "function at: %s", "~Wcn6750TestSuit");
}

int Wcn6750TestSuit::getDriverPaths() {
    return listDriverPaths(kLogTag, strings, driverPaths);
}

std::string Wcn6750TestSuit::getBgRateIndex(const std::string& rate) {
    return bgRateIndex(rate);
}

std::string Wcn6750TestSuit::bandwidthIndex(const std::string& bandwidth, bool vht) {
    return bandwidthOption(bandwidth, vht, kLogTag);
}

std::string Wcn6750TestSuit::getAxbandwidthPara(const std::string& bandwidth) {
    return axBandwidthOptions(bandwidth);
}

std::string Wcn6750TestSuit::Wcn6750ParseReceivedPacketNum(const std::string& output) {
    return operations().parseReceivedPacketNum(output);
}

DriverPathOperations Wcn6750TestSuit::operations() {
    return {*this, kLogTag, kWcn6750Chip, driverPaths};
}

} // namespace vendor::korvan::bex::wifi::V1_0::implementation
