// Copyright 2026 The BEX Wi-Fi Authors
// SPDX-License-Identifier: Apache-2.0

#pragma once

namespace android::hardware::host {

/** Sets the properties of /vendor/build.prop. */
void seedProperties();

/** Has the log begin at the priority that the property log.tag names. */
void setLogLevel();

/** Keeps a log that goes into a pipe which nobody reads any more from ending the process. */
void outliveLogReader();

} // namespace android::hardware::host
