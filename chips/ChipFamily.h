// Copyright 2026 The BEX Wi-Fi Authors
// SPDX-License-Identifier: Apache-2.0

#pragma once

#include <optional>
#include <string>

namespace vendor::korvan::bex::wifi {

/** The chips that are driven in one way. */
enum class ChipFamily { brcm, wcn, qca, qca639x, wcn685x, wcn6750, wcn39xx };

/**
 * Tells which family a phone's chip belongs to.
 *
 * @param vendor The chip's vendor: exactly "broadcom" or "qcom".
 * @param chip The chip's name. It tells the families of a vendor apart by a part of it, upper and
 *     lower case being different; any name, an empty one too, belongs to one.
 * @return Nothing when the vendor is unknown.
 */
std::optional<ChipFamily> chipFamily(const std::string& vendor, const std::string& chip);

} // namespace vendor::korvan::bex::wifi
