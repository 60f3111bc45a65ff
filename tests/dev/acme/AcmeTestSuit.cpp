// Copyright 2026 The BEX Wi-Fi Authors
// SPDX-License-Identifier: Apache-2.0

#include "suites/AcmeTestSuit.h"

#include <android/log.h>

#include "shell/CommandTable.h"
#include "suites/Reception.h"

namespace vendor::korvan::bex::wifi::V1_0::implementation {

namespace {

constexpr const char* kLogTag = "wifi@1.0-AcmeTestSuit.acme";

// What acmerf prints before the packet count.
constexpr const char* kLabel = "received ";

} // namespace

AcmeTestSuit::AcmeTestSuit() {
    __android_log_print(ANDROID_LOG_DEBUG, kLogTag, "function at: %s", "AcmeTestSuit");
}

AcmeTestSuit::~AcmeTestSuit() {
    __android_log_print(ANDROID_LOG_DEBUG, kLogTag, "function at: %s", "~AcmeTestSuit");
}

// clang-format off

int AcmeTestSuit::RunTxBGStart(const std::string& channel, const std::string& rate,
                               const std::string& power, const std::string& antenna) {
    return runTable(*this, {
        {"ifconfig", "wlan0", "up"},
        {"acmerf", "tx", "bg", channel, rate, power, antenna},
    });
}

int AcmeTestSuit::RunTxNStart(const std::string& channel, const std::string& bandwidth,
                              const std::string& mcs, const std::string& power, bool vht,
                              const std::string& antenna) {
    return runTable(*this, {
        {"ifconfig", "wlan0", "up"},
        {"acmerf", "tx", vht ? "ac" : "n", channel, bandwidth, mcs, power, antenna},
    });
}

int AcmeTestSuit::RunTxAxStart(const std::string& channel, const std::string& bandwidth,
                               const std::string& mcs, const std::string& power,
                               const std::string& guardInterval, const std::string& antenna) {
    return runTable(*this, {
        {"ifconfig", "wlan0", "up"},
        {"acmerf", "tx", "ax", channel, bandwidth, mcs, guardInterval, power, antenna},
    });
}

int AcmeTestSuit::RunTxStStart(const std::string& channel, const std::string& /*bandwidth*/,
                               const std::string& antenna) {
    return runTable(*this, {
        {"ifconfig", "wlan0", "up"},
        {"acmerf", "tone", channel, antenna},
    });
}

int AcmeTestSuit::RunTxStStop(const std::string& channel) {
    return RunTxStop(channel);
}

int AcmeTestSuit::RunTxStop(const std::string& /*channel*/) {
    return runTable(*this, {
        {"acmerf", "stop"},
        {"ifconfig", "wlan0", "down"},
    });
}

int AcmeTestSuit::RunRxApJoinHoc(const std::string& ssid, const std::string& address) {
    return runTable(*this, {
        {"ifconfig", "wlan0", address, "up"},
        {"acmerf", "join", ssid},
    });
}

int AcmeTestSuit::RunRxBgStart(const std::string& channel, const std::string& rate,
                               const std::string& antenna, std::string& out) {
    return runTable(*this, {
        {"ifconfig", "wlan0", "up"},
        {"acmerf", "rx", "bg", channel, rate, antenna},
        {"acmerf", "count"},
    }, AfterRow{3, [&](const std::string& output) { out = countWithout(*this, kLabel, output); }});
}

int AcmeTestSuit::RunRxNStart(std::string channel, const std::string& bandwidth,
                              const std::string& mcs, bool vht, const std::string& antenna,
                              std::string& out) {
    return runTable(*this, {
        {"ifconfig", "wlan0", "up"},
        {"acmerf", "rx", vht ? "ac" : "n", channel, bandwidth, mcs, antenna},
        {"acmerf", "count"},
    }, AfterRow{3, [&](const std::string& output) { out = countWithout(*this, kLabel, output); }});
}

int AcmeTestSuit::RunRxAxStart(const std::string& channel, const std::string& bandwidth,
                               const std::string& mcs, const std::string& antenna,
                               std::string& out) {
    const int status = runTable(*this, {
        {"ifconfig", "wlan0", "up"},
        {"acmerf", "rx", "ax", channel, bandwidth, mcs, antenna},
    });
    out = startWord(status);
    return status;
}

int AcmeTestSuit::RunRxStop(const std::string& /*channel*/, std::string& out) {
    return runTable(*this, {
        {"acmerf", "count"},
        {"acmerf", "stop"},
        {"ifconfig", "wlan0", "down"},
    }, AfterRow{1, [&](const std::string& output) { out = countWithout(*this, kLabel, output); }});
}

// clang-format on

} // namespace vendor::korvan::bex::wifi::V1_0::implementation
