// Copyright 2026 The BEX Wi-Fi Authors
// SPDX-License-Identifier: Apache-2.0

#pragma once

#include <cstddef>

namespace vendor::korvan::bex::wifi::client {

/**
 * The width of a terminal at the moment, in columns: what it tells itself, else what the
 * environment variable COLUMNS has, such as where a serial line knows no size, else 80.
 */
size_t terminalColumns(int fd);

} // namespace vendor::korvan::bex::wifi::client
