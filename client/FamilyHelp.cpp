// Copyright 2026 The BEX Wi-Fi Authors
// SPDX-License-Identifier: Apache-2.0

#include "client/FamilyHelp.h"

#include <android-base/strings.h>

#include "client/base/Text.h"

namespace vendor::korvan::bex::wifi::client {

std::string familyHelp(const ChipFamily* family, const Command& command) {
    if (family == nullptr) return "";
    const MethodUse* use = findMethodUse(family->name, command.name);
    return std::string("\nChip family of this phone: ") + family->name + "\n" +
           (use == nullptr ? "" : useHelp(*use));
}

std::string useHelp(const MethodUse& use) {
    std::string text;
    if (!use.ignored.empty()) {
        text += wrapped("  ignored: " + ::android::base::Join(use.ignored, ", "), 4);
    }
    for (std::string_view remark : use.remarks) text += wrapped("  " + std::string(remark), 4);
    return text;
}

} // namespace vendor::korvan::bex::wifi::client
