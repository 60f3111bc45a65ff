// Copyright 2026 The BEX Wi-Fi Authors
// SPDX-License-Identifier: Apache-2.0

#include "shell/CommandList.h"

#include <android/log.h>

namespace vendor::korvan::bex::wifi::V1_0::implementation {

namespace {

bool mayFail(const std::string& line) {
    return line.rfind("insmod", 0) == 0;
}

} // namespace

std::string tokenLine(const Tokens& tokens) {
    return lineOfWords(tokens.begin(), tokens.end());
}

int runList(const char* method, const char* tag, const CommandList& list, const LineRunner& run,
            CommandResult& result) {
    int status = 0;
    for (const Tokens& tokens : list) {
        const std::string line = tokenLine(tokens);
        __android_log_print(ANDROID_LOG_ERROR, tag, "%s: %s", method, line.c_str());
        run(line, result);
        if (result.status != 0 && !mayFail(line)) status = -1;
    }
    return status;
}

} // namespace vendor::korvan::bex::wifi::V1_0::implementation
