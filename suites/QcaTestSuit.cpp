// Copyright 2026 The BEX Wi-Fi Authors
// SPDX-License-Identifier: Apache-2.0

#include "suites/QcaTestSuit.h"

#include <android/log.h>

#include "suites/DriverModules.h"
#include "suites/Rates.h"

namespace vendor::korvan::bex::wifi::V1_0::implementation {

namespace {

constexpr const char* kLogTag = "wifi@1.0-QcaTestSuit-qca";

FirmwarePathStrings strings;

} // namespace

QcaTestSuit::QcaTestSuit() {
    if (strings.FwPath.empty() && getFwPath() != 0) {
        __android_log_print(ANDROID_LOG_ERROR, kLogTag, "cannot find wlan driver : %s",
                            "QcaTestSuit");
    }
    __android_log_print(ANDROID_LOG_DEBUG, kLogTag, "function at: %s", "QcaTestSuit");
}

QcaTestSuit::~QcaTestSuit() {
    __android_log_print(ANDROID_LOG_DEBUG, kLogTag, "function at: %s", "~QcaTestSuit");
}

int QcaTestSuit::getFwPath() {
    return findFwPath(kLogTag, strings);
}

std::string QcaTestSuit::getBgRateIndex(const std::string& rate) {
    return bgRateIndex(rate);
}

std::string QcaTestSuit::getAbgProtocalIndex(const std::string& rate) {
    return abgProtocolIndex(rate);
}

std::string QcaTestSuit::ParseReceivedPacketNum(const std::string& output) {
    return operations().parseReceivedPacketNum(output);
}

FirmwarePathOperations QcaTestSuit::operations() {
    return {*this, kLogTag, kQcaChip, strings.FwPath};
}

} // namespace vendor::korvan::bex::wifi::V1_0::implementation
