// Copyright 2026 The BEX Wi-Fi Authors
// SPDX-License-Identifier: Apache-2.0

#include <android-base/properties.h>
#include <android/log.h>
#include <log/log.h>
#include <signal.h>

#include <cctype>
#include <ctime>
#include <string>

#include "host/src/BeforeMain.h"

namespace android::hardware::host {
namespace {

/**
 * Blocks SIGPIPE for this thread while the object lives. If the process ignored the signal, or
 * blocked it for good, the tools that it starts would inherit that.
 */
class PipeSignalBlock {
  public:
    PipeSignalBlock() {
        sigemptyset(&mPipe);
        sigaddset(&mPipe, SIGPIPE);
        sigset_t pending;
        sigpending(&pending);
        mWasPending = sigismember(&pending, SIGPIPE) != 0;
        pthread_sigmask(SIG_BLOCK, &mPipe, &mBefore);
    }
    ~PipeSignalBlock() {
        constexpr timespec kAtOnce = {};
        if (!mWasPending) sigtimedwait(&mPipe, nullptr, &kAtOnce);
        pthread_sigmask(SIG_SETMASK, &mBefore, nullptr);
    }
    PipeSignalBlock(const PipeSignalBlock&) = delete;
    PipeSignalBlock& operator=(const PipeSignalBlock&) = delete;

  private:
    sigset_t mPipe;
    sigset_t mBefore;
    bool mWasPending;
};

void log(const __android_logger_data* line, const char* message) {
    const PipeSignalBlock block;
    __android_log_stderr_logger(line, message);
}

} // namespace

void outliveLogReader() {
    __android_log_set_logger(log);
}

void setLogLevel() {
    const std::string level = base::GetProperty("log.tag", "");
    if (level.empty()) return;
    switch (toupper(static_cast<unsigned char>(level[0]))) {
        case 'V':
            __android_log_set_minimum_priority(ANDROID_LOG_VERBOSE);
            break;
        case 'D':
            __android_log_set_minimum_priority(ANDROID_LOG_DEBUG);
            break;
        case 'I':
            __android_log_set_minimum_priority(ANDROID_LOG_INFO);
            break;
        case 'W':
            __android_log_set_minimum_priority(ANDROID_LOG_WARN);
            break;
        case 'E':
            __android_log_set_minimum_priority(ANDROID_LOG_ERROR);
            break;
        case 'S':
            __android_log_set_minimum_priority(ANDROID_LOG_SILENT);
            break;
        default:
            ALOGE("Property log.tag: '%s' is no level", level.c_str());
    }
}

} // namespace android::hardware::host
