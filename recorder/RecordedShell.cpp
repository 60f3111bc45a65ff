// Copyright 2026 The BEX Wi-Fi Authors
// SPDX-License-Identifier: Apache-2.0

#include "recorder/RecordedShell.h"

#include <android/log.h>
#include <errno.h>
#include <stdarg.h>
#include <stdio.h>

#include <map>
#include <mutex>
#include <ostream>

namespace recorder {

namespace {

// The C functions below have no object to act on, so the recording is the process's.
struct Recording {
    bool on = false;
    std::vector<std::pair<std::string, RecordedShell::Answer>> answers;
    std::vector<std::string> lines;
    std::vector<RecordedShell::LogLine> log;
    // Running commands: each stream reads from the text beside it.
    std::map<FILE*, RecordedShell::Answer> running;
};

std::mutex gMutex;
Recording gRecording;

FILE* start(const std::string& line) {
    const std::lock_guard lock(gMutex);
    if (!gRecording.on) {
        errno = EPERM;
        return nullptr;
    }
    gRecording.lines.push_back(line);
    RecordedShell::Answer answer;
    for (const auto& [part, partAnswer] : gRecording.answers) {
        if (line.find(part) != std::string::npos) answer = partAnswer;
    }
    if (!answer.starts) {
        errno = EAGAIN;
        return nullptr;
    }
    FILE* stream = tmpfile();
    if (stream == nullptr) return nullptr;
    fwrite(answer.output.data(), 1, answer.output.size(), stream);
    rewind(stream);
    gRecording.running[stream] = std::move(answer);
    return stream;
}

int finish(FILE* stream) {
    int status;
    {
        const std::lock_guard lock(gMutex);
        status = gRecording.running.at(stream).status;
        gRecording.running.erase(stream);
    }
    fclose(stream);
    return status;
}

} // namespace

bool RecordedShell::LogLine::operator==(const LogLine& other) const {
    return priority == other.priority && tag == other.tag && text == other.text;
}

RecordedShell::RecordedShell() {
    const std::lock_guard lock(gMutex);
    gRecording = {};
    gRecording.on = true;
}

RecordedShell::~RecordedShell() {
    const std::lock_guard lock(gMutex);
    gRecording.on = false;
}

void RecordedShell::answer(const std::string& part, Answer answer) {
    const std::lock_guard lock(gMutex);
    gRecording.answers.emplace_back(part, std::move(answer));
}

std::vector<std::string> RecordedShell::lines() const {
    const std::lock_guard lock(gMutex);
    return gRecording.lines;
}

std::vector<RecordedShell::LogLine> RecordedShell::log() const {
    const std::lock_guard lock(gMutex);
    return gRecording.log;
}

std::vector<RecordedShell::LogLine> RecordedShell::log(const std::string& tag) const {
    std::vector<LogLine> lines;
    for (LogLine& line : log()) {
        if (line.tag == tag) lines.push_back(std::move(line));
    }
    return lines;
}

void RecordedShell::clear() {
    const std::lock_guard lock(gMutex);
    gRecording.lines.clear();
    gRecording.log.clear();
}

std::ostream& operator<<(std::ostream& stream, const RecordedShell::LogLine& line) {
    return stream << '{' << line.priority << ", " << line.tag << ", " << line.text << '}';
}

} // namespace recorder

extern "C" {

FILE* popen(const char* line, const char* mode) {
    if (std::string(mode) != "r") {
        errno = EINVAL;
        return nullptr;
    }
    return recorder::start(line);
}

int pclose(FILE* stream) {
    return recorder::finish(stream);
}

int __android_log_print(int priority, const char* tag, const char* format, ...) {
    va_list arguments;
    va_start(arguments, format);
    char* text = nullptr;
    const int length = vasprintf(&text, format, arguments);
    va_end(arguments);
    if (length < 0) return length;
    {
        const std::lock_guard lock(recorder::gMutex);
        if (recorder::gRecording.on) recorder::gRecording.log.push_back({priority, tag, text});
    }
    free(text);
    return length;
}
}
