// Copyright 2026 The BEX Wi-Fi Authors
// SPDX-License-Identifier: Apache-2.0

#pragma once

#include <cstddef>
#include <cstdint>
#include <string>

namespace fuzz {

/** The longest text that an input can ask for. */
constexpr size_t kLongestText = 4'096;

/**
 * The bytes of one input, taken from the front to the end, so that a person can write and read
 * them. Past the end every number is 0 and every text is empty.
 *
 * A number is one byte, counted from 'a'. A text goes up to a '|'; a backslash in it takes the next
 * byte as it stands, except a digit: that repeats the text so far, 2 to the power of the digit
 * times, as far as it stays within kLongestText.
 *
 *     "bcwl\3|" read as number(4), number(4), text() is 1, 2, "wlwlwlwlwlwlwlwl".
 */
class Input {
  public:
    Input(const uint8_t* data, size_t size) : mNext(data), mEnd(data + size) {}

    /** A number from 0 to `choices` - 1. */
    size_t number(size_t choices) { return static_cast<uint8_t>(byte('a') - 'a') % choices; }

    /** An element of an array. */
    template <typename T, size_t size>
    const T& oneOf(const T (&choices)[size]) {
        return choices[number(size)];
    }

    /** Four bytes as they stand, the lowest first. */
    uint32_t word() {
        uint32_t value = 0;
        for (int shift = 0; shift < 32; shift += 8) value |= uint32_t{byte(0)} << shift;
        return value;
    }

    std::string text() {
        std::string result;
        while (!atEnd()) {
            const uint8_t first = byte(0);
            if (first == '|') break;
            if (first != '\\') {
                append(result, first);
                continue;
            }
            const uint8_t escaped = byte('\\');
            if (escaped < '0' || escaped > '9') {
                append(result, escaped);
            } else {
                for (int i = '0'; i < escaped && result.size() * 2 <= kLongestText; ++i) {
                    result += std::string(result);
                }
            }
        }
        return result;
    }

    bool atEnd() const { return mNext == mEnd; }

  private:
    uint8_t byte(uint8_t past) { return atEnd() ? past : *mNext++; }

    static void append(std::string& text, uint8_t byte) {
        if (text.size() < kLongestText) text += static_cast<char>(byte);
    }

    const uint8_t* mNext;
    const uint8_t* const mEnd;
};

} // namespace fuzz
