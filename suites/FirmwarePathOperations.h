// Copyright 2026 The BEX Wi-Fi Authors
// SPDX-License-Identifier: Apache-2.0

#pragma once

#include <string>

#include "shell/CommandTable.h"
#include "suites/VendorTestSuit.h"

namespace vendor::korvan::bex::wifi::V1_0::implementation {

/** The tools of a phone, as its shell finds them. */
struct FirmwarePathTools {
    const char *myftm, *rmmod, *insmod, *sleep, *ifconfig, *iwlist, *iwconfig, *ping;
};

/** How the driver's module is loaded. */
enum class DriverLoad {
    Normal,
    /** In factory test mode, by a parameter of the module. */
    TestMode,
    /** Normally; the interface comes up, and then the running driver is switched to test mode. */
    ThenTestMode,
};

/** The values of an 802.11b/g transmission, in the words of myftm. */
struct BgTransmission {
    std::string antenna, frequency, rateIndex, protocolIndex, power;
};

/** How the chip families whose driver is one module file differ. */
struct FirmwarePathChip {
    FirmwarePathTools tools;
    /** How the driver is loaded for a test; for a b/g reception always ThenTestMode. */
    DriverLoad testLoad;
    /** How it is loaded for joining a network and for 802.11ax, where no test command follows. */
    DriverLoad idleLoad;
    /** The option that ends the running test before an 802.11b/g transmission. */
    const char* bgEnd;
    /** The command of an 802.11b/g transmission. */
    Command (*bgTest)(const BgTransmission& test);
    /** The option before the antenna in an 802.11n transmission. */
    const char* nAntenna;
    /** The word after the address when joining a network; may be empty. */
    const char* addressUp;
};

extern const FirmwarePathChip kQcaChip;
extern const FirmwarePathChip kWcn39xxChip;

/**
 * The operations of a suite whose chips have a driver of one module file and the tool myftm: a
 * start reloads the driver in factory test mode and runs one myftm command, a stop reloads it
 * normally.
 *
 * The suite's runCmdCom runs every line. myftm has two commands that end a test: -t 0 is for
 * transmissions, -x 0 for receptions.
 */
class FirmwarePathOperations {
  public:
    /**
     * @param suit The suite whose operations these are.
     * @param tag The suite's log tag.
     * @param fwPath The driver's module file; empty when there is none. The command that loads it
     *     then ends at the empty word.
     */
    FirmwarePathOperations(VendorTestSuit& suit, const char* tag, const FirmwarePathChip& chip,
                           const std::string& fwPath);

    int RunTxBGStart(const std::string& channel, const std::string& rate, const std::string& power,
                     const std::string& antenna);
    int RunTxNStart(const std::string& channel, const std::string& bandwidth,
                    const std::string& mcs, const std::string& power, bool vht,
                    const std::string& antenna);
    int RunTxAxStart();
    int RunTxStStart(const std::string& channel, const std::string& antenna);
    int RunTxStop();
    int RunRxApJoinHoc(const std::string& ssid, const std::string& address);
    int RunRxBgStart(const std::string& channel, const std::string& rate,
                     const std::string& antenna, std::string& out);
    int RunRxNStart(const std::string& channel, const std::string& bandwidth,
                    const std::string& mcs, bool vht, const std::string& antenna, std::string& out);
    int RunRxAxStart(std::string& out);
    int RunRxStop(std::string& out);

    /** The packet count in what the stop of a reception printed, newlines turned into blanks. */
    std::string parseReceivedPacketNum(const std::string& output);

  private:
    /** Ends the running test, reloads the driver and runs the commands of the next test. */
    int run(const char* end, DriverLoad load, const CommandTable& test);

    /** The same for a reception, with "ok" or "failure" in `out`. */
    int startReception(DriverLoad load, const CommandTable& test, std::string& out);

    VendorTestSuit& mSuit;
    const char* const mTag;
    const FirmwarePathChip mChip;
    const std::string mFwPath;
};

} // namespace vendor::korvan::bex::wifi::V1_0::implementation
