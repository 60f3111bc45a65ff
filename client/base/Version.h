// Copyright 2026 The BEX Wi-Fi Authors
// SPDX-License-Identifier: Apache-2.0

#pragma once

namespace vendor::korvan::bex::wifi::client {

/** The version of the whole project; CHANGELOG.md says what each one changed. */
constexpr char kVersion[] = "0.2.0";

/** The interface that the client was built for, with its frozen hash. */
constexpr char kInterface[] = "vendor.korvan.bex.wifi@1.0::IWifiService";
constexpr char kInterfaceHash[] =
        "14fe62731119fcaaecbf474ac0d1d069b782644bbececbe0991218032ba74d0e";

} // namespace vendor::korvan::bex::wifi::client
