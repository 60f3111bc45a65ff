// Copyright 2026 The BEX Wi-Fi Authors
// SPDX-License-Identifier: Apache-2.0

#include "suites/DriverPathOperations.h"

#include <stdlib.h>

#include "suites/Bandwidth.h"
#include "suites/Channel.h"
#include "suites/Rates.h"
#include "suites/Reception.h"

namespace vendor::korvan::bex::wifi::V1_0::implementation {

namespace {

// The addresses in the test packets. Transmissions and receptions differ in the third.
constexpr const char* kMacX = "-X 00:03:7F:44:55:11";
constexpr const char* kMacY = "-Y 00:03:7F:44:55:22";
constexpr const char* kTxMacN = "-N 00:03:7F:44:55:33";
constexpr const char* kRxMacN = "-N 00:03:7F:44:55:44";

// The field of myftm's statistics that holds the count: the second after the label.
constexpr size_t kCountField = 2;

/** The number of spatial streams on an antenna selection: 3 and above are both chains. */
const char* streams(const std::string& antenna) {
    return atoi(antenna.c_str()) < 3 ? "1" : "2";
}

} // namespace

DriverPathOperations::DriverPathOperations(VendorTestSuit& suit, const char* tag,
                                           const DriverPathChip& chip,
                                           const std::vector<std::string>& driverPaths)
      : mSuit(suit), mTag(tag), mChip(chip), mDriverPaths(driverPaths) {}

// clang-format off

int DriverPathOperations::RunTxBGStart(const std::string& channel, const std::string& rate,
                                  const std::string& power, const std::string& antenna) {
    return start("RunTxBGStart",
        {"myftm", "-J", "-I", bandFlag(channel), "-a", antenna, "-r", bgRateIndex(rate),
         kMacX, kMacY, kTxMacN, "-M", "0", "-f", centreFrequency(channel), "-p", power,
         "--dpdflag enable", "-t 3"});
}

int DriverPathOperations::RunTxNStart(const std::string& channel, const std::string& bandwidth,
                                 const std::string& mcs, const std::string& power, bool vht,
                                 const std::string& antenna) {
    return start("RunTxNStart",
        {"myftm", "-J", "-I", bandFlag(channel), "-a", antenna, "-k 1",
         bandwidthOption(bandwidth, vht, mTag), kMacX, kMacY, kTxMacN, "-r", mcsRateIndex(mcs),
         "-f", centreFrequency(channel), "-p", power, "--dpdflag enable", "-t 3"});
}

int DriverPathOperations::RunTxAxStart(const std::string& channel, const std::string& bandwidth,
                                  const std::string& mcs, const std::string& power,
                                  const std::string& guardInterval, const std::string& antenna) {
    return start("RunTxAxStart",
        {"myftm", "-J", "-I", bandFlag(channel), "--gI", guardInterval,
         axBandwidthOptions(bandwidth), "-a", antenna, "-k 1", "--nss", streams(antenna),
         kMacX, kMacY, kTxMacN, "-r", mcsRateIndex(mcs), "-f", centreFrequency(channel),
         "-p", power, "--dpdflag enable", "-t 3"});
}

int DriverPathOperations::RunTxStStart(const std::string& channel, const std::string& antenna) {
    return start("RunTxStStart",
        {"myftm", "-J", "-I", bandFlag(channel), kMacX, kMacY, kTxMacN, "-a", antenna, "-k 1",
         "-f", centreFrequency(channel), "-t 1"});
}

int DriverPathOperations::RunTxStop(const std::string& channel) {
    return runCommandList("RunTxStop", endAndReload(channel, "-t 0", "insmod"));
}

int DriverPathOperations::RunRxApJoinHoc(const std::string& ssid, const std::string& address) {
    CommandTable list = testMode();
    list.push_back({"iwlist", "wlan0", "scan"});
    list.push_back({"iwconfig", "wlan0", "essid", ssid});
    list.push_back({"ifconfig", "wlan0", address, "up"});
    list.push_back({"ping", "-c", "4", "192.168.1.1"});
    return runCommandList("RunRxApJoinHoc", list);
}

int DriverPathOperations::RunRxBgStart(const std::string& channel, const std::string& rate,
                                  const std::string& antenna, std::string& out) {
    return startReception("RunRxBgStart",
        {"myftm", "-J", "-I", bandFlag(channel), kMacX, kMacY, kRxMacN, "-a", antenna,
         "-f", centreFrequency(channel), "-r", bgRateIndex(rate), "-M", "0", "-x 1"}, out);
}

int DriverPathOperations::RunRxNStart(const std::string& channel, const std::string& bandwidth,
                                 const std::string& mcs, bool vht, const std::string& antenna,
                                 std::string& out) {
    return startReception("RunRxNStart",
        {"myftm", "-J", "-I", bandFlag(channel), kMacX, kMacY, kRxMacN, "-a", antenna,
         "-f", centreFrequency(channel), bandwidthOption(bandwidth, vht, mTag),
         "-r", mcsRateIndex(mcs), "-x 1"}, out);
}

int DriverPathOperations::RunRxAxStart(const std::string& channel, const std::string& bandwidth,
                                  const std::string& mcs, const std::string& antenna,
                                  std::string& out) {
    return startReception("RunRxAxStart",
        {"myftm", "-J", "-I", bandFlag(channel), axBandwidthOptions(bandwidth),
         kMacX, kMacY, kRxMacN, "--nss", streams(antenna), "-a", antenna,
         "-f", centreFrequency(channel), "-r", mcsRateIndex(mcs), "-x 1"}, out);
}

int DriverPathOperations::RunRxStop(const std::string& channel, std::string& out) {
    // A line that calls insmod by its path must succeed.
    return runCommandList("RunRxStop", endAndReload(channel, mChip.endRx, "/vendor/bin/insmod"),
        AfterRow{1, [&](const std::string& output) {
            out = receivedText(mSuit, mTag, kCountField, output);
        }});
}

// clang-format on

std::string DriverPathOperations::parseReceivedPacketNum(const std::string& output) {
    return goodPackets(mSuit, mTag, kCountField, output);
}

const char* DriverPathOperations::bandFlag(const std::string& channel) const {
    return is5GHz(channel) ? mChip.in5GHz : mChip.in24GHz;
}

CommandTable DriverPathOperations::testMode() const {
    CommandTable list = {{"rmmod", "wlan.ko"}};
    for (const std::string& path : mDriverPaths) list.push_back({"insmod", path, "con_mode=5"});
    list.push_back({"sleep 1.5"});
    list.push_back({"ifconfig", "wlan0", "up"});
    return list;
}

CommandTable DriverPathOperations::endAndReload(const std::string& channel, const char* end,
                                                const char* insmod) const {
    CommandTable list = {{"myftm", "-J", "-I", bandFlag(channel), end}, {"rmmod", "wlan.ko"}};
    for (const std::string& path : mDriverPaths) list.push_back({insmod, path});
    return list;
}

int DriverPathOperations::start(const char* method, const Command& test) {
    CommandTable list = testMode();
    list.push_back({"myftm", "-J", mChip.radios});
    list.push_back(test);
    return runCommandList(method, list);
}

int DriverPathOperations::startReception(const char* method, const Command& test,
                                         std::string& out) {
    const int status = start(method, test);
    out = startWord(status);
    return status;
}

int DriverPathOperations::runCommandList(const char* method, const CommandTable& list,
                                         const AfterRow& after) {
    return runLoggedTable(mSuit, mTag, method, list, after);
}

} // namespace vendor::korvan::bex::wifi::V1_0::implementation
