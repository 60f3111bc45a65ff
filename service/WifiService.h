// Copyright 2026 The BEX Wi-Fi Authors
// SPDX-License-Identifier: Apache-2.0

#pragma once

#include <vendor/korvan/bex/wifi/1.0/IWifiService.h>

#include <string>

#include "sniffer/SnifferTool.h"
#include "suites/VendorTestSuit.h"

namespace vendor::korvan::bex::wifi::V1_0::implementation {

using ::android::hardware::hidl_string;
using ::android::hardware::Return;

// What drives the phone's chip. WifiService's constructor sets them, and its destructor resets
// them; they stay null when the phone names no known vendor. Calls on the binder threads read them
// without a lock, since they are set before the service is registered.
extern VendorTestSuit* vendorTestSuit;
extern SnifferTool* snifferTool;

/**
 * The service object: hands every call to the suite or the sniffer controller of the phone's chip.
 * Its constructor chooses them by the properties ro.hardware.wlan.vendor and ro.hardware.wlan.chip.
 * A process makes one.
 *
 * Does not queue calls: two that overlap interleave their commands on the same radio. On a phone
 * whose vendor is unknown, a call that needs the missing object ends the process.
 */
class WifiService : public IWifiService {
  public:
    WifiService();
    ~WifiService() override;

    // The sniffer controller's.
    Return<int32_t> snifferStart(const hidl_string& channel, const hidl_string& bandwidth) override;
    Return<int32_t> snifferStop() override;
    Return<bool> isSnifferMode() override;
    Return<int32_t> getWlanMode() override;

    // The service's own, from the property ro.hardware.wlan.mimo.
    Return<bool> isMimoSupport() override;

    // The suite's.
    Return<int32_t> RunTxBGStart(const hidl_string& channel, const hidl_string& rate,
                                 const hidl_string& power, const hidl_string& antenna) override;
    Return<int32_t> RunTxNStart(const hidl_string& channel, const hidl_string& bandwidth,
                                const hidl_string& rate, const hidl_string& power, bool vht,
                                const hidl_string& antenna) override;
    Return<int32_t> RunTxAxStart(const hidl_string& channel, const hidl_string& bandwidth,
                                 const hidl_string& rate, const hidl_string& power,
                                 const hidl_string& guardInterval,
                                 const hidl_string& antenna) override;
    Return<int32_t> RunTxStop(const hidl_string& channel) override;
    Return<int32_t> RunTxStStart(const hidl_string& channel, const hidl_string& bandwidth,
                                 const hidl_string& antenna) override;
    Return<int32_t> RunTxStStop(const hidl_string& channel) override;
    Return<int32_t> RunRxApJoinHoc(const hidl_string& ssid, const hidl_string& address) override;
    Return<void> RunRxBgStart(const hidl_string& channel, const hidl_string& rate,
                              const hidl_string& antenna, RunRxBgStart_cb callback) override;
    Return<void> RunRxNStart(const hidl_string& channel, const hidl_string& bandwidth,
                             const hidl_string& rate, bool vht, const hidl_string& antenna,
                             RunRxNStart_cb callback) override;
    Return<void> RunRxAxStart(const hidl_string& channel, const hidl_string& bandwidth,
                              const hidl_string& rate, const hidl_string& antenna,
                              RunRxAxStart_cb callback) override;
    Return<void> RunRxStop(const hidl_string& channel, RunRxStop_cb callback) override;

    /** The property ro.hardware.wlan.vendor; empty when unset. */
    std::string getWifiVendor();

    /** The property ro.hardware.wlan.chip; empty when unset. */
    std::string getWifiChip();
};

} // namespace vendor::korvan::bex::wifi::V1_0::implementation
