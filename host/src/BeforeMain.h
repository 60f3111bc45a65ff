// Copyright 2026 The BEX Wi-Fi Authors
// SPDX-License-Identifier: Apache-2.0

#pragma once

namespace android::hardware::host {

/** Sets the properties of /vendor/build.prop. */
void seedProperties();

/** Sets the lowest priority that is logged to the one that the property log.tag names. */
void setLogLevel();

/** Keeps the process alive when its log goes into a pipe that nobody reads any more. */
void outliveLogReader();

} // namespace android::hardware::host
