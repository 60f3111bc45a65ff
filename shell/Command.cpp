// Copyright 2026 The BEX Wi-Fi Authors
// SPDX-License-Identifier: Apache-2.0

#include "shell/Command.h"

#include <android/log.h>
#include <stdio.h>

#include <utility>

namespace vendor::korvan::bex::wifi::V1_0::implementation {

void runCommand(const std::string& cmd, const char* tag, CommandResult& result) {
    result.status = -1;
    result.output.clear();

    FILE* stream = popen(cmd.c_str(), "r");
    if (stream == nullptr) return;

    std::string collected;
    char piece[256] = {};
    while (fgets(piece, sizeof(piece), stream) != nullptr) {
        if (piece[0] == '\0') continue;
        __android_log_print(ANDROID_LOG_DEBUG, tag, "%s", piece);
        collected += piece;
    }

    if (pclose(stream) == 0) {
        result.status = 0;
        result.output = std::move(collected);
        __android_log_print(ANDROID_LOG_DEBUG, tag, "cmd: \"%s\" %s execution", cmd.c_str(),
                            "successful");
    } else {
        __android_log_print(ANDROID_LOG_ERROR, tag, "cmd: \"%s\" %s execution", cmd.c_str(),
                            "unsuccessful");
    }
}

} // namespace vendor::korvan::bex::wifi::V1_0::implementation
