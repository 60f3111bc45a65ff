// Copyright 2026 The BEX Wi-Fi Authors
// SPDX-License-Identifier: Apache-2.0

#include "suites/WcnTestSuit.h"

#include <android/log.h>
#include <stdlib.h>

#include "shell/CommandTable.h"
#include "suites/DriverModules.h"
#include "suites/Rates.h"
#include "suites/Reception.h"

namespace vendor::korvan::bex::wifi::V1_0::implementation {

namespace {

constexpr const char* kLogTag = "wifi@1.0-WcnTestSuit.wcn";

FirmwarePathStrings strings;

// The rows that the operations share. The single tone names the driver without its ending.
// clang-format off
const Command kEndTest      = {"iwpriv wlan0", "ftm 0"};
const Command kBeginTest    = {"iwpriv wlan0", "ftm 1"};
const Command kUnload       = {"rmmod", "wlan.ko"};
const Command kUnloadByTone = {"rmmod", "wlan"};
const Command kReadCounter  = {"iwpriv wlan0", "get_rxpktcnt"};

/** An 802.11n or ac channel in the driver's words: the bonding and the rates. */
struct BondedChannel {
    bool vht;
    int mhz;
    const char* bonding;
    const RateNames& rates;
};

const BondedChannel kBondedChannels[] = {
//   vht    MHz  bonding  rates
    {false, 40,  "2",     kHt40RateNames},
    {true,  20,  "0",     kVht20RateNames},
    {true,  40,  "1",     kVht40RateNames},
    {true,  80,  "4",     kVht80RateNames},
};
// All other widths, 802.11n at 20 and 80 MHz among them.
const BondedChannel kHt20Channel =
    {false, 20,  "0",     kHt20RateNames};
// clang-format on

const BondedChannel& bondedChannel(const std::string& bandwidth, bool vht) {
    for (const BondedChannel& row : kBondedChannels) {
        if (row.vht == vht && row.mhz == atoi(bandwidth.c_str())) return row;
    }
    return kHt20Channel;
}

/** Loads the driver in factory test mode. */
Command loadForTest() {
    return {"insmod", strings.FwPath, "con_mode=5"};
}

Command loadNormally() {
    return {"insmod", strings.FwPath};
}

} // namespace

WcnTestSuit::WcnTestSuit() {
    if (strings.FwPath.empty() && getFwPath() != 0) {
        __android_log_print(ANDROID_LOG_ERROR, kLogTag, "cannot find wlan driver : %s",
                            "WcnTestSuit");
    }
    __android_log_print(ANDROID_LOG_DEBUG, kLogTag, "function at: %s", "WcnTestSuit");
}

WcnTestSuit::~WcnTestSuit() {
    __android_log_print(ANDROID_LOG_DEBUG, kLogTag, "function at: %s", "~WcnTestSuit");
}

// clang-format off

int WcnTestSuit::RunTxBGStart(const std::string& channel, const std::string& rate,
                              const std::string& power, const std::string&) {
    return runTable(*this, {
        kEndTest,
        kUnload,
        loadForTest(),
        kBeginTest,
        {"iwpriv wlan0", "ena_chain 2"},
        {"iwpriv wlan0", "set_channel", channel},
        {"iwpriv wlan0", "pwr_cntl_mode 2"},
        {"iwpriv wlan0", "set_txpower", power},
        {"iwpriv wlan0", "set_txrate", bgRateName(rate)},
        {"iwpriv wlan0", "tx 1"},
    });
}

int WcnTestSuit::RunTxNStart(const std::string& channel, const std::string& bandwidth,
                             const std::string& mcs, const std::string& power, bool vht,
                             const std::string&) {
    const BondedChannel& bonded = bondedChannel(bandwidth, vht);
    return runTable(*this, {
        kEndTest,
        kUnload,
        loadForTest(),
        kBeginTest,
        {"iwpriv wlan0", "ena_chain 2"},
        {"iwpriv wlan0", "set_cb", bonded.bonding},
        {"iwpriv wlan0", "set_channel", channel},
        {"iwpriv wlan0", "pwr_cntl_mode 2"},
        {"iwpriv wlan0", "set_txpower", power},
        {"iwpriv wlan0", "set_txrate", mcsRateName(bonded.rates, mcs)},
        {"iwpriv wlan0", "tx 1"},
    });
}

int WcnTestSuit::RunTxAxStart(const std::string&, const std::string&, const std::string&,
                              const std::string&, const std::string&, const std::string&) {
    return enterTestMode();
}

int WcnTestSuit::RunTxStStart(const std::string& channel, const std::string& bandwidth,
                              const std::string&) {
    return runTable(*this, {
        kUnloadByTone,
        loadForTest(),
        kBeginTest,
        // A tone is bonded as 802.11ac is, whatever the test before it was.
        {"iwpriv wlan0", "set_cb", bondedChannel(bandwidth, true).bonding},
        {"iwpriv wlan0", "set_channel", channel.empty() ? "1" : channel},
        {"iwpriv wlan0", "ena_chain 2"},
        {"iwpriv wlan0", "set_tx_wf_gain 0 1"},
        {"iwpriv wlan0", "tx_cw_rf_gen 1"},
    });
}

int WcnTestSuit::RunTxStStop(const std::string&) {
    return runTable(*this, {
        {"iwpriv wlan0", "tx_cw_rf_gen 0"},
        kEndTest,
        kUnloadByTone,
        loadNormally(),
    });
}

int WcnTestSuit::RunTxStop(const std::string&) {
    return runTable(*this, {
        {"iwpriv wlan0", "tx 0"},
    });
}

int WcnTestSuit::RunRxApJoinHoc(const std::string& ssid, const std::string& address) {
    return runTable(*this, {
        kEndTest,
        kUnload,
        loadNormally(),
        {"iwlist", "wlan0", "scan"},
        {"iwconfig", "wlan0", "essid", ssid},
        {"iwpriv wlan0", "setPower 2"},
        {"iwpriv wlan0", "setPower 10"},
        {"iwpriv wlan0", "setPower 0"},
        {"ifconfig", "wlan0", address},
        {"ping", "-c", "4", "192.168.1.1"},
    });
}

int WcnTestSuit::RunRxBgStart(const std::string& channel, const std::string&, const std::string&,
                              std::string& out) {
    return runTable(*this, {
        kEndTest,
        kUnload,
        loadForTest(),
        kBeginTest,
        {"iwpriv wlan0", "ena_chain 1"},
        {"iwpriv wlan0", "set_channel", channel},
        {"iwpriv wlan0", "rx 0"},
        {"iwpriv wlan0", "clr_rxpktcnt 1"},
        {"iwpriv wlan0", "rx 1"},
        kReadCounter,
    }, AfterRow{10, [&](const std::string& output) { out = packetCount(output); }});
}

int WcnTestSuit::RunRxNStart(std::string channel, const std::string&, const std::string& mcs, bool,
                             const std::string& antenna, std::string& out) {
    return RunRxBgStart(channel, mcs, antenna, out);
}

int WcnTestSuit::RunRxAxStart(const std::string&, const std::string&, const std::string&,
                              const std::string&, std::string& out) {
    const int status = enterTestMode();
    out = " ";
    return status;
}

int WcnTestSuit::RunRxStop(const std::string&, std::string& out) {
    return runTable(*this, {
        kReadCounter,
        kEndTest,
        kUnload,
        loadNormally(),
    }, AfterRow{1, [&](const std::string& output) { out = packetCount(output); }});
}

int WcnTestSuit::enterTestMode() {
    return runTable(*this, {
        kEndTest,
        kUnload,
        loadForTest(),
        kBeginTest,
    });
}

// clang-format on

int WcnTestSuit::getFwPath() {
    return findFwPath(kLogTag, strings);
}

std::string WcnTestSuit::packetCount(const std::string& output) {
    return countWithout(*this, "wlan0     get_rxpktcnt:", output);
}

} // namespace vendor::korvan::bex::wifi::V1_0::implementation
