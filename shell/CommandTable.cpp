// Copyright 2026 The BEX Wi-Fi Authors
// SPDX-License-Identifier: Apache-2.0

#include "shell/CommandTable.h"

#include <algorithm>

namespace vendor::korvan::bex::wifi::V1_0::implementation {

std::string commandLine(const Row& row) {
    return lineOfWords(row.begin(), std::find(row.begin(), row.end(), std::string_view()));
}

int runTable(const Table& table, const LineRunner& run, CommandResult& result) {
    int status = 0;
    for (const Row& row : table) {
        run(commandLine(row), result);
        if (result.status != 0) status = -1;
    }
    return status;
}

} // namespace vendor::korvan::bex::wifi::V1_0::implementation
