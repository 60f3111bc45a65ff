// Copyright 2026 The BEX Wi-Fi Authors
// SPDX-License-Identifier: Apache-2.0

#include "suites/FirmwarePathTests.h"

#include <algorithm>

#include "suites/Bandwidth.h"
#include "suites/Channel.h"
#include "suites/Rates.h"
#include "suites/Reception.h"

namespace vendor::korvan::bex::wifi::V1_0::implementation {

namespace {

constexpr std::string_view kEndTx = "-t 0";
constexpr std::string_view kEndRx = "-x 0";

// The field of myftm's statistics that holds the count: right behind the label.
constexpr size_t kCountField = 1;

} // namespace

// clang-format off

// QCA transmits b/g with the options of a reception, and knows no power for it.
constexpr FirmwarePathChip kQcaChip = {
    /* tools     */ {"myftm", "rmmod", "insmod", "sleep",
                     "ifconfig", "iwlist", "iwconfig", "ping"},
    /* testLoad  */ DriverLoad::TestMode,
    /* idleLoad  */ DriverLoad::Normal,
    /* bgEnd     */ kEndRx,
    /* bgOptions */ [](const BgTransmission& test) -> Row {
                        return {"-a", test.antenna, "-f", test.frequency, "-r", test.rateIndex,
                                "-M", test.protocolIndex, "-x 1"};
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
    /* bgOptions */ [](const BgTransmission& test) -> Row {
                        return {"--dpdflag -a", test.antenna, "-r", test.rateIndex,
                                "-f", test.frequency, "-p", test.power, "-t 3"};
                    },
    /* nAntenna  */ "--dpdflag -a",
    /* addressUp */ "",
};

// clang-format on

FirmwarePathTests::FirmwarePathTests(VendorTestSuit& suit, const char* tag,
                                     const FirmwarePathChip& chip, const std::string& fwPath)
      : mSuit(suit), mTag(tag), mChip(chip), mFwPath(fwPath) {}

// clang-format off

int FirmwarePathTests::RunTxBGStart(const std::string& channel, const std::string& rate,
                                    const std::string& power, const std::string& antenna) {
    const BgTransmission test = {antenna, centreFrequency(channel), bgRateIndex(rate),
                                 abgProtocolIndex(rate), power};
    return run(mChip.bgEnd, mChip.testLoad, {
        myftm(mChip.bgOptions(test)),
    });
}

int FirmwarePathTests::RunTxNStart(const std::string& channel, const std::string& bandwidth,
                                   const std::string& mcs, const std::string& power, bool vht,
                                   const std::string& antenna) {
    const std::string mode = bandwidthMode(bandwidth, vht);
    const std::string rateIndex = mcsRateIndex(mcs);
    const std::string frequency = centreFrequency(channel);
    return run(kEndTx, mChip.testLoad, {
        myftm({mChip.nAntenna, antenna, "-M", mode, "-r", rateIndex, "-f", frequency, "-p", power,
               "-t 3"}),
    });
}

int FirmwarePathTests::RunTxAxStart() {
    return run(kEndTx, mChip.idleLoad, {});
}

int FirmwarePathTests::RunTxStStart(const std::string& channel, const std::string& antenna) {
    const std::string frequency = centreFrequency(channel);
    return run(kEndTx, mChip.testLoad, {
        myftm({"-a", antenna, "-f", frequency, "-t 1"}),
    });
}

int FirmwarePathTests::RunTxStop() {
    return run(kEndTx, DriverLoad::Normal, {});
}

int FirmwarePathTests::RunRxApJoinHoc(const std::string& ssid, const std::string& address) {
    return run(kEndRx, mChip.idleLoad, {
        {mChip.tools.iwlist, "wlan0", "scan"},
        {mChip.tools.iwconfig, "wlan0", "essid", ssid},
        {mChip.tools.ifconfig, "wlan0", address, mChip.addressUp},
        {mChip.tools.ping, "-c", "4", "192.168.1.1"},
    });
}

int FirmwarePathTests::RunRxBgStart(const std::string& channel, const std::string& rate,
                                    const std::string& antenna, std::string& out) {
    const std::string frequency = centreFrequency(channel);
    const std::string rateIndex = bgRateIndex(rate);
    const std::string protocolIndex = abgProtocolIndex(rate);
    const int status = run(kEndRx, DriverLoad::ThenTestMode, {
        myftm({"-a", antenna, "-f", frequency, "-r", rateIndex, "-M", protocolIndex, "-x 1"}),
    });
    out = startWord(status);
    return status;
}

int FirmwarePathTests::RunRxNStart(const std::string& channel, const std::string& bandwidth,
                                   const std::string& mcs, bool vht, const std::string& antenna,
                                   std::string& out) {
    const std::string frequency = centreFrequency(channel);
    const std::string mode = bandwidthMode(bandwidth, vht);
    const std::string rateIndex = mcsRateIndex(mcs);
    const int status = run(kEndRx, mChip.testLoad, {
        myftm({"-a", antenna, "-f", frequency, "-M", mode, "-r", rateIndex, "-x 1"}),
    });
    out = startWord(status);
    return status;
}

int FirmwarePathTests::RunRxAxStart(std::string& out) {
    const int status = run(kEndRx, mChip.idleLoad, {});
    out = startWord(status);
    return status;
}

int FirmwarePathTests::RunRxStop(std::string& out) {
    VendorTestSuit::CmdRunResult statistics;
    const int ended = mSuit.runTable({myftm({kEndRx})}, statistics);
    out = receivedText(mSuit, mTag, kCountField, statistics.output);
    // This one load names the tool's folder on every chip.
    const int reloaded = mSuit.runTable({
        {mChip.tools.rmmod, "wlan.ko"},
        {"/vendor/bin/insmod", mFwPath},
    });
    return ended == 0 && reloaded == 0 ? 0 : -1;
}

// clang-format on

std::string FirmwarePathTests::parseReceivedPacketNum(const std::string& output) {
    return goodPackets(mSuit, mTag, kCountField, output);
}

Row FirmwarePathTests::myftm(const Row& options) const {
    Row row = {mChip.tools.myftm};
    std::copy(options.begin(), options.end() - 1, row.begin() + 1);
    return row;
}

int FirmwarePathTests::run(std::string_view end, DriverLoad load, const Table& rows) {
    // rmmod knows the driver by this name whatever its file is called.
    const int loaded = mSuit.runTable({
            myftm({end}),
            {mChip.tools.rmmod, "wlan.ko"},
            {mChip.tools.insmod, mFwPath, load == DriverLoad::TestMode ? "con_mode=5" : ""},
    });
    int switched = 0;
    if (load == DriverLoad::ThenTestMode) {
        switched = mSuit.runTable({
                {mChip.tools.sleep, "1"},
                {mChip.tools.ifconfig, "wlan0", "up"},
                {"echo", "5", ">", "/sys/module/wlan/parameters/con_mode"},
        });
    }
    const int ran = mSuit.runTable(rows);
    return loaded == 0 && switched == 0 && ran == 0 ? 0 : -1;
}

} // namespace vendor::korvan::bex::wifi::V1_0::implementation
