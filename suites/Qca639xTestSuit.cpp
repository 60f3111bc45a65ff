// Copyright 2026 The BEX Wi-Fi Authors
// SPDX-License-Identifier: Apache-2.0

#include "suites/Qca639xTestSuit.h"

#include <android/log.h>

#include "suites/Bandwidth.h"
#include "suites/DriverModules.h"
#include "suites/Rates.h"

namespace vendor::korvan::bex::wifi::V1_0::implementation {

namespace {

constexpr const char* kLogTag = "wifi@1.0-Qca639xTestSuit.qca639x";

const DriverPathStrings strings;

} // namespace

Qca639xTestSuit::Qca639xTestSuit() {
    if (getDriverPaths() != 0) {
        __android_log_print(ANDROID_LOG_ERROR, kLogTag, "cannot find wlan driver : %s",
                            "Qca639xTestSuit");
    }
    __android_log_print(ANDROID_LOG_DEBUG, kLogTag, "function at: %s", "Qca639xTestSuit");
}

Qca639xTestSuit::~Qca639xTestSuit() {
    __android_log_print(ANDROID_LOG_DEBUG, kLogTag, "function at: %s", "~Qca639xTestSuit");
}

int Qca639xTestSuit::getDriverPaths() {
    return listDriverPaths(kLogTag, strings, driverPaths);
}

std::string Qca639xTestSuit::getBgRateIndex(const std::string& rate) {
    return bgRateIndex(rate);
}

std::string Qca639xTestSuit::bandwidthIndex(const std::string& bandwidth, bool vht) {
    return bandwidthOption(bandwidth, vht, kLogTag);
}

std::string Qca639xTestSuit::getAxbandwidthPara(const std::string& bandwidth) {
    return axBandwidthOptions(bandwidth);
}

std::string Qca639xTestSuit::Qca639xParseReceivedPacketNum(const std::string& output) {
    return operations().parseReceivedPacketNum(output);
}

DriverPathOperations Qca639xTestSuit::operations() {
    return {*this, kLogTag, kQca639xChip, driverPaths};
}

} // namespace vendor::korvan::bex::wifi::V1_0::implementation
