// Copyright 2026 The BEX Wi-Fi Authors
// SPDX-License-Identifier: Apache-2.0

#pragma once

#include <cstdint>
#include <string>
#include <vector>

namespace vendor::korvan::bex::wifi::V1_0::implementation {

/**
 * The radio tests of one chip family. Each operation runs a table of command lines for the chip's
 * tools, all of them even when one fails, and returns 0 when every one succeeded, else -1.
 * The families that load every module of a folder tolerate an "insmod" that fails.
 *
 * Arguments are text and go into the command lines unchecked. IWifiService says which forms make
 * sense; each class says which arguments it does not use. Operations that take `out` leave there
 * the text for the client: a packet count or a status word.
 *
 * A suite has no state of its own that an operation changes, so two threads may run two operations;
 * their commands then interleave on the same radio.
 */
class VendorTestSuit {
  public:
    /** The result of one command. */
    struct CmdRunResult {
        /** 0 when the command ran and ended with exit status 0, else -1. */
        int32_t status = -1;
        /** What the command wrote to its standard output when status is 0, else empty. */
        std::string output;
    };

    VendorTestSuit();
    virtual ~VendorTestSuit();
    VendorTestSuit(const VendorTestSuit&) = delete;
    VendorTestSuit& operator=(const VendorTestSuit&) = delete;

    /** Starts continuous 802.11b/g (and a) transmission. */
    virtual int RunTxBGStart(const std::string& channel, const std::string& rate,
                             const std::string& power, const std::string& antenna) = 0;

    /** Starts continuous 802.11n (vht false) or 802.11ac (vht true) transmission. */
    virtual int RunTxNStart(const std::string& channel, const std::string& bandwidth,
                            const std::string& rate, const std::string& power, bool vht,
                            const std::string& antenna) = 0;

    /** Starts continuous 802.11ax transmission. */
    virtual int RunTxAxStart(const std::string& channel, const std::string& bandwidth,
                             const std::string& rate, const std::string& power,
                             const std::string& guardInterval, const std::string& antenna) = 0;

    /** Starts a single tone on the channel's centre frequency. */
    virtual int RunTxStStart(const std::string& channel, const std::string& bandwidth,
                             const std::string& antenna) = 0;

    /** Ends the single tone. */
    virtual int RunTxStStop(const std::string& channel) = 0;

    /** Ends a continuous transmission. */
    virtual int RunTxStop(const std::string& channel) = 0;

    /** Joins an open access point, for a check over the air. */
    virtual int RunRxApJoinHoc(const std::string& ssid, const std::string& address) = 0;

    /** Starts 802.11b/g (and a) reception. */
    virtual int RunRxBgStart(const std::string& channel, const std::string& rate,
                             const std::string& antenna, std::string& out) = 0;

    /** Starts 802.11n or 802.11ac reception. */
    virtual int RunRxNStart(std::string channel, const std::string& bandwidth,
                            const std::string& rate, bool vht, const std::string& antenna,
                            std::string& out) = 0;

    /** Starts 802.11ax reception. */
    virtual int RunRxAxStart(const std::string& channel, const std::string& bandwidth,
                             const std::string& rate, const std::string& antenna,
                             std::string& out) = 0;

    /** Ends a reception and reads its packet count into `out`. */
    virtual int RunRxStop(const std::string& channel, std::string& out) = 0;

    /** Runs one command line and collects its output in `result`; see runCommand. */
    virtual void runCmdCom(const std::string& cmd, CmdRunResult& result);

    /**
     * Replaces the first `from` in `src` by `to`, again and again from the start, until there is
     * none: ("a-b-c", "-", " ") gives "a b c", ("aaaab", "ab", "b") gives "b". Takes time in
     * proportion to the text and the number of replacements.
     *
     * Never ends when each replacement makes another occurrence: when `to` contains `from` (an
     * empty `from` is in every text), and for some other pairs, such as "ab" by "bbaa".
     */
    virtual std::string replaceSubString(const std::string& src, const std::string& from,
                                         const std::string& to);

    /**
     * Splits at every `sep`. A separator at the end adds no empty piece, one at the start and two
     * in a row do: ("a  b ", " ") gives "a", "", "b". Never ends when `sep` is empty.
     */
    virtual std::vector<std::string> splitString(const std::string& str, const std::string& sep);
};

} // namespace vendor::korvan::bex::wifi::V1_0::implementation
