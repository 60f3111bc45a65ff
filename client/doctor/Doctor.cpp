// Copyright 2026 The BEX Wi-Fi Authors
// SPDX-License-Identifier: Apache-2.0

#include "client/doctor/Doctor.h"

#include <iterator>

#include "client/doctor/PhoneChecks.h"
#include "client/doctor/ServiceChecks.h"

namespace vendor::korvan::bex::wifi::client {
namespace {

void append(Checks more, Checks* checks) {
    checks->insert(checks->end(), std::make_move_iterator(more.begin()),
                   std::make_move_iterator(more.end()));
}

} // namespace

Checks examine(const FindService& tryFind, const PhoneView& phone,
               std::chrono::nanoseconds timeout) {
    const ChipFamily* family = phoneFamily();
    Checks checks = checkProperties(family);
    append(checkService(tryFind, phone, timeout), &checks);
    append(checkTools(phone.root, family), &checks);
    append(checkDriver(phone.root, family), &checks);
    checks.push_back(checkCommandLog());
    return checks;
}

} // namespace vendor::korvan::bex::wifi::client
