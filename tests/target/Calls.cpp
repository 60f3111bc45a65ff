// Copyright 2026 The BEX Wi-Fi Authors
// SPDX-License-Identifier: Apache-2.0

#include "tests/target/Calls.h"

#include <algorithm>
#include <initializer_list>

namespace vendor::korvan::bex::wifi::target {

namespace {

bool isOneOf(const std::string& text, std::initializer_list<const char*> words) {
    return std::find(words.begin(), words.end(), text) != words.end();
}

/** Digits, as a chip's tool pads them with blanks; none when it counted nothing. */
bool isCount(const std::string& text) {
    const size_t first = std::min(text.find_first_not_of(' '), text.size());
    const size_t end = std::min(text.find_first_not_of("0123456789", first), text.size());
    return text.find_first_not_of(' ', end) == std::string::npos;
}

} // namespace

// clang-format off
const Form kStatus{
    "0 or -1",
    [](const std::string& text) { return isOneOf(text, {"0", "-1"}); }};
const Form kFlag{
    "true or false",
    [](const std::string& text) { return isOneOf(text, {"true", "false"}); }};
const Form kMode{
    "0, 4, 5 or -1",
    [](const std::string& text) { return isOneOf(text, {"0", "4", "5", "-1"}); }};
const Form kStart{
    "\"ok\", \"failure\", a count or nothing",
    [](const std::string& text) { return isOneOf(text, {"ok", "failure"}) || isCount(text); }};
const Form kAxStart{
    "\"ok\", \"failure\" or one blank",
    [](const std::string& text) { return isOneOf(text, {"ok", "failure", " "}); }};
// Behind "Rx: " stands what the chip's tool printed, if that is no number.
const Form kReceived{
    "\"Rx: \" and one line, a count or nothing",
    [](const std::string& text) {
        const bool oneLine = text.find('\n') == std::string::npos;
        return (text.rfind("Rx: ", 0) == 0 && oneLine) || isCount(text);
    }};

std::vector<Call> usualCalls() {
    return {
        kIsMimoSupport(),
        kGetWlanMode(),
        kIsSnifferMode(),
        kRunTxBGStart("6", "54", "15", "1"),
        kRunTxStop("6"),
        kRunTxNStart("36", "80", "9", "12", true, "3"),
        kRunTxStop("36"),
        kRunTxNStart("6", "20", "7", "12", false, "1"),
        kRunTxStop("6"),
        kRunTxAxStart("36", "80", "9", "12", "0", "1"),
        kRunTxStop("36"),
        kRunTxStStart("11", "20", "1"),
        kRunTxStStop("11"),
        kRunRxBgStart("6", "54", "1"),
        kRunRxStop("6"),
        kRunRxNStart("149", "40", "7", false, "2"),
        kRunRxStop("149"),
        kRunRxAxStart("36", "80", "9", "1"),
        kRunRxStop("36"),
        kRunRxApJoinHoc("bex-target-test", "192.168.1.7"),
        kSnifferStart("36", "40"),
        kSnifferStop(),
    };
}

std::vector<Call> callsWith(const char* text) {
    return {
        kRunTxBGStart(text, text, text, text),
        kRunTxNStart(text, text, text, text, false, text),
        kRunTxNStart(text, text, text, text, true, text),
        kRunTxAxStart(text, text, text, text, text, text),
        kRunTxStop(text),
        kRunTxStStart(text, text, text),
        kRunTxStStop(text),
        kRunRxBgStart(text, text, text),
        kRunRxNStart(text, text, text, true, text),
        kRunRxAxStart(text, text, text, text),
        kRunRxStop(text),
        kRunRxApJoinHoc(text, text),
        kSnifferStart(text, text),
        kSnifferStop(),
    };
}

std::vector<Call> edgeCalls() {
    using Values = std::vector<const char*>;
    const Values channels       = {"0", "14", "15", "165", "1000", "-1"};
    const Values bandwidths     = {"0", "10", "20", "40", "80", "160", "320"};
    const Values rates          = {"0", "1", "54", "55", "-1"};
    const Values indices        = {"-1", "0", "11", "12"};
    // Never more than a test station asks for.
    const Values powers         = {"-1", "0"};
    const Values guardIntervals = {"-1", "0", "3", "4"};
    const Values antennas       = {"-1", "0", "3", "4", "1000"};

    // The longest list sets how often; the others start over.
    std::vector<Call> calls;
    for (size_t round = 0; round < bandwidths.size(); ++round) {
        const auto pick = [round](const Values& values) { return values[round % values.size()]; };
        const char* channel = pick(channels);
        const char* bandwidth = pick(bandwidths);
        const char* rate = pick(rates);
        const char* index = pick(indices);
        const char* power = pick(powers);
        const char* antenna = pick(antennas);
        const bool vht = round % 2 == 0;
        calls.insert(calls.end(), {
            kRunTxBGStart(channel, rate, power, antenna),
            kRunTxNStart(channel, bandwidth, index, power, vht, antenna),
            kRunTxAxStart(channel, bandwidth, index, power, pick(guardIntervals), antenna),
            kRunTxStop(channel),
            kRunTxStStart(channel, bandwidth, antenna),
            kRunTxStStop(channel),
            kRunRxBgStart(channel, rate, antenna),
            kRunRxNStart(channel, bandwidth, index, vht, antenna),
            kRunRxAxStart(channel, bandwidth, index, antenna),
            kRunRxStop(channel),
            kSnifferStart(channel, bandwidth),
            kSnifferStop(),
        });
    }
    return calls;
}

// clang-format on

} // namespace vendor::korvan::bex::wifi::target
