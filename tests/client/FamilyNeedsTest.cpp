// Copyright 2026 The BEX Wi-Fi Authors
// SPDX-License-Identifier: Apache-2.0

// What a family needs of its phones is what the command lines of all operations use.

#include <android-base/properties.h>
#include <gmock/gmock.h>
#include <gtest/gtest.h>

#include <ostream>
#include <set>
#include <sstream>

#include "Matches.h"
#include "chips/ChipFamily.h"
#include "client/Commands.h"
#include "client/doctor/PhoneChecks.h"
#include "recorder/RecordedShell.h"
#include "service/WifiService.h"

namespace vendor::korvan::bex::wifi {

// By its name where GoogleTest prints a family, instead of the bytes of its object.
static void PrintTo(const ChipFamily& family, std::ostream* out) {
    *out << family.name;
}

} // namespace vendor::korvan::bex::wifi

namespace vendor::korvan::bex::wifi::client {
namespace {

using ::android::sp;
using ::android::base::SetProperty;
using Words = std::set<std::string>;

constexpr char kModule[] = "/vendor/lib/modules/wlan.ko";
constexpr char kModules[] = "/vendor/lib/modules/qca_cld3_x.ko";

class FamilyNeedsTest : public ::testing::TestWithParam<ChipFamily> {
  protected:
    FamilyNeedsTest() {
        SetProperty("ro.hardware.wlan.vendor", GetParam().vendor);
        SetProperty("ro.hardware.wlan.chip", GetParam().partOfName);
        mShell.readable(kModule);
        mShell.directory("/vendor/lib/modules", {"qca_cld3_x.ko"});
        const sp<IWifiService> service = new V1_0::implementation::WifiService();
        for (const Command& command : commands()) {
            for (const char* text : {"6", "36", "40"}) {
                for (const bool flag : {false, true}) {
                    const std::vector<Value> values(command.arguments.size(), {text, flag});
                    EXPECT_TRUE(command.call(*service, values).delivered);
                }
            }
        }
    }

    ~FamilyNeedsTest() override {
        SetProperty("ro.hardware.wlan.vendor", "");
        SetProperty("ro.hardware.wlan.chip", "");
    }

    /** The first word of each command of each line, without the shell's own commands. */
    Words tools() const {
        Words tools;
        for (const std::string& line : mShell.lines()) {
            std::istringstream commands(line);
            for (std::string command; std::getline(commands, command, '|');) {
                std::istringstream(command) >> command;
                if (command != "echo") tools.insert(command);
            }
        }
        return tools;
    }

    Words inLines(const std::string& pattern) const {
        Words found;
        for (const std::string& line : mShell.lines()) {
            const auto parts = matches(line, pattern);
            found.insert(parts.begin(), parts.end());
        }
        return found;
    }

    const ChipFamily& mFamily = GetParam();
    recorder::RecordedShell mShell;
};

TEST_P(FamilyNeedsTest, TheTools) {
    Words named(mFamily.toolsByName.begin(), mFamily.toolsByName.end());
    for (const char* tool : mFamily.toolsByPath) named.insert(std::string("/vendor/bin/") + tool);
    EXPECT_EQ(named, tools());
    EXPECT_EQ(named.size(), mFamily.toolsByName.size() + mFamily.toolsByPath.size());
}

TEST_P(FamilyNeedsTest, TheDriversFiles) {
    Words named;
    for (const DriverFile& file : mFamily.files) {
        named.insert(file.path);
        const std::string module = std::string("/sys/module/") + file.module + "/";
        EXPECT_EQ(*file.module != '\0', std::string(file.path).rfind(module, 0) == 0) << file.path;
    }
    EXPECT_EQ(named, inLines("/(sys|etc)/[^ \"]*"));
}

TEST_P(FamilyNeedsTest, TheModules) {
    const Words loaded = inLines("/[^ ]*\\.ko");
    switch (mFamily.modules) {
        case DriverModules::none:
            EXPECT_EQ(loaded, Words{});
            break;
        case DriverModules::oneOfSeveral:
            EXPECT_EQ(loaded, Words{kModule});
            break;
        case DriverModules::allOfAFolder:
            EXPECT_EQ(loaded, Words{kModules});
            break;
    }
}

TEST_P(FamilyNeedsTest, TheTagsOfTheCommands) {
    Words tags;
    for (const auto& line : mShell.log()) {
        if (line.text.rfind("cmd: ", 0) == 0) tags.insert(line.tag);
    }
    EXPECT_EQ(tags, Words(kCommandTags.begin(), kCommandTags.end()));
}

INSTANTIATE_TEST_SUITE_P(EveryFamily, FamilyNeedsTest, ::testing::ValuesIn(chipFamilies()),
                         [](const auto& family) { return family.param.name; });

} // namespace
} // namespace vendor::korvan::bex::wifi::client
