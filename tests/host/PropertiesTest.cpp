// Copyright 2026 The BEX Wi-Fi Authors
// SPDX-License-Identifier: Apache-2.0

// What a process knows before main().

#include <android/log.h>

#include "tests/host/HostTest.h"

namespace vendor::korvan::bex::wifi::tests {
namespace {

class PropertiesTest : public HostTest {};

TEST_F(PropertiesTest, ReadFromBuildProp) {
    write("vendor/build.prop",
          "# ro.comment=1\n"
          "\n"
          "ro.board.platform=sm6225\n"
          "  ro.spaced = a b \r\n"
          "ro.empty=\n"
          "ro.equals=a=b\n"
          "not a property\n"
          "ro.last=end");
    ServerProcess process({"property", "ro.board.platform", "property", "ro.spaced", "property",
                           "ro.empty", "property", "ro.equals", "property", "ro.comment",
                           "property", "ro.last"});
    EXPECT_EQ(process.report(), "sm6225");
    EXPECT_EQ(process.report(), "a b");
    EXPECT_EQ(process.report(), "(unset)"); // as everywhere: empty is unset
    EXPECT_EQ(process.report(), "a=b");
    EXPECT_EQ(process.report(), "(unset)");
    EXPECT_EQ(process.report(), "end");
}

TEST_F(PropertiesTest, NoFileIsFine) {
    ServerProcess process({"property", "ro.board.platform", "log-level"});
    EXPECT_EQ(process.report(), "(unset)");
    EXPECT_EQ(process.report(), std::to_string(ANDROID_LOG_DEFAULT));
    EXPECT_EQ(process.end(), 0);
}

struct Level {
    const char* value;
    int priority;
};

// Names the test.
void PrintTo(const Level& level, std::ostream* out) {
    *out << level.value;
}

class LogLevelTest : public HostTest, public ::testing::WithParamInterface<Level> {};

TEST_P(LogLevelTest, FromLogTag) {
    write("vendor/build.prop", std::string("log.tag=") + GetParam().value + "\n");
    ServerProcess process({"log-level"});
    EXPECT_EQ(process.report(), std::to_string(GetParam().priority));
}

INSTANTIATE_TEST_SUITE_P(
        Host, LogLevelTest,
        ::testing::Values(Level{"V", ANDROID_LOG_VERBOSE}, Level{"D", ANDROID_LOG_DEBUG},
                          Level{"I", ANDROID_LOG_INFO}, Level{"W", ANDROID_LOG_WARN},
                          Level{"E", ANDROID_LOG_ERROR}, Level{"S", ANDROID_LOG_SILENT},
                          Level{"?", ANDROID_LOG_DEFAULT}));

} // namespace
} // namespace vendor::korvan::bex::wifi::tests
