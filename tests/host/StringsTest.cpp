// Copyright 2026 The BEX Wi-Fi Authors
// SPDX-License-Identifier: Apache-2.0

// Texts, by themselves and through calls.

#include <hidl/HidlTransportSupport.h>

#include "tests/host/HostTest.h"

namespace vendor::korvan::bex::wifi::tests {
namespace {

using ::android::hardware::hidl_string;
using ::android::hardware::hidl_vec;

class StringsTest : public ServedTest {};

TEST_F(StringsTest, EveryByteGoesBothWays) {
    std::string all;
    for (int i = 0; i < 256; ++i) all += static_cast<char>(i);
    const std::string nuls("\0a\0\0", 4);
    for (const std::string& text : {std::string(), nuls, all, std::string("\xff\xfe\xc3")}) {
        EXPECT_EQ(call(service, "x" + text), "x" + text);
        std::string echo = "not called";
        ASSERT_TRUE(service->RunRxAxStart(text, "", "", "", [&](const auto& out) { echo = out; })
                            .isOk());
        EXPECT_EQ(echo, text);
    }
}

TEST_F(StringsTest, SeveralArgumentsKeepTheirPlaces) {
    std::string result;
    ASSERT_TRUE(
            service->RunRxNStart("36", "", "7", true, "a b", [&](const auto& out) { result = out; })
                    .isOk());
    EXPECT_EQ(result, "vht|36||7|a b");
    ASSERT_TRUE(
            service->RunRxBgStart("6", "5.5", "", [&](const auto& out) { result = out; }).isOk());
    EXPECT_EQ(result, "6|5.5|");
}

TEST_F(StringsTest, NineHundredKilobytesGoBothWays) {
    std::string text(900'000, '\0');
    for (size_t i = 0; i < text.size(); ++i) text[i] = static_cast<char>(i * 7);
    std::string echo;
    ASSERT_TRUE(
            service->RunRxAxStart(text, "", "", "", [&](const auto& out) { echo = out; }).isOk());
    EXPECT_EQ(echo, text);
}

TEST(HidlString, LayoutOnTheWire) {
    EXPECT_EQ(sizeof(hidl_string), 16u);
    EXPECT_EQ(hidl_string::kOffsetOfBuffer, 0u);
}

TEST(HidlString, OfNullIsEmpty) {
    const hidl_string text = static_cast<const char*>(nullptr);
    EXPECT_TRUE(text.empty());
    EXPECT_STREQ(text.c_str(), "");
    EXPECT_STREQ(hidl_string().c_str(), "");
}

TEST(HidlString, CountsNulsAndComparesUpToThem) {
    const hidl_string text = std::string("a\0b", 3);
    EXPECT_EQ(text.size(), 3u);
    EXPECT_TRUE(text == "a");
    EXPECT_TRUE("a" == text);
    EXPECT_TRUE(text != "a\1");
    EXPECT_EQ(std::string(text), std::string("a\0b", 3));
    EXPECT_EQ(hidl_string("a\0b", 3).size(), 3u);
}

TEST(HidlString, MovedFromIsEmpty) {
    hidl_string text = "channel";
    const hidl_string moved = std::move(text);
    EXPECT_TRUE(text.empty()); // NOLINT(bugprone-use-after-move,clang-analyzer-cplusplus.Move)
    EXPECT_STREQ(text.c_str(), "");
    EXPECT_EQ(moved, "channel");
    hidl_string assigned = "old";
    text = "again";
    assigned = std::move(text);
    EXPECT_TRUE(text.empty()); // NOLINT(bugprone-use-after-move,clang-analyzer-cplusplus.Move)
    EXPECT_EQ(assigned, "again");
}

TEST(HidlString, CopyOfABorrowedOneOwns) {
    char bytes[] = "36";
    hidl_string borrowed;
    borrowed.setToExternal(bytes, 2);
    EXPECT_EQ(borrowed.c_str(), bytes);
    const hidl_string copy = borrowed;
    hidl_string assigned;
    assigned = borrowed;
    bytes[0] = '4';
    EXPECT_EQ(borrowed, "46");
    EXPECT_EQ(copy, "36");
    EXPECT_EQ(assigned, "36");
}

TEST(HidlString, AssignmentFromItself) {
    hidl_string text = "channel";
    text = *&text;
    EXPECT_EQ(text, "channel");
    text = text.c_str() + 4;
    EXPECT_EQ(text, "nel");
}

TEST(HidlStringDeathTest, BorrowingNeedsANul) {
    hidl_string text;
    EXPECT_DEATH(text.setToExternal("36", 1), "");
}

TEST(HidlVec, OwnsCopiesAndMoves) {
    hidl_vec<hidl_string> words = {"a", "b"};
    hidl_vec<hidl_string> copy = words;
    words[0] = "changed";
    words.resize(3);
    EXPECT_EQ(words.size(), 3u);
    EXPECT_EQ(words[0], "changed");
    EXPECT_EQ(words[1], "b");
    EXPECT_EQ(words[2], "");
    EXPECT_EQ(copy, (hidl_vec<hidl_string>{"a", "b"}));
    hidl_vec<hidl_string> moved = std::move(copy);
    EXPECT_EQ(copy.size(), 0u); // NOLINT(bugprone-use-after-move,clang-analyzer-cplusplus.Move)
    EXPECT_EQ(moved.size(), 2u);
    EXPECT_EQ(std::vector<hidl_string>(moved).size(), 2u);
    EXPECT_EQ(sizeof(moved), 16u);
}

} // namespace
} // namespace vendor::korvan::bex::wifi::tests
