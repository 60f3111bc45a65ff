// Copyright 2026 The BEX Wi-Fi Authors
// SPDX-License-Identifier: Apache-2.0

#pragma once

#include "shell/CommandTable.h"
#include "suites/VendorTestSuit.h"

namespace vendor::korvan::bex::wifi::V1_0::implementation {

/**
 * The radio tests of Broadcom chips under the bcmdhd driver, through the chip's `wl` tool.
 *
 * A start loads the manufacturing firmware: it names the image in the driver's firmware_path
 * parameter while the interface is down, and bringing the interface up makes the driver load it. A
 * stop names the normal image again and leaves the interface down, so that image is loaded when
 * something else next brings the interface up.
 */
class BrcmTestSuit : public VendorTestSuit {
  public:
    BrcmTestSuit();
    ~BrcmTestSuit() override;

    int RunTxBGStart(const std::string& channel, const std::string& rate, const std::string& power,
                     const std::string& chain) override;

    /** With `vht` the rate command names the number of streams too: 2 for chain 3 and above. */
    int RunTxNStart(const std::string& channel, const std::string& bandwidth,
                    const std::string& rate, const std::string& power, bool vht,
                    const std::string& chain) override;

    /** Prepares the chip only: it transmits nothing and uses no argument. */
    int RunTxAxStart(const std::string& channel, const std::string& bandwidth,
                     const std::string& rate, const std::string& power,
                     const std::string& guardInterval, const std::string& chain) override;

    /** Does not use `bandwidth`. */
    int RunTxStStart(const std::string& channel, const std::string& bandwidth,
                     const std::string& chain) override;

    int RunTxStStop(const std::string& channel) override;
    int RunTxStop(const std::string& channel) override;
    int RunRxApJoinHoc(const std::string& ssid, const std::string& address) override;

    /** Leaves the packet count at the start in `out`. Does not use `rate`. */
    int RunRxBgStart(const std::string& channel, const std::string& rate, const std::string& chain,
                     std::string& out) override;

    /** Leaves the packet count at the start in `out`. Does not use `rate` and `vht`. */
    int RunRxNStart(std::string channel, const std::string& bandwidth, const std::string& rate,
                    bool vht, const std::string& chain, std::string& out) override;

    /** Prepares the chip only: it receives nothing. Leaves "ok" or "failure" in `out`. */
    int RunRxAxStart(const std::string& channel, const std::string& bandwidth,
                     const std::string& rate, const std::string& chain, std::string& out) override;

    /**
     * Leaves the packet count in `out` and returns to the normal firmware. The result is that of
     * reading the count alone.
     */
    int RunRxStop(const std::string& channel, std::string& out) override;

    /** Takes the interface down and points the driver at the normal firmware. */
    int RunStopDriver();

  private:
    /** Starts a reception on the channel that `setChannel` tunes to. */
    int startReception(const Command& setChannel, const std::string& channel,
                       const std::string& chain, std::string& out);

    /** The packet count in the output of the counter command; empty when it printed none. */
    std::string packetCount(const std::string& output);
};

} // namespace vendor::korvan::bex::wifi::V1_0::implementation
