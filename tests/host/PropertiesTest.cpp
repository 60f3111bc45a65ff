// Copyright 2026 The BEX Wi-Fi Authors
// SPDX-License-Identifier: Apache-2.0

// What a process knows before main(), and what it is kept from inheriting.

#include <android/log.h>
#include <signal.h>
#include <sys/stat.h>

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

// Opening one waits for a writer, which a deadline in main() could not end.
TEST_F(PropertiesTest, FileThatIsNoRegularOneIsIgnored) {
    write("vendor/etc/folders", "");
    const std::string file = root() + "/vendor/build.prop";
    ASSERT_EQ(mkfifo(file.c_str(), 0600), 0);
    ServerProcess fifo({"property", "ro.board.platform"});
    EXPECT_EQ(fifo.report(), "(unset)");

    ASSERT_EQ(unlink(file.c_str()), 0);
    ASSERT_EQ(mkdir(file.c_str(), 0700), 0);
    ServerProcess folder({"property", "ro.board.platform"});
    EXPECT_EQ(folder.report(), "(unset)");

    ASSERT_EQ(rmdir(file.c_str()), 0);
    ASSERT_EQ(symlink("/dev/zero", file.c_str()), 0);
    ServerProcess endless({"property", "ro.board.platform"});
    EXPECT_EQ(endless.report(), "(unset)");
}

class InheritedTest : public HostTest {};

// With it, pclose() could not tell how a command ended.
TEST_F(InheritedTest, IgnoredChildrensDeathsAreNotInherited) {
    const auto before = signal(SIGCHLD, SIG_IGN);
    ServerProcess process({"shell", "echo out; exit 3"});
    signal(SIGCHLD, before);
    EXPECT_EQ(process.report(), std::to_string(3 << 8) + " out");
}

TEST_F(InheritedTest, LogThatNobodyReadsEndsNothing) {
    ServerProcess process({"unread-log", "log", "one", "log", "two", "shell",
                           "kill -PIPE $$; echo survived", "ready"});
    // A tool still ends as it is used to.
    EXPECT_EQ(process.report(), std::to_string(SIGPIPE) + " ");
    EXPECT_EQ(process.report(), "ready");
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
