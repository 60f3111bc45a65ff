// Copyright 2026 The BEX Wi-Fi Authors
// SPDX-License-Identifier: Apache-2.0

#include "suites/FirmwarePathOperations.h"

#include "suites/Bandwidth.h"
#include "suites/Channel.h"
#include "suites/Rates.h"
#include "suites/Reception.h"

namespace vendor::korvan::bex::wifi::V1_0::implementation {

namespace {

constexpr const char* kEndTx = "-t 0";
constexpr const char* kEndRx = "-x 0";

// The field of myftm's statistics that holds the count: the one after the label.
constexpr size_t kCountField = 1;

} // namespace

// clang-format off

// QCA transmits b/g with the options of a reception, which have no power.
constexpr FirmwarePathChip kQcaChip = {
    /* tools     */ {"myftm", "rmmod", "insmod", "sleep",
                     "ifconfig", "iwlist", "iwconfig", "ping"},
    /* testLoad  */ DriverLoad::TestMode,
    /* idleLoad  */ DriverLoad::Normal,
    /* bgEnd     */ kEndRx,
    /* bgTest    */ [](const BgTransmission& test) -> Command {
                        return {"myftm", "-a", test.antenna, "-f", test.frequency,
                                "-r", test.rateIndex, "-M", test.protocolIndex, "-x 1"};
                    },
    /* nAntenna  */ "-a",
    /* addressUp */ "up",
};

constexpr FirmwarePathChip kWcn39xxChip = {
    /* tools     */ {"/vendor/bin/myftm", "/vendor/bin/rmmod",
                     "/vendor/bin/insmod", "/vendor/bin/sleep",
                     "/vendor/bin/ifconfig", "/vendor/bin/iwlist",
                     "/vendor/bin/iwconfig", "/vendor/bin/ping"},
    /* testLoad  */ DriverLoad::ThenTestMode,
    /* idleLoad  */ DriverLoad::ThenTestMode,
    /* bgEnd     */ kEndTx,
    /* bgTest    */ [](const BgTransmission& test) -> Command {
                        return {"/vendor/bin/myftm", "--dpdflag -a", test.antenna,
                                "-r", test.rateIndex, "-f", test.frequency,
                                "-p", test.power, "-t 3"};
                    },
    /* nAntenna  */ "--dpdflag -a",
    /* addressUp */ "",
};

// clang-format on

FirmwarePathOperations::FirmwarePathOperations(VendorTestSuit& suit, const char* tag,
                                               const FirmwarePathChip& chip,
                                               const std::string& fwPath)
      : mSuit(suit), mTag(tag), mChip(chip), mFwPath(fwPath) {}

// clang-format off

int FirmwarePathOperations::RunTxBGStart(const std::string& channel, const std::string& rate,
                                         const std::string& power, const std::string& antenna) {
    return run(mChip.bgEnd, mChip.testLoad, {
        mChip.bgTest({antenna, centreFrequency(channel), bgRateIndex(rate),
                      abgProtocolIndex(rate), power}),
    });
}

int FirmwarePathOperations::RunTxNStart(const std::string& channel, const std::string& bandwidth,
                                        const std::string& mcs, const std::string& power, bool vht,
                                        const std::string& antenna) {
    return run(kEndTx, mChip.testLoad, {
        {mChip.tools.myftm, mChip.nAntenna, antenna, "-M", bandwidthMode(bandwidth, vht),
         "-r", mcsRateIndex(mcs), "-f", centreFrequency(channel), "-p", power, "-t 3"},
    });
}

int FirmwarePathOperations::RunTxAxStart() {
    return run(kEndTx, mChip.idleLoad, {});
}

int FirmwarePathOperations::RunTxStStart(const std::string& channel, const std::string& antenna) {
    return run(kEndTx, mChip.testLoad, {
        {mChip.tools.myftm, "-a", antenna, "-f", centreFrequency(channel), "-t 1"},
    });
}

int FirmwarePathOperations::RunTxStop() {
    return run(kEndTx, DriverLoad::Normal, {});
}

int FirmwarePathOperations::RunRxApJoinHoc(const std::string& ssid, const std::string& address) {
    return run(kEndRx, mChip.idleLoad, {
        {mChip.tools.iwlist, "wlan0", "scan"},
        {mChip.tools.iwconfig, "wlan0", "essid", ssid},
        {mChip.tools.ifconfig, "wlan0", address, mChip.addressUp},
        {mChip.tools.ping, "-c", "4", "192.168.1.1"},
    });
}

int FirmwarePathOperations::RunRxBgStart(const std::string& channel, const std::string& rate,
                                         const std::string& antenna, std::string& out) {
    return startReception(DriverLoad::ThenTestMode, {
        {mChip.tools.myftm, "-a", antenna, "-f", centreFrequency(channel),
         "-r", bgRateIndex(rate), "-M", abgProtocolIndex(rate), "-x 1"},
    }, out);
}

int FirmwarePathOperations::RunRxNStart(const std::string& channel, const std::string& bandwidth,
                                        const std::string& mcs, bool vht,
                                        const std::string& antenna, std::string& out) {
    return startReception(mChip.testLoad, {
        {mChip.tools.myftm, "-a", antenna, "-f", centreFrequency(channel),
         "-M", bandwidthMode(bandwidth, vht), "-r", mcsRateIndex(mcs), "-x 1"},
    }, out);
}

int FirmwarePathOperations::RunRxAxStart(std::string& out) {
    return startReception(mChip.idleLoad, {}, out);
}

int FirmwarePathOperations::RunRxStop(std::string& out) {
    // This load names insmod's folder on every chip.
    return runTable(mSuit, {
        {mChip.tools.myftm, kEndRx},
        {mChip.tools.rmmod, "wlan.ko"},
        {"/vendor/bin/insmod", mFwPath},
    }, AfterRow{1, [&](const std::string& output) {
        out = receivedText(mSuit, mTag, kCountField, output);
    }});
}

std::string FirmwarePathOperations::parseReceivedPacketNum(const std::string& output) {
    return goodPackets(mSuit, mTag, kCountField, output);
}

int FirmwarePathOperations::run(const char* end, DriverLoad load, const CommandTable& test) {
    // rmmod knows the driver by this name whatever its file is called.
    CommandTable table = {
        {mChip.tools.myftm, end},
        {mChip.tools.rmmod, "wlan.ko"},
        {mChip.tools.insmod, mFwPath, load == DriverLoad::TestMode ? "con_mode=5" : ""},
    };
    if (load == DriverLoad::ThenTestMode) {
        table.push_back({mChip.tools.sleep, "1"});
        table.push_back({mChip.tools.ifconfig, "wlan0", "up"});
        table.push_back({"echo", "5", ">", "/sys/module/wlan/parameters/con_mode"});
    }
    table.insert(table.end(), test.begin(), test.end());
    return runTable(mSuit, table);
}

// clang-format on

int FirmwarePathOperations::startReception(DriverLoad load, const CommandTable& test,
                                           std::string& out) {
    const int status = run(kEndRx, load, test);
    out = startWord(status);
    return status;
}

} // namespace vendor::korvan::bex::wifi::V1_0::implementation
