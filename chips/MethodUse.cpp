// Copyright 2026 The BEX Wi-Fi Authors
// SPDX-License-Identifier: Apache-2.0

#include "chips/MethodUse.h"

#include <algorithm>

namespace vendor::korvan::bex::wifi {

const MethodUse* findMethodUse(std::string_view family, std::string_view method) {
    for (const MethodUse& use : methodUses()) {
        const auto& families = use.families;
        if (use.method == method &&
            std::find(families.begin(), families.end(), family) != families.end()) {
            return &use;
        }
    }
    return nullptr;
}

} // namespace vendor::korvan::bex::wifi
