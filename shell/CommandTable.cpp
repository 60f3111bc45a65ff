// Copyright 2026 The BEX Wi-Fi Authors
// SPDX-License-Identifier: Apache-2.0

#include "shell/CommandTable.h"

namespace vendor::korvan::bex::wifi::V1_0::implementation {

std::string lineUpToEmptyWord(const Command& command) {
    std::string line;
    for (const std::string& word : command) {
        if (word.empty()) break;
        line += word + " ";
    }
    return line;
}

std::string lineOfEveryWord(const Command& command) {
    std::string line;
    for (const std::string& word : command) line += word + " ";
    return line;
}

bool isInsmod(const std::string& line) {
    return line.rfind("insmod", 0) == 0;
}

} // namespace vendor::korvan::bex::wifi::V1_0::implementation
