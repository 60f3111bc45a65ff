// Copyright 2026 The BEX Wi-Fi Authors
// SPDX-License-Identifier: Apache-2.0

#include "shell/Command.h"

#include <android/log.h>
#include <stdio.h>

namespace vendor::korvan::bex::wifi::V1_0::implementation {

std::optional<std::string> runCommand(const std::string& cmd, const char* tag) {
    FILE* stream = popen(cmd.c_str(), "r");
    if (stream == nullptr) return std::nullopt;

    std::string collected;
    char piece[256] = {};
    while (fgets(piece, sizeof(piece), stream) != nullptr) {
        if (piece[0] == '\0') continue;
        __android_log_print(ANDROID_LOG_DEBUG, tag, "%s", piece);
        collected += piece;
    }

    const bool succeeded = pclose(stream) == 0;
    __android_log_print(succeeded ? ANDROID_LOG_DEBUG : ANDROID_LOG_ERROR, tag,
                        "cmd: \"%s\" %s execution", cmd.c_str(),
                        succeeded ? "successful" : "unsuccessful");
    if (!succeeded) return std::nullopt;
    return collected;
}

} // namespace vendor::korvan::bex::wifi::V1_0::implementation
