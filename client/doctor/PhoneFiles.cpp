// Copyright 2026 The BEX Wi-Fi Authors
// SPDX-License-Identifier: Apache-2.0

#include "client/doctor/PhoneFiles.h"

#include <android-base/strings.h>
#include <dirent.h>

#include <algorithm>
#include <cerrno>
#include <fstream>
#include <iterator>
#include <string_view>

namespace vendor::korvan::bex::wifi::client {
namespace {

using ::android::base::EndsWith;
using ::android::base::StartsWith;

constexpr std::string_view kBlanks = " \t\r\n";

bool isAbsence(int error) {
    return error == ENOENT || error == ENOTDIR;
}

bool isXml(const std::string& name, const std::string& prefix) {
    return StartsWith(name, prefix) && EndsWith(name, ".xml");
}

std::string withoutComments(std::string text) {
    for (size_t begin; (begin = text.find("<!--")) != std::string::npos;) {
        const size_t end = text.find("-->", begin);
        text.erase(begin, end == std::string::npos ? end : end + 3 - begin);
    }
    return text;
}

/** How often the package is the whole text of an element. */
size_t countEntries(const std::string& text, const std::string& package) {
    size_t entries = 0;
    for (size_t at = text.find(package); at != std::string::npos;
         at = text.find(package, at + package.size())) {
        const size_t before = at == 0 ? at : text.find_last_not_of(kBlanks, at - 1);
        const size_t after = text.find_first_not_of(kBlanks, at + package.size());
        if (before == std::string::npos || after == std::string::npos) continue;
        if (text[before] == '>' && text[after] == '<') ++entries;
    }
    return entries;
}

} // namespace

bool FileState::hidden() const {
    return error != 0 && !isAbsence(error);
}

FileState look(const std::string& path) {
    struct stat status = {};
    if (stat(path.c_str(), &status) != 0) return {errno, 0, 0};
    return {0, status.st_mode, status.st_size};
}

bool Folder::hidden() const {
    return error != 0 && !isAbsence(error);
}

Folder listFolder(const std::string& path) {
    DIR* directory = opendir(path.c_str());
    if (directory == nullptr) return {errno, {}};
    Folder folder = {0, {}};
    while (const dirent* entry = readdir(directory)) folder.names.emplace_back(entry->d_name);
    closedir(directory);
    std::sort(folder.names.begin(), folder.names.end());
    return folder;
}

Mentions findMentions(const std::string& root, const std::vector<FileSet>& sets,
                      const std::string& package) {
    Mentions mentions;
    for (const FileSet& set : sets) {
        const Folder folder = listFolder(root + set.folder);
        if (folder.hidden()) mentions.hidden = set.folder;
        for (const std::string& name : folder.names) {
            const std::string path = std::string(set.folder) + "/" + name;
            if (!isXml(name, set.prefix)) continue;
            const FileState state = look(root + path);
            if (state.exists() && !S_ISREG(state.mode)) continue;
            std::ifstream file(root + path);
            if (!file) {
                mentions.hidden = path;
                continue;
            }
            const std::string text(std::istreambuf_iterator<char>(file), {});
            ++mentions.read;
            mentions.files.insert(mentions.files.end(),
                                  countEntries(withoutComments(text), package), path);
        }
    }
    return mentions;
}

} // namespace vendor::korvan::bex::wifi::client
