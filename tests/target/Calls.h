// Copyright 2026 The BEX Wi-Fi Authors
// SPDX-License-Identifier: Apache-2.0

#pragma once

#include <string>
#include <vector>

#include "tests/target/Call.h"

// The sixteen methods, what each may answer on any phone, and the calls that the tests make.
// Arguments reach a shell on the phone as they stand: no table may hold a character that a shell
// knows.

namespace vendor::korvan::bex::wifi::target {

extern const Form kStatus;
extern const Form kFlag;
extern const Form kMode;
extern const Form kStart;
extern const Form kAxStart;
extern const Form kReceived;

using Wifi = IWifiService;

// clang-format off
constexpr Method kSnifferStart  {"snifferStart",   &Wifi::snifferStart,   kStatus, Effect::capture};
constexpr Method kSnifferStop   {"snifferStop",    &Wifi::snifferStop,    kStatus, Effect::capture};
constexpr Method kIsSnifferMode {"isSnifferMode",  &Wifi::isSnifferMode,  kFlag, Effect::none};
constexpr Method kGetWlanMode   {"getWlanMode",    &Wifi::getWlanMode,    kMode, Effect::none};
constexpr Method kIsMimoSupport {"isMimoSupport",  &Wifi::isMimoSupport,  kFlag, Effect::none};
constexpr Method kRunTxBGStart  {"RunTxBGStart",   &Wifi::RunTxBGStart,   kStatus, Effect::radio};
constexpr Method kRunTxNStart   {"RunTxNStart",    &Wifi::RunTxNStart,    kStatus, Effect::radio};
constexpr Method kRunTxAxStart  {"RunTxAxStart",   &Wifi::RunTxAxStart,   kStatus, Effect::radio};
constexpr Method kRunTxStop     {"RunTxStop",      &Wifi::RunTxStop,      kStatus, Effect::radio};
constexpr Method kRunTxStStart  {"RunTxStStart",   &Wifi::RunTxStStart,   kStatus, Effect::radio};
constexpr Method kRunTxStStop   {"RunTxStStop",    &Wifi::RunTxStStop,    kStatus, Effect::radio};
constexpr Method kRunRxApJoinHoc{"RunRxApJoinHoc", &Wifi::RunRxApJoinHoc, kStatus, Effect::radio};
constexpr Method kRunRxBgStart  {"RunRxBgStart",   &Wifi::RunRxBgStart,   kStart, Effect::radio};
constexpr Method kRunRxNStart   {"RunRxNStart",    &Wifi::RunRxNStart,    kStart, Effect::radio};
constexpr Method kRunRxAxStart  {"RunRxAxStart",   &Wifi::RunRxAxStart,   kAxStart, Effect::radio};
constexpr Method kRunRxStop     {"RunRxStop",      &Wifi::RunRxStop,      kReceived, Effect::radio};
// clang-format on

/** Every method at least once, as a test station would call it. */
std::vector<Call> usualCalls();

/** Every method that takes text, with this text for each argument. */
std::vector<Call> callsWith(const char* text);

/** Numbers at both ends of every argument's range and just outside, each with every method. */
std::vector<Call> edgeCalls();

} // namespace vendor::korvan::bex::wifi::target
