// Copyright 2026 The BEX Wi-Fi Authors
// SPDX-License-Identifier: Apache-2.0

#pragma once

#include <cstdint>
#include <string>

#include "shell/CommandTable.h"

namespace vendor::korvan::bex::wifi::V1_0::implementation {

/** How the phone's init is told to start and stop its two capture services: whole commands. */
struct CaptureServices {
    const char* stopTcpdump;
    const char* startSniffer;
    const char* stopSniffer;
    const char* startTcpdump;
};

/** By system properties, which init watches. */
inline constexpr CaptureServices kByProperties = {
        /* stopTcpdump  */ "setprop vendor.hardware.wlan.runtcpdump stop",
        /* startSniffer */ "setprop vendor.hardware.wlan.runsniffer start",
        /* stopSniffer  */ "setprop vendor.hardware.wlan.runsniffer stop",
        /* startTcpdump */ "setprop vendor.hardware.wlan.runtcpdump start",
};

/**
 * Puts the WLAN driver into monitor mode on a channel, takes it out again and reads its mode, with
 * the mode file of the driver and the `iw` tool. The capture itself is done by two services of the
 * phone's init, which start and stop when their system properties are set.
 *
 * Has no state: the mode lives in the driver.
 */
class SnifferTool {
  public:
    /** The result of one command. */
    struct CmdRunResult {
        /** 0 when the command ran and ended with exit status 0, else -1. */
        int32_t status = -1;
        /** What the command wrote to its standard output when status is 0, else empty. */
        std::string output;
    };

    SnifferTool();
    virtual ~SnifferTool();
    SnifferTool(const SnifferTool&) = delete;
    SnifferTool& operator=(const SnifferTool&) = delete;

    /**
     * Enters monitor mode and starts the capture.
     *
     * @param channel The IEEE 802.11 channel number in decimal.
     * @param bandwidth The channel width in MHz: "20" for HT20; anything else is HT40, with the
     *     second channel above on channels 1, 36 and 149 and below on all others.
     * @return 0 when every command succeeded, else -1.
     */
    virtual int snifferStart(const std::string& channel, const std::string& bandwidth);

    /** Ends the capture and leaves monitor mode, with the interface down. Returns 0 or -1. */
    virtual int snifferStop();

    /** Tells whether the driver is in monitor mode; true also when its mode cannot be read. */
    virtual bool isSnifferMode();

    /** Returns the driver's mode: 0 (normal), 4 (monitor), 5 (factory test), else -1. */
    virtual int getWlanMode();

    /** Runs one command line and collects its output in `result`; see runCommand. */
    void runCmdCom(const std::string& cmd, CmdRunResult& result);

  protected:
    /** Enters monitor mode on the channel that `setChannel` sets, and starts the capture. */
    int enterMonitorMode(const CaptureServices& services, const Command& setChannel);

    /** Ends the capture and leaves monitor mode. */
    int leaveMonitorMode(const CaptureServices& services);

  private:
    /** Reads the driver's mode file; an empty text, with an error line, when it cannot be read. */
    std::string readMode(const char* caller);
};

} // namespace vendor::korvan::bex::wifi::V1_0::implementation
