// Copyright 2026 The BEX Wi-Fi Authors
// SPDX-License-Identifier: Apache-2.0

#include "recorder/RecordedShell.h"

#include <android/log.h>
#include <dirent.h>
#include <dlfcn.h>
#include <errno.h>
#include <stdarg.h>
#include <stdio.h>
#include <unistd.h>

#include <map>
#include <memory>
#include <mutex>
#include <ostream>
#include <set>

namespace recorder {

namespace {

/** A directory that is being read: what the reader's DIR* points to. */
struct Listing {
    std::vector<std::string> names;
    size_t next = 0;
    dirent entry = {};
};

// The C functions below have no object to act on, so the recording is the process's.
struct Recording {
    bool on = false;
    std::vector<std::pair<std::string, RecordedShell::Answer>> answers;
    std::vector<std::string> lines;
    std::vector<RecordedShell::LogLine> log;
    // Running commands: each stream reads from the text beside it.
    std::map<FILE*, std::unique_ptr<RecordedShell::Answer>> running;
    std::set<std::string> readable;
    std::vector<std::string> probed;
    std::map<std::string, std::vector<std::string>> directories;
    std::map<DIR*, std::unique_ptr<Listing>> reading;
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
    auto running = std::make_unique<RecordedShell::Answer>(std::move(answer));
    std::string& output = running->output;
    // Not every C library opens an empty piece of memory.
    FILE* stream =
            output.empty() ? fopen("/dev/null", "r") : fmemopen(output.data(), output.size(), "r");
    if (stream != nullptr) gRecording.running[stream] = std::move(running);
    return stream;
}

int finish(FILE* stream) {
    std::unique_ptr<RecordedShell::Answer> answer;
    {
        const std::lock_guard lock(gMutex);
        answer = std::move(gRecording.running.at(stream));
        gRecording.running.erase(stream);
    }
    fclose(stream);
    return answer->status;
}

/** The C library's function that `ours` replaces. */
template <typename Function>
Function* original(const char* name, Function* /*ours*/) {
    return reinterpret_cast<Function*>(dlsym(RTLD_NEXT, name));
}

int probe(const char* path, int mode) {
    const std::lock_guard lock(gMutex);
    if (!gRecording.on) return original("access", &access)(path, mode);
    gRecording.probed.emplace_back(path);
    if (mode == R_OK && gRecording.readable.count(path) != 0) return 0;
    errno = ENOENT;
    return -1;
}

DIR* openDirectory(const char* path) {
    const std::lock_guard lock(gMutex);
    if (!gRecording.on) return original("opendir", &opendir)(path);
    const auto found = gRecording.directories.find(path);
    if (found == gRecording.directories.end()) {
        errno = ENOENT;
        return nullptr;
    }
    auto listing = std::make_unique<Listing>();
    listing->names = found->second;
    DIR* directory = reinterpret_cast<DIR*>(listing.get());
    gRecording.reading[directory] = std::move(listing);
    return directory;
}

dirent* nextEntry(DIR* directory) {
    const std::lock_guard lock(gMutex);
    const auto found = gRecording.reading.find(directory);
    if (found == gRecording.reading.end()) return original("readdir", &readdir)(directory);
    Listing& listing = *found->second;
    if (listing.next == listing.names.size()) return nullptr;
    dirent& entry = listing.entry;
    const std::string& name = listing.names[listing.next++];
    entry.d_name[name.copy(entry.d_name, sizeof(entry.d_name) - 1)] = '\0';
    return &entry;
}

int closeDirectory(DIR* directory) {
    const std::lock_guard lock(gMutex);
    if (gRecording.reading.erase(directory) != 0) return 0;
    return original("closedir", &closedir)(directory);
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

void RecordedShell::readable(const std::string& path) {
    const std::lock_guard lock(gMutex);
    gRecording.readable.insert(path);
}

void RecordedShell::unreadable(const std::string& path) {
    const std::lock_guard lock(gMutex);
    gRecording.readable.erase(path);
}

void RecordedShell::directory(const std::string& path, std::vector<std::string> names) {
    const std::lock_guard lock(gMutex);
    gRecording.directories[path] = std::move(names);
}

std::vector<std::string> RecordedShell::probed() const {
    const std::lock_guard lock(gMutex);
    return gRecording.probed;
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

bool RecordedShell::allClosed() const {
    const std::lock_guard lock(gMutex);
    return gRecording.running.empty() && gRecording.reading.empty();
}

void RecordedShell::clear() {
    const std::lock_guard lock(gMutex);
    gRecording.lines.clear();
    gRecording.probed.clear();
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

int access(const char* path, int mode) noexcept {
    return recorder::probe(path, mode);
}

DIR* opendir(const char* path) {
    return recorder::openDirectory(path);
}

dirent* readdir(DIR* directory) {
    return recorder::nextEntry(directory);
}

int closedir(DIR* directory) {
    return recorder::closeDirectory(directory);
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
        if (recorder::gRecording.on)
            recorder::gRecording.log.push_back({priority, tag, text, format});
    }
    free(text);
    return length;
}
}
