// Copyright 2026 The BEX Wi-Fi Authors
// SPDX-License-Identifier: Apache-2.0

#include <dirent.h>
#include <errno.h>
#include <unistd.h>

#include "recorder/RecordedShell.h"
#include "tests/unit/Expect.h"

namespace recorder {
namespace {

/** The entries that a reader of the directory sees; none when it cannot be opened. */
std::vector<std::string> entries(const char* path) {
    std::vector<std::string> names;
    DIR* directory = opendir(path);
    if (directory == nullptr) return names;
    while (const dirent* entry = readdir(directory)) names.emplace_back(entry->d_name);
    EXPECT_EQ(0, closedir(directory));
    return names;
}

TEST(RecordedShellTest, AccessKnowsTheFilesToldAlone) {
    RecordedShell shell;
    shell.readable("/vendor/a");
    EXPECT_EQ(0, access("/vendor/a", R_OK));
    EXPECT_EQ(-1, access("/vendor/a", W_OK));
    errno = 0;
    EXPECT_EQ(-1, access("/", R_OK));
    EXPECT_EQ(ENOENT, errno);
    EXPECT_THAT(shell.probed(), ElementsAre("/vendor/a", "/vendor/a", "/"));
    shell.unreadable("/vendor/a");
    EXPECT_EQ(-1, access("/vendor/a", R_OK));
    shell.clear();
    EXPECT_THAT(shell.probed(), IsEmpty());
}

TEST(RecordedShellTest, DirectoriesListWhatTheyWereTold) {
    RecordedShell shell;
    shell.directory("/vendor", {"b", ".", "a", ""});
    shell.directory("/empty", {});
    EXPECT_THAT(entries("/vendor"), ElementsAre("b", ".", "a", ""));
    EXPECT_THAT(entries("/vendor"), ElementsAre("b", ".", "a", ""));
    EXPECT_NE(nullptr, opendir("/empty"));
    EXPECT_THAT(entries("/empty"), IsEmpty());
    errno = 0;
    EXPECT_EQ(nullptr, opendir("/"));
    EXPECT_EQ(ENOENT, errno);
}

TEST(RecordedShellTest, TwoReadersDoNotDisturbEachOther) {
    RecordedShell shell;
    shell.directory("/vendor", {"a", "b"});
    DIR* first = opendir("/vendor");
    EXPECT_STREQ("a", readdir(first)->d_name);
    EXPECT_THAT(entries("/vendor"), ElementsAre("a", "b"));
    EXPECT_STREQ("b", readdir(first)->d_name);
    EXPECT_EQ(nullptr, readdir(first));
    closedir(first);
}

TEST(RecordedShellTest, KnowsWhatIsStillOpen) {
    RecordedShell shell;
    shell.directory("/vendor", {});
    EXPECT_TRUE(shell.allClosed());
    DIR* directory = opendir("/vendor");
    EXPECT_FALSE(shell.allClosed());
    closedir(directory);
    EXPECT_TRUE(shell.allClosed());
    FILE* command = popen("wl ver", "r");
    EXPECT_FALSE(shell.allClosed());
    pclose(command);
    EXPECT_TRUE(shell.allClosed());
}

TEST(RecordedShellTest, WithoutARecordingTheFilesAreTheMachines) {
    EXPECT_EQ(0, access("/", R_OK));
    EXPECT_EQ(-1, access("/no such file", R_OK));
    EXPECT_THAT(entries("/"), ::testing::IsSupersetOf({".", ".."}));
    EXPECT_EQ(nullptr, opendir("/no such directory"));
}

} // namespace
} // namespace recorder
