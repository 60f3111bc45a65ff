// Copyright 2026 The BEX Wi-Fi Authors
// SPDX-License-Identifier: Apache-2.0

#pragma once

#include "suites/VendorTestSuit.h"

namespace vendor::korvan::bex::wifi::V1_0::implementation {

/** The radio tests of the made-up chips of docs/adding-a-chip.md, through their tool acmerf. */
class AcmeTestSuit : public VendorTestSuit {
  public:
    AcmeTestSuit();
    ~AcmeTestSuit() override;

    int RunTxBGStart(const std::string& channel, const std::string& rate, const std::string& power,
                     const std::string& antenna) override;
    int RunTxNStart(const std::string& channel, const std::string& bandwidth,
                    const std::string& mcs, const std::string& power, bool vht,
                    const std::string& antenna) override;
    int RunTxAxStart(const std::string& channel, const std::string& bandwidth,
                     const std::string& mcs, const std::string& power,
                     const std::string& guardInterval, const std::string& antenna) override;

    /** Does not use `bandwidth`. */
    int RunTxStStart(const std::string& channel, const std::string& bandwidth,
                     const std::string& antenna) override;

    int RunTxStStop(const std::string& channel) override;
    int RunTxStop(const std::string& channel) override;
    int RunRxApJoinHoc(const std::string& ssid, const std::string& address) override;

    // The starts of a reception leave the packet count in `out`, for 802.11ax "ok" or "failure".
    int RunRxBgStart(const std::string& channel, const std::string& rate,
                     const std::string& antenna, std::string& out) override;
    int RunRxNStart(std::string channel, const std::string& bandwidth, const std::string& mcs,
                    bool vht, const std::string& antenna, std::string& out) override;
    int RunRxAxStart(const std::string& channel, const std::string& bandwidth,
                     const std::string& mcs, const std::string& antenna, std::string& out) override;

    /** Leaves the packet count in `out`. */
    int RunRxStop(const std::string& channel, std::string& out) override;
};

} // namespace vendor::korvan::bex::wifi::V1_0::implementation
