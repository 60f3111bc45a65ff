// Copyright 2026 The BEX Wi-Fi Authors
// SPDX-License-Identifier: Apache-2.0

#pragma once

#include "suites/VendorTestSuit.h"

namespace vendor::korvan::bex::wifi::V1_0::implementation {

/**
 * The radio tests of WCN chips, through the private commands of their driver (`iwpriv`). The driver
 * is one module file. Names channels by their number and rates by the driver's names.
 */
class WcnTestSuit : public VendorTestSuit {
  public:
    WcnTestSuit();
    ~WcnTestSuit() override;

    /** Does not use `antenna`. */
    int RunTxBGStart(const std::string& channel, const std::string& rate, const std::string& power,
                     const std::string& antenna) override;

    /** A width that the standard does not have counts as 802.11n, 20 MHz. Does not use `antenna`.
     */
    int RunTxNStart(const std::string& channel, const std::string& bandwidth,
                    const std::string& mcs, const std::string& power, bool vht,
                    const std::string& antenna) override;

    /** Leaves the driver in test mode only: it transmits nothing and uses no argument. */
    int RunTxAxStart(const std::string&, const std::string&, const std::string&, const std::string&,
                     const std::string&, const std::string&) override;

    /** An empty `channel` is channel 1. Does not use `antenna`. */
    int RunTxStStart(const std::string& channel, const std::string& bandwidth,
                     const std::string& antenna) override;

    int RunTxStStop(const std::string& channel) override;

    /** Leaves the driver in test mode. */
    int RunTxStop(const std::string& channel) override;

    int RunRxApJoinHoc(const std::string& ssid, const std::string& address) override;

    /** Leaves the packet count at the start in `out`. Does not use `rate` and `antenna`. */
    int RunRxBgStart(const std::string& channel, const std::string& rate,
                     const std::string& antenna, std::string& out) override;

    /** Calls RunRxBgStart, a subclass's own if it has one, with `mcs` for the rate. */
    int RunRxNStart(std::string channel, const std::string& bandwidth, const std::string& mcs,
                    bool vht, const std::string& antenna, std::string& out) override;

    /** Leaves the driver in test mode only: it receives nothing. Leaves one blank in `out`. */
    int RunRxAxStart(const std::string&, const std::string&, const std::string&, const std::string&,
                     std::string& out) override;

    /** Leaves the packet count in `out`. */
    int RunRxStop(const std::string& channel, std::string& out) override;

    /** Looks for the driver's module file, for all suites of this class; see findFwPath. */
    int getFwPath();

  private:
    /** Reloads the driver in factory test mode, and nothing more. */
    int enterTestMode();

    /** The packet count in the output of the counter command; empty when it failed. */
    std::string packetCount(const std::string& output);
};

} // namespace vendor::korvan::bex::wifi::V1_0::implementation
