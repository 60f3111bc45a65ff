// Copyright 2026 The BEX Wi-Fi Authors
// SPDX-License-Identifier: Apache-2.0

#include "suites/BrcmTestSuit.h"

#include <android/log.h>
#include <stdlib.h>

#include "shell/CommandTable.h"
#include "suites/Channel.h"
#include "suites/Reception.h"

namespace vendor::korvan::bex::wifi::V1_0::implementation {

namespace {

constexpr const char* kLogTag = "wifi@1.0-BrcmTestSuit-brcm";

// The rows that the operations share. The quotes are for the shell, and echo -n keeps a newline out
// of the driver's parameter.
// clang-format off
const Command kInterfaceDown = {"ifconfig", "wlan0", "down"};
const Command kInterfaceUp   = {"ifconfig", "wlan0", "up"};
const Command kMfgFirmware   = {"echo", "-n", "\"/etc/firmware/fw_bcmdhd_mfg.bin\"", ">",
                                "/sys/module/bcmdhd/parameters/firmware_path"};
const Command kFirmware      = {"echo", "-n", "\"/etc/firmware/fw_bcmdhd.bin\"", ">",
                                "/sys/module/bcmdhd/parameters/firmware_path"};
const Command kStartTx       = {"wl", "pkteng_start", "00:11:22:33:44:55", "tx", "100", "1024", "0"};
const Command kStopTx        = {"wl", "pkteng_stop", "tx"};
const Command kStartRx       = {"wl", "pkteng_start", "00:11:22:33:44:55", "rx"};

// The chip counts the packets that its packet engine receives as pktengrxdmcast; the listing has
// every other counter too.
const Command kReadCounter   = {"wl", "counters",
                                " | busybox grep pktengrxdmcast | busybox awk "
                                R"('{for(i = 1;i <= NF;i++) {if("pktengrxdmcast" == $i) )"
                                "print $(i + 1)} }'"};
// clang-format on

/** The band as `wl band` names it. */
const char* bandName(const std::string& channel) {
    return is5GHz(channel) ? "a" : "b";
}

} // namespace

BrcmTestSuit::BrcmTestSuit() {
    __android_log_print(ANDROID_LOG_DEBUG, kLogTag, "function at: %s", "BrcmTestSuit");
}

BrcmTestSuit::~BrcmTestSuit() {
    __android_log_print(ANDROID_LOG_DEBUG, kLogTag, "function at: %s", "~BrcmTestSuit");
}

// clang-format off

int BrcmTestSuit::RunTxBGStart(const std::string& channel, const std::string& rate,
                               const std::string& power, const std::string& chain) {
    return runTable(*this, {
        kInterfaceDown,
        kMfgFirmware,
        kInterfaceUp,
        {"wl", "mpc", "0"},
        {"wl", "phy_watchdog", "0"},
        {"wl", "up"},
        {"wl", "country", "ALL"},
        {"wl", "band", bandName(channel)},
        {"wl", is5GHz(channel) ? "5g_rate" : "2g_rate", "-r", rate, "-b 20"},
        {"wl", "channel", channel},
        {"wl", "phy_forcecal", "1"},
        {"wl", "scansuppress", "1"},
        {"wl", "phy_txpwrctrl", "1"},
        {"wl", "txpwr1", "-o -d", power},
        kStopTx,
        {"wl", "txchain", chain},
        kStartTx,
    });
}

int BrcmTestSuit::RunTxNStart(const std::string& channel, const std::string& bandwidth,
                              const std::string& rate, const std::string& power, bool vht,
                              const std::string& chain) {
    const std::string rateCommand =
            vht ? "5g_rate -v" : is5GHz(channel) ? "5g_rate -h" : "2g_rate -h";
    const std::string streams = !vht ? "" : atoi(chain.c_str()) > 2 ? "-s 2" : "-s 1";
    const std::string chanspec = channel + "/" + bandwidth;
    return runTable(*this, {
        kInterfaceDown,
        kMfgFirmware,
        kInterfaceUp,
        {"wl", "down"},
        {"wl", "mpc", "0"},
        {"wl", "phy_watchdog", "0"},
        {"wl", "bw_cap 2g", "3"},
        {"wl", "up"},
        {"wl", "country", "ALL"},
        {"wl", "band", bandName(channel)},
        {"wl", rateCommand, rate, "-b", bandwidth, streams},
        {"wl", "chanspec", chanspec},
        {"wl", "chanspec", "-s 0 -c", channel, "-w", bandwidth, "-b", is5GHz(channel) ? "5" : "2"},
        {"wl", "phy_forcecal", "1"},
        {"wl", "scansuppress", "1"},
        {"wl", "phy_txpwrctrl", "1"},
        {"wl", "txpwr1", "-o -d", power},
        kStopTx,
        {"wl", "txchain", chain},
        kStartTx,
    });
}

int BrcmTestSuit::RunTxAxStart(const std::string&, const std::string&, const std::string&,
                               const std::string&, const std::string&, const std::string&) {
    return runTable(*this, {
        kInterfaceDown,
        kMfgFirmware,
        kInterfaceUp,
        {"wl", "down"},
        {"wl", "mpc", "0"},
        {"wl", "phy_watchdog", "0"},
        {"wl", "bw_cap 2g", "3"},
        {"wl", "up"},
    });
}

int BrcmTestSuit::RunTxStStart(const std::string& channel, const std::string&,
                               const std::string& chain) {
    return runTable(*this, {
        kInterfaceDown,
        kMfgFirmware,
        kInterfaceUp,
        {"wl", "band", bandName(channel)},
        {"wl", "txchain", chain},
        {"wl", "out"},
        {"wl", "fqacurcy", channel},
    });
}

int BrcmTestSuit::RunTxStStop(const std::string&) {
    return runTable(*this, {
        {"wl", "fqacurcy", "0"},
        kInterfaceDown,
        kFirmware,
    });
}

int BrcmTestSuit::RunTxStop(const std::string&) {
    return runTable(*this, {
        kStopTx,
        kInterfaceDown,
        kFirmware,
    });
}

int BrcmTestSuit::RunRxApJoinHoc(const std::string& ssid, const std::string& address) {
    return runTable(*this, {
        kInterfaceDown,
        kMfgFirmware,
        {"ifconfig", "wlan0", address, "up"},
        {"wl", "join", ssid, "imode", "bss"},
        {"wl", "mpc", "0"},
        {"wl", "PM", "0"},
        {"wl", "scansuppress", "1"},
        {"wl", "frameburst", "1"},
        {"wl", "roam_off", "1"},
    });
}

int BrcmTestSuit::RunRxBgStart(const std::string& channel, const std::string&,
                               const std::string& chain, std::string& out) {
    return startReception({"wl", "channel", channel}, channel, chain, out);
}

int BrcmTestSuit::RunRxNStart(std::string channel, const std::string& bandwidth, const std::string&,
                              bool, const std::string& chain, std::string& out) {
    const std::string chanspec = channel + "/" + bandwidth;
    return startReception({"wl", "chanspec", chanspec}, channel, chain, out);
}

int BrcmTestSuit::RunRxAxStart(const std::string&, const std::string&, const std::string&,
                               const std::string&, std::string& out) {
    const int status = runTable(*this, {
        kInterfaceDown,
        kMfgFirmware,
        kInterfaceUp,
        {"wl", "down"},
        {"wl", "mpc", "0"},
        {"wl", "phy_watchdog", "0"},
        {"wl", "up"},
    });
    out = startWord(status);
    return status;
}

int BrcmTestSuit::RunRxStop(const std::string&, std::string& out) {
    const int status = runTable(*this, {
        kReadCounter,
    }, AfterRow{1, [&](const std::string& output) { out = packetCount(output); }});
    RunStopDriver();
    return status;
}

int BrcmTestSuit::RunStopDriver() {
    return runTable(*this, {
        kInterfaceDown,
        kFirmware,
    });
}

int BrcmTestSuit::startReception(const Command& setChannel, const std::string& channel,
                                 const std::string& chain, std::string& out) {
    return runTable(*this, {
        kInterfaceDown,
        kMfgFirmware,
        kInterfaceUp,
        {"wl", "mpc", "0"},
        {"wl", "phy_watchdog", "0"},
        {"wl", "up"},
        {"wl", "country", "ALL"},
        {"wl", "band", bandName(channel)},
        setChannel,
        {"wl", "phy_forcecal", "1"},
        {"wl", "scansuppress", "1"},
        {"wl", "rxchain", chain},
        kStartRx,
        kReadCounter,
    }, AfterRow{14, [&](const std::string& output) { out = packetCount(output); }});
}

// clang-format on

std::string BrcmTestSuit::packetCount(const std::string& output) {
    return countWithout(*this, "pktengrxdmcast", output);
}

} // namespace vendor::korvan::bex::wifi::V1_0::implementation
