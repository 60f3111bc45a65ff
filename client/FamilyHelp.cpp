// Copyright 2026 The BEX Wi-Fi Authors
// SPDX-License-Identifier: Apache-2.0

#include "client/FamilyHelp.h"

#include <android-base/strings.h>

#include "chips/MethodUse.h"

namespace vendor::korvan::bex::wifi::client {

std::string familyHelp(const ChipFamily* family, const Command& command) {
    if (family == nullptr) return "";
    std::string text = std::string("\nChip family of this phone: ") + family->name + "\n";
    const MethodUse* use = findMethodUse(family->name, command.name);
    if (use == nullptr) return text;
    if (!use->ignored.empty()) {
        text += "  ignored: " + ::android::base::Join(use->ignored, ", ") + "\n";
    }
    for (std::string_view remark : use->remarks) text.append("  ").append(remark).append("\n");
    return text;
}

} // namespace vendor::korvan::bex::wifi::client
