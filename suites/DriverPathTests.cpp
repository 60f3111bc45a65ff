// Copyright 2026 The BEX Wi-Fi Authors
// SPDX-License-Identifier: Apache-2.0

#include "suites/DriverPathTests.h"

#include <stdlib.h>

#include "suites/Bandwidth.h"
#include "suites/Channel.h"
#include "suites/Rates.h"
#include "suites/Reception.h"

namespace vendor::korvan::bex::wifi::V1_0::implementation {

namespace {

// The addresses in the test packets; a reception wants another third one than a transmission.
constexpr const char* kMacX = "-X 00:03:7F:44:55:11";
constexpr const char* kMacY = "-Y 00:03:7F:44:55:22";
constexpr const char* kTxMacN = "-N 00:03:7F:44:55:33";
constexpr const char* kRxMacN = "-N 00:03:7F:44:55:44";

// The field of myftm's statistics that holds the count: one more stands between it and the label.
constexpr size_t kCountField = 2;

/** The number of spatial streams on an antenna selection: 3 and above are both chains. */
const char* streams(const std::string& antenna) {
    return atoi(antenna.c_str()) < 3 ? "1" : "2";
}

} // namespace

DriverPathTests::DriverPathTests(VendorTestSuit& suit, const char* tag, const DriverPathChip& chip,
                                 const std::vector<std::string>& driverPaths)
      : mSuit(suit), mTag(tag), mChip(chip), mDriverPaths(driverPaths) {}

// clang-format off

int DriverPathTests::RunTxBGStart(const std::string& channel, const std::string& rate,
                                  const std::string& power, const std::string& antenna) {
    return start("RunTxBGStart",
        {"myftm", "-J", "-I", bandFlag(channel), "-a", antenna, "-r", bgRateIndex(rate),
         kMacX, kMacY, kTxMacN, "-M", "0", "-f", centreFrequency(channel), "-p", power,
         "--dpdflag enable", "-t 3"});
}

int DriverPathTests::RunTxNStart(const std::string& channel, const std::string& bandwidth,
                                 const std::string& mcs, const std::string& power, bool vht,
                                 const std::string& antenna) {
    return start("RunTxNStart",
        {"myftm", "-J", "-I", bandFlag(channel), "-a", antenna, "-k 1",
         bandwidthOption(bandwidth, vht, mTag), kMacX, kMacY, kTxMacN, "-r", mcsRateIndex(mcs),
         "-f", centreFrequency(channel), "-p", power, "--dpdflag enable", "-t 3"});
}

int DriverPathTests::RunTxAxStart(const std::string& channel, const std::string& bandwidth,
                                  const std::string& mcs, const std::string& power,
                                  const std::string& guardInterval, const std::string& antenna) {
    return start("RunTxAxStart",
        {"myftm", "-J", "-I", bandFlag(channel), "--gI", guardInterval,
         axBandwidthOptions(bandwidth), "-a", antenna, "-k 1", "--nss", streams(antenna),
         kMacX, kMacY, kTxMacN, "-r", mcsRateIndex(mcs), "-f", centreFrequency(channel),
         "-p", power, "--dpdflag enable", "-t 3"});
}

int DriverPathTests::RunTxStStart(const std::string& channel, const std::string& antenna) {
    return start("RunTxStStart",
        {"myftm", "-J", "-I", bandFlag(channel), kMacX, kMacY, kTxMacN, "-a", antenna, "-k 1",
         "-f", centreFrequency(channel), "-t 1"});
}

int DriverPathTests::RunTxStop(const std::string& channel) {
    const int ended = run("RunTxStop", {{"myftm", "-J", "-I", bandFlag(channel), "-t 0"}});
    const int reloaded = reload("RunTxStop", "insmod", "");
    return ended == 0 && reloaded == 0 ? 0 : -1;
}

int DriverPathTests::RunRxApJoinHoc(const std::string& ssid, const std::string& address) {
    const int entered = enterTestMode("RunRxApJoinHoc");
    const int joined = run("RunRxApJoinHoc", {
        {"iwlist", "wlan0", "scan"},
        {"iwconfig", "wlan0", "essid", ssid},
        {"ifconfig", "wlan0", address, "up"},
        {"ping", "-c", "4", "192.168.1.1"},
    });
    return entered == 0 && joined == 0 ? 0 : -1;
}

int DriverPathTests::RunRxBgStart(const std::string& channel, const std::string& rate,
                                  const std::string& antenna, std::string& out) {
    return startReception("RunRxBgStart",
        {"myftm", "-J", "-I", bandFlag(channel), kMacX, kMacY, kRxMacN, "-a", antenna,
         "-f", centreFrequency(channel), "-r", bgRateIndex(rate), "-M", "0", "-x 1"}, out);
}

int DriverPathTests::RunRxNStart(const std::string& channel, const std::string& bandwidth,
                                 const std::string& mcs, bool vht, const std::string& antenna,
                                 std::string& out) {
    return startReception("RunRxNStart",
        {"myftm", "-J", "-I", bandFlag(channel), kMacX, kMacY, kRxMacN, "-a", antenna,
         "-f", centreFrequency(channel), bandwidthOption(bandwidth, vht, mTag),
         "-r", mcsRateIndex(mcs), "-x 1"}, out);
}

int DriverPathTests::RunRxAxStart(const std::string& channel, const std::string& bandwidth,
                                  const std::string& mcs, const std::string& antenna,
                                  std::string& out) {
    return startReception("RunRxAxStart",
        {"myftm", "-J", "-I", bandFlag(channel), axBandwidthOptions(bandwidth),
         kMacX, kMacY, kRxMacN, "--nss", streams(antenna), "-a", antenna,
         "-f", centreFrequency(channel), "-r", mcsRateIndex(mcs), "-x 1"}, out);
}

int DriverPathTests::RunRxStop(const std::string& channel, std::string& out) {
    VendorTestSuit::CmdRunResult statistics;
    const int ended = run("RunRxStop", {{"myftm", "-J", "-I", bandFlag(channel), mChip.endRx}},
                          statistics);
    out = receivedText(mSuit, mTag, kCountField, statistics.output);
    // With its folder in front, insmod has to succeed.
    const int reloaded = reload("RunRxStop", "/vendor/bin/insmod", "");
    return ended == 0 && reloaded == 0 ? 0 : -1;
}

// clang-format on

std::string DriverPathTests::parseReceivedPacketNum(const std::string& output) {
    return goodPackets(mSuit, mTag, kCountField, output);
}

const char* DriverPathTests::bandFlag(const std::string& channel) const {
    return is5GHz(channel) ? mChip.in5GHz : mChip.in24GHz;
}

int DriverPathTests::reload(const char* method, std::string_view insmod,
                            std::string_view parameter) {
    int status = run(method, {{"rmmod", "wlan.ko"}});
    for (const std::string& path : mDriverPaths) {
        const int loaded = parameter.empty() ? run(method, {{insmod, path}})
                                             : run(method, {{insmod, path, parameter}});
        if (loaded != 0) status = -1;
    }
    return status;
}

int DriverPathTests::enterTestMode(const char* method) {
    const int reloaded = reload(method, "insmod", "con_mode=5");
    const int up = run(method, {{"sleep 1.5"}, {"ifconfig", "wlan0", "up"}});
    return reloaded == 0 && up == 0 ? 0 : -1;
}

int DriverPathTests::start(const char* method, const Tokens& test) {
    const int entered = enterTestMode(method);
    const int started = run(method, {{"myftm", "-J", mChip.radios}, test});
    return entered == 0 && started == 0 ? 0 : -1;
}

int DriverPathTests::startReception(const char* method, const Tokens& test, std::string& out) {
    const int status = start(method, test);
    out = startWord(status);
    return status;
}

int DriverPathTests::run(const char* method, const CommandList& list,
                         VendorTestSuit::CmdRunResult& result) {
    return runList(
            method, mTag, list,
            [this](const std::string& cmd, VendorTestSuit::CmdRunResult& cmdResult) {
                mSuit.runCmdCom(cmd, cmdResult);
            },
            result);
}

int DriverPathTests::run(const char* method, const CommandList& list) {
    VendorTestSuit::CmdRunResult result;
    return run(method, list, result);
}

} // namespace vendor::korvan::bex::wifi::V1_0::implementation
