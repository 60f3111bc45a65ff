// Copyright 2026 The BEX Wi-Fi Authors
// SPDX-License-Identifier: Apache-2.0

#pragma once

#include <string>
#include <string_view>
#include <vector>

#include "shell/CommandList.h"
#include "suites/VendorTestSuit.h"

namespace vendor::korvan::bex::wifi::V1_0::implementation {

/** What tells one chip family from another whose driver is every module file of the family. */
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
 * The radio tests of chips whose driver is every module file of the family, through the myftm tool:
 * a start reloads them in factory test mode and runs one myftm command, a stop reloads them
 * normally.
 *
 * Runs everything through the suite that makes it, which has operations of the same names, and logs
 * every line under that name. A module that does not load fails no operation but RunRxStop.
 */
class DriverPathTests {
  public:
    /**
     * @param suit The suite that these are the tests of. Outlives this object.
     * @param tag The suite's log tag.
     * @param chip Lives for the whole process.
     * @param driverPaths The driver's module files, in the order in which they load. Outlives this
     *     object.
     */
    DriverPathTests(VendorTestSuit& suit, const char* tag, const DriverPathChip& chip,
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

    /** Unloads the driver and loads its modules, with a parameter unless that is empty. */
    int reload(const char* method, std::string_view insmod, std::string_view parameter);

    /** Reloads the driver in factory test mode and brings the interface up. */
    int enterTestMode(const char* method);

    /** Enters test mode and runs one myftm command. */
    int start(const char* method, const Tokens& test);

    /** The same, and says in `out` how it went. */
    int startReception(const char* method, const Tokens& test, std::string& out);

    int run(const char* method, const CommandList& list, VendorTestSuit::CmdRunResult& result);
    int run(const char* method, const CommandList& list);

    VendorTestSuit& mSuit;
    const char* const mTag;
    const DriverPathChip& mChip;
    const std::vector<std::string>& mDriverPaths;
};

} // namespace vendor::korvan::bex::wifi::V1_0::implementation
