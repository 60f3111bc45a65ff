// Copyright 2026 The BEX Wi-Fi Authors
// SPDX-License-Identifier: Apache-2.0

#pragma once

#include <set>
#include <string>

namespace android::hardware::host {

/**
 * The instances of an interface that the phone's VINTF manifest declares, sorted:
 * /vendor/etc/vintf/manifest.xml and the fragments /vendor/etc/vintf/manifest/\*.xml. Both ways of
 * writing an instance count, <interface> below a <version>, and <fqname>; a later minor version
 * declares the earlier ones.
 *
 * @param descriptor A fully qualified name: "vendor.korvan.bex.wifi@1.0::IWifiService".
 */
std::set<std::string> instancesInManifest(const std::string& descriptor);

/** Whether the manifest declares the instance. */
bool isDeclaredInManifest(const std::string& descriptor, const std::string& instance);

} // namespace android::hardware::host
