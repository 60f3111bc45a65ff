// Copyright 2026 The BEX Wi-Fi Authors
// SPDX-License-Identifier: Apache-2.0

#include "service/WifiService.h"

#include <android-base/properties.h>
#include <android/log.h>

#include "service/ChipChoice.h"

namespace vendor::korvan::bex::wifi::V1_0::implementation {

using ::android::base::GetProperty;
using ::android::hardware::Void;

namespace {

constexpr const char* kLifeLogTag = "wifi@1.0-runCmdWithReturn";
constexpr const char* kLogTag = "wifi@1.0-impl";

/** Ends a reception call: logs a failure, and hands `out` to the client either way. */
Return<void> answer(const char* method, int status, const std::string& out,
                    const std::function<void(const hidl_string&)>& callback) {
    if (status != 0) __android_log_print(ANDROID_LOG_ERROR, kLogTag, "function at: %s", method);
    callback(hidl_string(out));
    return Void();
}

} // namespace

VendorTestSuit* vendorTestSuit = nullptr;
SnifferTool* snifferTool = nullptr;

WifiService::WifiService() {
    const std::string vendor = getWifiVendor();
    const std::string chip = getWifiChip();
    if (const ChipChoice* choice = chooseChip(vendor, chip)) {
        vendorTestSuit = choice->makeSuit();
        snifferTool = choice->makeSniffer();
    }
    if (vendorTestSuit == nullptr) {
        __android_log_print(ANDROID_LOG_ERROR, kLifeLogTag, "func : %s, vendorTestSuit is nullptr!",
                            "WifiService");
    }
    if (snifferTool == nullptr) {
        __android_log_print(ANDROID_LOG_ERROR, kLifeLogTag, "func : %s, snifferTool is nullptr!",
                            "WifiService");
    }
    __android_log_print(ANDROID_LOG_DEBUG, kLifeLogTag, "function at: %s", "WifiService");
}

WifiService::~WifiService() {
    delete vendorTestSuit;
    vendorTestSuit = nullptr;
    delete snifferTool;
    snifferTool = nullptr;
    __android_log_print(ANDROID_LOG_DEBUG, kLifeLogTag, "function at: %s", "~WifiService");
}

Return<int32_t> WifiService::snifferStart(const hidl_string& channel,
                                          const hidl_string& bandwidth) {
    return snifferTool->snifferStart(channel, bandwidth);
}

Return<int32_t> WifiService::snifferStop() {
    return snifferTool->snifferStop();
}

Return<bool> WifiService::isSnifferMode() {
    return snifferTool->isSnifferMode();
}

Return<int32_t> WifiService::getWlanMode() {
    return snifferTool->getWlanMode();
}

Return<bool> WifiService::isMimoSupport() {
    return GetProperty("ro.hardware.wlan.mimo", "") == "1";
}

Return<int32_t> WifiService::RunTxBGStart(const hidl_string& channel, const hidl_string& rate,
                                          const hidl_string& power, const hidl_string& antenna) {
    return vendorTestSuit->RunTxBGStart(channel, rate, power, antenna);
}

Return<int32_t> WifiService::RunTxNStart(const hidl_string& channel, const hidl_string& bandwidth,
                                         const hidl_string& rate, const hidl_string& power,
                                         bool vht, const hidl_string& antenna) {
    return vendorTestSuit->RunTxNStart(channel, bandwidth, rate, power, vht, antenna);
}

Return<int32_t> WifiService::RunTxAxStart(const hidl_string& channel, const hidl_string& bandwidth,
                                          const hidl_string& rate, const hidl_string& power,
                                          const hidl_string& guardInterval,
                                          const hidl_string& antenna) {
    return vendorTestSuit->RunTxAxStart(channel, bandwidth, rate, power, guardInterval, antenna);
}

Return<int32_t> WifiService::RunTxStop(const hidl_string& channel) {
    return vendorTestSuit->RunTxStop(channel);
}

Return<int32_t> WifiService::RunTxStStart(const hidl_string& channel, const hidl_string& bandwidth,
                                          const hidl_string& antenna) {
    return vendorTestSuit->RunTxStStart(channel, bandwidth, antenna);
}

Return<int32_t> WifiService::RunTxStStop(const hidl_string& channel) {
    return vendorTestSuit->RunTxStStop(channel);
}

Return<int32_t> WifiService::RunRxApJoinHoc(const hidl_string& ssid, const hidl_string& address) {
    return vendorTestSuit->RunRxApJoinHoc(ssid, address);
}

Return<void> WifiService::RunRxBgStart(const hidl_string& channel, const hidl_string& rate,
                                       const hidl_string& antenna, RunRxBgStart_cb callback) {
    std::string out;
    const int status = vendorTestSuit->RunRxBgStart(channel, rate, antenna, out);
    return answer("RunRxBgStart", status, out, callback);
}

Return<void> WifiService::RunRxNStart(const hidl_string& channel, const hidl_string& bandwidth,
                                      const hidl_string& rate, bool vht, const hidl_string& antenna,
                                      RunRxNStart_cb callback) {
    std::string out;
    const int status = vendorTestSuit->RunRxNStart(channel, bandwidth, rate, vht, antenna, out);
    return answer("RunRxNStart", status, out, callback);
}

Return<void> WifiService::RunRxAxStart(const hidl_string& channel, const hidl_string& bandwidth,
                                       const hidl_string& rate, const hidl_string& antenna,
                                       RunRxAxStart_cb callback) {
    std::string out;
    const int status = vendorTestSuit->RunRxAxStart(channel, bandwidth, rate, antenna, out);
    return answer("RunRxAxStart", status, out, callback);
}

Return<void> WifiService::RunRxStop(const hidl_string& channel, RunRxStop_cb callback) {
    std::string out;
    const int status = vendorTestSuit->RunRxStop(channel, out);
    return answer("RunRxStop", status, out, callback);
}

std::string WifiService::getWifiVendor() {
    return GetProperty("ro.hardware.wlan.vendor", "");
}

std::string WifiService::getWifiChip() {
    return GetProperty("ro.hardware.wlan.chip", "");
}

} // namespace vendor::korvan::bex::wifi::V1_0::implementation
