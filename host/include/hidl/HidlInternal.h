// Copyright 2026 The BEX Wi-Fi Authors
// SPDX-License-Identifier: Apache-2.0

#pragma once

#include <string>

namespace android::hardware::details {

// What kind of class a generated class is.
struct i_tag {};
struct bnhw_tag {};
struct bphw_tag {};
struct bs_tag {};

/** Writes the line to the log and aborts. */
[[noreturn]] void logAlwaysFatal(const char* message);

/** The generated classes' hook for call tracing, which debuggable builds of a phone use. */
class HidlInstrumentor {
  public:
    HidlInstrumentor(const std::string& /*package*/, const std::string& /*interface*/) {}
    virtual ~HidlInstrumentor() = default;
    void configureInstrumentation(bool /*log*/ = true) {}
};

} // namespace android::hardware::details
