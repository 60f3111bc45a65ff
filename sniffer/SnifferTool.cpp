// Copyright 2026 The BEX Wi-Fi Authors
// SPDX-License-Identifier: Apache-2.0

#include "sniffer/SnifferTool.h"

#include <android/log.h>
#include <stdlib.h>

#include <utility>

#include "shell/Command.h"

namespace vendor::korvan::bex::wifi::V1_0::implementation {

namespace {

constexpr const char* kLogTag = "wifi@1.0-SnifferTool";
const std::string kModeFile = "/sys/module/wlan/parameters/con_mode";

// The modes that the driver's con_mode parameter knows.
constexpr int kMonitorMode = 4;
constexpr int kFactoryTestMode = 5;

/** The HT mode word of `iw set channel`. */
const char* htMode(const std::string& channel, const std::string& bandwidth) {
    if (bandwidth == "20") return "HT20";
    return channel == "1" || channel == "36" || channel == "149" ? "HT40+" : "HT40-";
}

} // namespace

SnifferTool::SnifferTool() {
    __android_log_print(ANDROID_LOG_DEBUG, kLogTag, "%s ", "SnifferTool");
}

SnifferTool::~SnifferTool() {
    __android_log_print(ANDROID_LOG_DEBUG, kLogTag, "%s ", "~SnifferTool");
}

// clang-format off

int SnifferTool::snifferStart(const std::string& channel, const std::string& bandwidth) {
    return enterMonitorMode(kByProperties,
        {"/vendor/bin/iw wlan0 set channel", channel, htMode(channel, bandwidth)});
}

int SnifferTool::snifferStop() {
    return leaveMonitorMode(kByProperties);
}

int SnifferTool::enterMonitorMode(const CaptureServices& services, const Command& setChannel) {
    return runTable(*this, {
        {services.stopTcpdump},
        {"echo 4", ">", kModeFile},
        {"/vendor/bin/ifconfig", "wlan0", "up"},
        setChannel,
        {services.startSniffer},
    });
}

int SnifferTool::leaveMonitorMode(const CaptureServices& services) {
    return runTable(*this, {
        {services.stopSniffer},
        {"/vendor/bin/ifconfig", "wlan0", "down"},
        {"echo 0", ">", kModeFile},
        {services.startTcpdump},
    });
}

// clang-format on

bool SnifferTool::isSnifferMode() {
    const std::string mode = readMode("isSnifferMode");
    return mode.empty() || atoi(mode.c_str()) == kMonitorMode;
}

int SnifferTool::getWlanMode() {
    const std::string mode = readMode("getWlanMode");
    if (mode.empty()) return -1;
    const int value = atoi(mode.c_str());
    return value == 0 || value == kMonitorMode || value == kFactoryTestMode ? value : -1;
}

void SnifferTool::runCmdCom(const std::string& cmd, CmdRunResult& result) {
    result = {};
    if (std::optional<std::string> output = runCommand(cmd, kLogTag)) {
        result = {0, std::move(*output)};
    }
}

std::string SnifferTool::readMode(const char* caller) {
    CmdRunResult result;
    runCmdCom(lineUpToEmptyWord({"/vendor/bin/cat", kModeFile}), result);
    if (result.output.empty()) {
        __android_log_print(ANDROID_LOG_ERROR, kLogTag, "%s return data error!", caller);
    } else {
        __android_log_print(ANDROID_LOG_DEBUG, kLogTag,
                            "wlan con_mode value is : %s , atoi() is %d", result.output.c_str(),
                            atoi(result.output.c_str()));
    }
    return result.output;
}

} // namespace vendor::korvan::bex::wifi::V1_0::implementation
