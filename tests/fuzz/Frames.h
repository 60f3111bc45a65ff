// Copyright 2026 The BEX Wi-Fi Authors
// SPDX-License-Identifier: Apache-2.0

#pragma once

#include <cstdint>
#include <string>
#include <vector>

#include "tests/fuzz/Input.h"
#include "tests/fuzz/Wire.h"

namespace fuzz {

/** A call with some texts, as its proxy writes it. */
Bytes frameOf(uint32_t code, uint32_t flags, const std::vector<std::string>& texts);

/** Any call, patched or not. */
Bytes readFrame(Input& input);

/**
 * A frame that no proxy writes: up to four objects of any sizes, parents and places near those that
 * are allowed. Its header's sizes are those of its payload.
 */
Bytes readLayout(Input& input);

/** Whether a receiver may take a frame: the rules of host/README.md, written a second time. */
bool keepsTheRules(const Bytes& frame);

} // namespace fuzz
