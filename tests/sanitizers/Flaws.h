// Copyright 2026 The BEX Wi-Fi Authors
// SPDX-License-Identifier: Apache-2.0

#pragma once

#include <string>

/**
 * Does what a sanitizer must report: leak, lost-reference, overflow, use-after-free or undefined
 * with AddressSanitizer and its companions, race, count-race or deadlock with ThreadSanitizer.
 * Returns normally where nothing was reported, also when there is no such flaw.
 *
 *     commitFlaw("leak");
 */
void commitFlaw(const std::string& name);
