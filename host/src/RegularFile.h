// Copyright 2026 The BEX Wi-Fi Authors
// SPDX-License-Identifier: Apache-2.0

#pragma once

#include <optional>
#include <string>

namespace android::hardware::host {

/**
 * A configuration file's content. Nothing when there is no file. Also nothing, with a line in the
 * log, when it cannot be read or is not a regular file: another kind of file might keep its reader
 * waiting.
 */
std::optional<std::string> readRegularFile(const std::string& path);

} // namespace android::hardware::host
