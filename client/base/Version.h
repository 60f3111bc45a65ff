// Copyright 2026 The BEX Wi-Fi Authors
// SPDX-License-Identifier: Apache-2.0

#pragma once

namespace vendor::korvan::bex::wifi::client {

/** Of the whole project; CHANGELOG.md tells what a version brought. */
constexpr char kVersion[] = "0.2.0";

} // namespace vendor::korvan::bex::wifi::client
