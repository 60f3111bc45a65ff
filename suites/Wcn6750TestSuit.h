// Copyright 2026 The BEX Wi-Fi Authors
// SPDX-License-Identifier: Apache-2.0

#pragma once

#include "suites/DriverPathOperations.h"
#include "suites/VendorTestSuit.h"

namespace vendor::korvan::bex::wifi::V1_0::implementation {

/**
 * The radio tests of the WCN6750. DriverPathOperations has what they share with Qca639xTestSuit.
 */
class Wcn6750TestSuit : public VendorTestSuit {
  public:
    Wcn6750TestSuit();
    ~Wcn6750TestSuit() override;

    int RunTxBGStart(const std::string& channel, const std::string& rate, const std::string& power,
                     const std::string& antenna) override {
        return operations().RunTxBGStart(channel, rate, power, antenna);
    }
    int RunTxNStart(const std::string& channel, const std::string& bandwidth,
                    const std::string& mcs, const std::string& power, bool vht,
                    const std::string& antenna) override {
        return operations().RunTxNStart(channel, bandwidth, mcs, power, vht, antenna);
    }
    int RunTxAxStart(const std::string& channel, const std::string& bandwidth,
                     const std::string& mcs, const std::string& power,
                     const std::string& guardInterval, const std::string& antenna) override {
        return operations().RunTxAxStart(channel, bandwidth, mcs, power, guardInterval, antenna);
    }

    /** Does not use `bandwidth`. */
    int RunTxStStart(const std::string& channel, const std::string& /*bandwidth*/,
                     const std::string& antenna) override {
        return operations().RunTxStStart(channel, antenna);
    }

    /** Calls RunTxStop, a subclass's own if it has one. */
    int RunTxStStop(const std::string& channel) override { return RunTxStop(channel); }
    int RunTxStop(const std::string& channel) override { return operations().RunTxStop(channel); }
    int RunRxApJoinHoc(const std::string& ssid, const std::string& address) override {
        return operations().RunRxApJoinHoc(ssid, address);
    }

    // The starts of a reception leave "ok" or "failure" in `out`.
    int RunRxBgStart(const std::string& channel, const std::string& rate,
                     const std::string& antenna, std::string& out) override {
        return operations().RunRxBgStart(channel, rate, antenna, out);
    }
    int RunRxNStart(std::string channel, const std::string& bandwidth, const std::string& mcs,
                    bool vht, const std::string& antenna, std::string& out) override {
        return operations().RunRxNStart(channel, bandwidth, mcs, vht, antenna, out);
    }
    int RunRxAxStart(const std::string& channel, const std::string& bandwidth,
                     const std::string& mcs, const std::string& antenna,
                     std::string& out) override {
        return operations().RunRxAxStart(channel, bandwidth, mcs, antenna, out);
    }

    /** Leaves "Rx: " and the packet count in `out`. */
    int RunRxStop(const std::string& channel, std::string& out) override {
        return operations().RunRxStop(channel, out);
    }

    /** Adds the driver's module files to driverPaths; see listDriverPaths. Returns 0 or -1. */
    int getDriverPaths();

    /** myftm's rate index of an 802.11b/g/a rate; see bgRateIndex. */
    std::string getBgRateIndex(const std::string& rate);

    /** myftm's option for an 802.11n or ac channel width; see bandwidthOption. */
    std::string bandwidthIndex(const std::string& bandwidth, bool vht);

    /** myftm's options for an 802.11ax channel width; see axBandwidthOptions. */
    std::string getAxbandwidthPara(const std::string& bandwidth);

    /** The packet count in myftm's statistics, the third field; see goodPackets. */
    std::string Wcn6750ParseReceivedPacketNum(const std::string& output);

    /** The driver's module files, as the constructor found them. */
    std::vector<std::string> driverPaths;

  private:
    /** The operations of the family, as this chip has them. */
    DriverPathOperations operations();
};

} // namespace vendor::korvan::bex::wifi::V1_0::implementation
