// Copyright 2026 The BEX Wi-Fi Authors
// SPDX-License-Identifier: Apache-2.0

#pragma once

#include <string>

namespace android::hardware::host {

/**
 * Whether the phone's VINTF manifest declares the instance: /vendor/etc/vintf/manifest.xml or one
 * of the fragments /vendor/etc/vintf/manifest/\*.xml. Both ways of writing an instance count,
 * <interface> below a <version>, and <fqname>; a later minor version declares the earlier ones.
 *
 * @param descriptor A fully qualified name: "vendor.korvan.bex.wifi@1.0::IWifiService".
 */
bool isDeclaredInManifest(const std::string& descriptor, const std::string& instance);

} // namespace android::hardware::host
