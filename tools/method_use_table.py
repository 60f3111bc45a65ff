# Copyright 2026 The BEX Wi-Fi Authors
# SPDX-License-Identifier: Apache-2.0
"""The content of chips/MethodUseTable.cpp: the ignored arguments and the remarks of each method."""

HEAD = """\
// Copyright 2026 The BEX Wi-Fi Authors
// SPDX-License-Identifier: Apache-2.0

// Written by `./dev catalogue` from the running code; do not edit.

#include "chips/MethodUse.h"

namespace vendor::korvan::bex::wifi {

// clang-format off
const std::vector<MethodUse>& methodUses() {
    static const std::vector<MethodUse> kUses = {
"""

TAIL = """\
    };
    return kUses;
}
// clang-format on

} // namespace vendor::korvan::bex::wifi
"""


def quoted(texts):
    return "{" + ", ".join(f'"{text}"' for text in texts) + "}"


def text(uses):
    """The source file, from the uses of each family's methods."""
    families = {}
    for by_method in zip(*uses.values()):
        for family, use in zip(uses, by_method):
            if use.ignored() or use.remarks():
                entry = (use.method.name, use.ignored(), tuple(use.remarks()))
                families.setdefault(entry, []).append(family)
    rows = [f'        {{"{method}", {quoted(sharing)},\n'
            f'         {quoted(ignored)},\n'
            f'         {quoted(remarks)}}},\n'
            for (method, ignored, remarks), sharing in families.items()]
    return HEAD + "".join(rows) + TAIL
