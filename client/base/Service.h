// Copyright 2026 The BEX Wi-Fi Authors
// SPDX-License-Identifier: Apache-2.0

#pragma once

#include <vendor/korvan/bex/wifi/1.0/IWifiService.h>

#include <functional>

namespace vendor::korvan::bex::wifi::client {

using V1_0::IWifiService;

/** Finds the service; null when there is none. The search may take any time. */
using FindService = std::function<::android::sp<IWifiService>()>;

} // namespace vendor::korvan::bex::wifi::client
