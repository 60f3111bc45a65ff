// Copyright 2026 The BEX Wi-Fi Authors
// SPDX-License-Identifier: Apache-2.0

#include "tests/fuzz/Model.h"

namespace fuzz {

namespace {

// A replacement that goes on for longer than this is taken for one without an end.
constexpr int kMostSteps = 500;
constexpr size_t kLongestStep = 16'384;

// runCommand reads lines, and a longer one in pieces of this length.
constexpr size_t kPiece = 255;

const std::string kLabel = "goodPackets";

bool standsAt(const std::string& text, size_t position, const std::string& part) {
    for (size_t i = 0; i < part.size(); ++i) {
        if (position + i >= text.size() || text[position + i] != part[i]) return false;
    }
    return true;
}

/** Where `part` stands for the first time; nothing when it does not. */
std::optional<size_t> first(const std::string& text, const std::string& part) {
    for (size_t position = 0; position <= text.size(); ++position) {
        if (standsAt(text, position, part)) return position;
    }
    return {};
}

} // namespace

std::string keptOutput(const std::string& printed) {
    std::string kept;
    bool cut = false; // by a NUL, up to the end of the piece
    size_t length = 0;
    for (const char byte : printed) {
        if (byte == '\0') cut = true;
        if (!cut) kept += byte;
        if (++length < kPiece && byte != '\n') continue;
        length = 0;
        cut = false;
    }
    return kept;
}

std::optional<std::string> replaced(const std::string& text, const std::string& from,
                                    const std::string& to) {
    std::string result = text;
    for (int step = 0; step < kMostSteps && result.size() <= kLongestStep; ++step) {
        const std::optional<size_t> position = first(result, from);
        if (!position) return result;
        result = result.substr(0, *position) + to + result.substr(*position + from.size());
    }
    return {};
}

std::vector<std::string> pieces(const std::string& text, const std::string& separator) {
    std::vector<std::string> result = {""};
    for (size_t position = 0; position < text.size();) {
        if (standsAt(text, position, separator)) {
            result.emplace_back();
            position += separator.size();
        } else {
            result.back() += text[position++];
        }
    }
    // What follows the last separator is a piece only if it is something.
    if (result.back().empty()) result.pop_back();
    return result;
}

std::optional<std::string> countWithoutLabel(const std::string& label, const std::string& output) {
    const std::optional<std::string> line = replaced(output, "\n", "");
    return line ? replaced(*line, label, "") : line;
}

std::string goodPacketsField(size_t field, const std::string& output) {
    std::string last;
    for (size_t position = 0; position < output.size(); ++position) {
        if (standsAt(output, position, kLabel)) last = output.substr(position);
    }
    const std::vector<std::string> fields = pieces(last, " ");
    return field < fields.size() ? fields[field] : last;
}

std::optional<std::string> received(size_t field, const std::string& output) {
    const std::optional<std::string> line = replaced(output, "\n", " ");
    if (!line) return {};
    return "Rx: " + goodPacketsField(field, *line);
}

} // namespace fuzz
