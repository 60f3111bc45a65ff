// Copyright 2026 The BEX Wi-Fi Authors
// SPDX-License-Identifier: Apache-2.0

#include "suites/DriverModules.h"
#include "tests/unit/Expect.h"

namespace vendor::korvan::bex::wifi::V1_0::implementation {
namespace {

constexpr const char* kCandidates[] = {
        "/system/lib/modules/wlan.ko",
        "/vendor/lib/modules/wlan.ko",
        "/system/lib/modules/qca_cld3_wlan.ko",
        "/vendor/lib/modules/qca_cld3_wlan.ko",
        "/vendor/lib/modules/qca_cld3/qca_cld3_wlan.ko",
};

TEST(FirmwarePathStringsTest, BeginWithoutAModuleFile) {
    const FirmwarePathStrings strings;
    EXPECT_EQ("/etc/firmware/fw_bcmdhd_mfg.bin", strings.MfgFirmwarePath);
    EXPECT_THAT(strings.FwPathCandidates, ::testing::ElementsAreArray(kCandidates));
    EXPECT_EQ("", strings.FwPath);
}

TEST(FindFwPathTest, TakesTheFirstReadableCandidate) {
    for (size_t first = 0; first < std::size(kCandidates); ++first) {
        RecordedShell shell;
        for (size_t i = first; i < std::size(kCandidates); ++i) shell.readable(kCandidates[i]);
        FirmwarePathStrings strings;
        strings.FwPath = "before";
        EXPECT_EQ(0, findFwPath("tag", strings));
        EXPECT_EQ(kCandidates[first], strings.FwPath);
        EXPECT_EQ(std::vector<std::string>(kCandidates, kCandidates + first + 1), shell.probed());
        EXPECT_THAT(shell.log(), IsEmpty());
    }
}

TEST(FindFwPathTest, KeepsThePathWhenNoneIsReadable) {
    RecordedShell shell;
    shell.readable("/vendor/lib/modules/qca_cld3_other.ko");
    FirmwarePathStrings strings;
    strings.FwPath = "before";
    EXPECT_EQ(-1, findFwPath("tag", strings));
    EXPECT_EQ("before", strings.FwPath);
    EXPECT_EQ(std::size(kCandidates), shell.probed().size());
    EXPECT_THAT(shell.log(), ElementsAre(error("tag", "getFwPath cannot find out FwPath")));
}

class ListDriverPathsTest : public ::testing::Test {
  protected:
    ~ListDriverPathsTest() override { EXPECT_TRUE(mShell.allClosed()); }

    RecordedShell mShell;
    std::vector<std::string> mPaths;
};

TEST_F(ListDriverPathsTest, TakesTheFamilysFilesInTheDirectorysOrder) {
    mShell.directory("/vendor/lib/modules",
                     {".", "..", "qca_cld3_wlan.ko", "wlan.ko", "qca_cld3", "qca_cld3_",
                      "aqca_cld3_x.ko", "QCA_CLD3_x.ko", "qca_cld3_a"});
    EXPECT_EQ(0, listDriverPaths("tag", {}, mPaths));
    EXPECT_THAT(mPaths,
                ElementsAre("/vendor/lib/modules/qca_cld3_wlan.ko", "/vendor/lib/modules/qca_cld3_",
                            "/vendor/lib/modules/qca_cld3_a"));
    EXPECT_THAT(mShell.log(), ElementsAre(error("tag", "getDriverPaths: qca_cld3_wlan.ko"),
                                          error("tag", "getDriverPaths: qca_cld3_"),
                                          error("tag", "getDriverPaths: qca_cld3_a")));
}

TEST_F(ListDriverPathsTest, TakesHundredsOfFilesOfAnyName) {
    std::vector<std::string> names;
    std::vector<std::string> paths;
    for (int i = 0; i < 500; ++i) {
        names.push_back("qca_cld3_" + std::string(i % 246, '%') + "\xff");
        paths.push_back("/vendor/lib/modules/" + names.back());
    }
    mShell.directory("/vendor/lib/modules", names);
    EXPECT_EQ(0, listDriverPaths("tag", {}, mPaths));
    EXPECT_EQ(paths, mPaths);
}

TEST_F(ListDriverPathsTest, FailsSilentlyWithoutTheDirectory) {
    mShell.directory("/vendor/lib", {"qca_cld3_wlan.ko"});
    mPaths = {"before"};
    EXPECT_EQ(-1, listDriverPaths("tag", {}, mPaths));
    EXPECT_THAT(mPaths, ElementsAre("before"));
    EXPECT_THAT(mShell.log(), IsEmpty());
}

TEST_F(ListDriverPathsTest, FailsWhenThereIsNoPathThen) {
    mShell.directory("/vendor/lib/modules", {"wlan.ko"});
    EXPECT_EQ(-1, listDriverPaths("tag", {}, mPaths));
    EXPECT_THAT(mPaths, IsEmpty());
    mPaths = {"before"};
    EXPECT_EQ(0, listDriverPaths("tag", {}, mPaths));
    EXPECT_THAT(mPaths, ElementsAre("before"));
}

} // namespace
} // namespace vendor::korvan::bex::wifi::V1_0::implementation
