// Copyright 2026 The BEX Wi-Fi Authors
// SPDX-License-Identifier: Apache-2.0

#pragma once

#include <sys/stat.h>

#include <string>
#include <vector>

// Looking at files without opening what could block.

namespace vendor::korvan::bex::wifi::client {

/** What can be seen of a file. */
struct FileState {
    /** 0, or the errno of the look. */
    int error;
    mode_t mode;
    off_t size;

    bool exists() const { return error == 0; }
    /** It cannot be seen, for another reason than that it is missing. */
    bool hidden() const;
    bool hasContent() const { return exists() && S_ISREG(mode) && size > 0; }
    bool executable() const { return exists() && S_ISREG(mode) && (mode & 0111) != 0; }
};

FileState look(const std::string& path);

/** The names in a folder, sorted. */
struct Folder {
    /** 0, or the errno of opening it. */
    int error;
    std::vector<std::string> names;

    bool hidden() const;
};

Folder listFolder(const std::string& path);

/** Entries of VINTF files that name a HAL's package. */
struct Mentions {
    /** The files, each as often as it has entries. */
    std::vector<std::string> files;
    /** How many files were read. */
    size_t read = 0;
    /** A file that exists and could not be read; empty when there is none. */
    std::string hidden;
};

/** The XML files of a folder whose names begin in one way. */
struct FileSet {
    const char* folder;
    const char* prefix;
};

/**
 * Looks for `<name>package</name>` in the text of the files, outside of comments.
 *
 * @param root The folder that stands for the phone's "/"; the result leaves it out.
 */
Mentions findMentions(const std::string& root, const std::vector<FileSet>& sets,
                      const std::string& package);

} // namespace vendor::korvan::bex::wifi::client
