// Copyright 2026 The BEX Wi-Fi Authors
// SPDX-License-Identifier: Apache-2.0

#pragma once

#include <string>
#include <vector>

#include "shell/CommandTable.h"
#include "suites/VendorTestSuit.h"

namespace vendor::korvan::bex::wifi::V1_0::implementation {

/** How the chip families whose driver is several module files differ. */
struct DriverPathChip {
    /** The option that chooses the chip's radios, before any test. */
    const char* radios;
    /** The value of -I on a channel of the 2.4 GHz band. */
    const char* in24GHz;
    /** The value of -I on a channel of the 5 GHz band. */
    const char* in5GHz;
    /** The option that ends a reception. */
    const char* endRx;
};

// clang-format off
//                                              radios      in24GHz  in5GHz  endRx
inline constexpr DriverPathChip kQca639xChip = {"-B dbs",   "1",     "0",    "-t 0"};
inline constexpr DriverPathChip kWcn6750Chip = {"-B phya",  "0",     "0",    "-x 0"};
// clang-format on

/**
 * The operations of a suite whose chips have a driver of several module files and the tool myftm: a
 * start reloads all of them in factory test mode and runs one myftm command, a stop reloads them
 * normally.
 *
 * The suite's runCmdCom runs every line, which is logged with the operation's name. A module that
 * cannot be loaded fails RunRxStop only.
 */
class DriverPathOperations {
  public:
    /**
     * @param suit The suite whose operations these are.
     * @param tag The suite's log tag.
     * @param driverPaths The driver's module files, in the order in which they load.
     */
    DriverPathOperations(VendorTestSuit& suit, const char* tag, const DriverPathChip& chip,
                         const std::vector<std::string>& driverPaths);

    int RunTxBGStart(const std::string& channel, const std::string& rate, const std::string& power,
                     const std::string& antenna);
    int RunTxNStart(const std::string& channel, const std::string& bandwidth,
                    const std::string& mcs, const std::string& power, bool vht,
                    const std::string& antenna);
    int RunTxAxStart(const std::string& channel, const std::string& bandwidth,
                     const std::string& mcs, const std::string& power,
                     const std::string& guardInterval, const std::string& antenna);
    int RunTxStStart(const std::string& channel, const std::string& antenna);
    int RunTxStop(const std::string& channel);
    int RunRxApJoinHoc(const std::string& ssid, const std::string& address);
    int RunRxBgStart(const std::string& channel, const std::string& rate,
                     const std::string& antenna, std::string& out);
    int RunRxNStart(const std::string& channel, const std::string& bandwidth,
                    const std::string& mcs, bool vht, const std::string& antenna, std::string& out);
    int RunRxAxStart(const std::string& channel, const std::string& bandwidth,
                     const std::string& mcs, const std::string& antenna, std::string& out);
    int RunRxStop(const std::string& channel, std::string& out);

    /** The packet count in what the stop of a reception printed, newlines turned into blanks. */
    std::string parseReceivedPacketNum(const std::string& output);

  private:
    /** The value of -I. */
    const char* bandFlag(const std::string& channel) const;

    /** The commands that reload the driver in factory test mode and bring the interface up. */
    CommandTable testMode() const;

    /** The commands that end the test by the option `end` and reload the driver normally. */
    CommandTable endAndReload(const std::string& channel, const char* end,
                              const char* insmod) const;

    /** Enters test mode and runs one myftm command. */
    int start(const char* method, const Command& test);

    /** The same for a reception, with "ok" or "failure" in `out`. */
    int startReception(const char* method, const Command& test, std::string& out);

    int runCommandList(const char* method, const CommandTable& list, const AfterRow& after = {});

    VendorTestSuit& mSuit;
    const char* const mTag;
    const DriverPathChip mChip;
    const std::vector<std::string> mDriverPaths;
};

} // namespace vendor::korvan::bex::wifi::V1_0::implementation
