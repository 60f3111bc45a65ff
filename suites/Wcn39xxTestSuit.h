// Copyright 2026 The BEX Wi-Fi Authors
// SPDX-License-Identifier: Apache-2.0

#pragma once

#include "suites/FirmwarePathOperations.h"
#include "suites/VendorTestSuit.h"

namespace vendor::korvan::bex::wifi::V1_0::implementation {

/**
 * The radio tests of WCN39xx chips. FirmwarePathOperations has what they share with QcaTestSuit.
 */
class Wcn39xxTestSuit : public VendorTestSuit {
  public:
    Wcn39xxTestSuit();
    ~Wcn39xxTestSuit() override;

    int RunTxBGStart(const std::string& channel, const std::string& rate, const std::string& power,
                     const std::string& antenna) override {
        return operations().RunTxBGStart(channel, rate, power, antenna);
    }
    int RunTxNStart(const std::string& channel, const std::string& bandwidth,
                    const std::string& mcs, const std::string& power, bool vht,
                    const std::string& antenna) override {
        return operations().RunTxNStart(channel, bandwidth, mcs, power, vht, antenna);
    }

    /** Leaves the driver in test mode only: it transmits nothing and uses no argument. */
    int RunTxAxStart(const std::string&, const std::string&, const std::string&, const std::string&,
                     const std::string&, const std::string&) override {
        return operations().RunTxAxStart();
    }

    /** Does not use `bandwidth`. */
    int RunTxStStart(const std::string& channel, const std::string& /*bandwidth*/,
                     const std::string& antenna) override {
        return operations().RunTxStStart(channel, antenna);
    }

    /** Calls RunTxStop, a subclass's own if it has one. */
    int RunTxStStop(const std::string& channel) override { return RunTxStop(channel); }
    int RunTxStop(const std::string& /*channel*/) override { return operations().RunTxStop(); }
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

    /** Prepares the driver as RunTxAxStart does: it receives nothing and uses no argument. */
    int RunRxAxStart(const std::string&, const std::string&, const std::string&, const std::string&,
                     std::string& out) override {
        return operations().RunRxAxStart(out);
    }

    /** Leaves "Rx: " and the packet count in `out`. */
    int RunRxStop(const std::string& /*channel*/, std::string& out) override {
        return operations().RunRxStop(out);
    }

    /** Looks for the driver's module file, for all suites of this class; see findFwPath. */
    int getFwPath();

    /** myftm's rate index of an 802.11b/g/a rate; see bgRateIndex. */
    std::string getBgRateIndex(const std::string& rate);

    /** myftm's protocol index of an 802.11b/g/a rate; see abgProtocolIndex. */
    std::string getAbgProtocalIndex(const std::string& rate);

    /** The packet count in myftm's statistics, the second field; see goodPackets. */
    std::string ParseReceivedPacketNum(const std::string& output);

  private:
    /** The operations of the family, as this chip has them. */
    FirmwarePathOperations operations();
};

} // namespace vendor::korvan::bex::wifi::V1_0::implementation
