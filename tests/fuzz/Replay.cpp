// Copyright 2026 The BEX Wi-Fi Authors
// SPDX-License-Identifier: Apache-2.0

// In place of the fuzzer: runs a target over inputs that are there already, with any compiler.

#include <stdio.h>

#include <algorithm>
#include <filesystem>
#include <fstream>
#include <iterator>
#include <string>
#include <vector>

extern "C" int LLVMFuzzerTestOneInput(const uint8_t* data, size_t size);

namespace {

using Path = std::filesystem::path;

/** A file, or the files of a folder by their names. */
std::vector<Path> inputsAt(const Path& path) {
    if (!std::filesystem::is_directory(path)) return {path};
    std::vector<Path> files;
    for (const auto& entry : std::filesystem::directory_iterator(path)) {
        files.push_back(entry.path());
    }
    std::sort(files.begin(), files.end());
    return files;
}

bool replay(const Path& path) {
    std::ifstream file(path, std::ios::binary);
    const std::string bytes{std::istreambuf_iterator<char>(file), {}};
    if (!file.is_open() || file.bad()) {
        fprintf(stderr, "replay: cannot read %s\n", path.c_str());
        return false;
    }
    // Ahead of the run: one that ends the process is the last that is named.
    printf("%s\n", path.c_str());
    fflush(stdout);
    LLVMFuzzerTestOneInput(reinterpret_cast<const uint8_t*>(bytes.data()), bytes.size());
    return true;
}

} // namespace

int main(int argc, char** argv) {
    std::vector<Path> inputs;
    for (int i = 1; i < argc; ++i) {
        const std::vector<Path> files = inputsAt(argv[i]);
        inputs.insert(inputs.end(), files.begin(), files.end());
    }
    if (inputs.empty()) {
        fprintf(stderr, "usage: %s FILE-OR-FOLDER..., with at least one input\n", argv[0]);
        return 2;
    }
    for (const Path& input : inputs) {
        if (!replay(input)) return 1;
    }
    return 0;
}
