// Copyright 2026 The BEX Wi-Fi Authors
// SPDX-License-Identifier: Apache-2.0

#include "suites/Bandwidth.h"
#include "tests/unit/Expect.h"

namespace vendor::korvan::bex::wifi::V1_0::implementation {
namespace {

// clang-format off

TEST(BandwidthTest, Modes) {
    const struct { const char *bandwidth, *n, *ac; } cases[] = {
        {"20",  "1", "5"},
        {"40",  "2", "6"},
        {"80",  "8", "8"},
        {"160", "1", "5"},
        {"",    "1", "5"},
        {"abc", "1", "5"},
        {"40x", "2", "6"},
        {"080", "8", "8"},
    };
    for (const auto& [bandwidth, n, ac] : cases) {
        EXPECT_EQ(n, bandwidthMode(bandwidth, false)) << bandwidth;
        EXPECT_EQ(ac, bandwidthMode(bandwidth, true)) << bandwidth;
    }
}

TEST(BandwidthTest, Options) {
    // An error names the number; -1 stands for none.
    const struct { const char* bandwidth; bool vht; const char* option; int error; } cases[] = {
        {"20",  false, "-M 1",                       20},
        {"20",  true,  "-M 5",                       20},
        {"40",  false, "-M 2",                       -1},
        {"40",  true,  "-M 6",                       -1},
        {"80",  false, "-M 1",                       80},
        {"80",  true,  "-M 8",                       -1},
        {"160", false, "-M 1",                       160},
        {"160", true,  "--nss 1 --rateBw 20 -M 29",  -1},
        {"320", false, "-M 1",                       320},
        {"320", true,  "-M 5",                       320},
        {"",    true,  "-M 5",                       0},
        {"abc", false, "-M 1",                       0},
        {"040", true,  "-M 6",                       -1},
        {"80x", true,  "-M 8",                       -1},
    };
    for (const auto& [bandwidth, vht, option, error] : cases) {
        RecordedShell shell;
        EXPECT_EQ(option, bandwidthOption(bandwidth, vht, "tag")) << bandwidth;
        if (error == -1) {
            EXPECT_THAT(shell.log(), IsEmpty()) << bandwidth;
        } else {
            EXPECT_THAT(shell.log(), ElementsAre(::error("tag",
                "bandwidth error : " + std::to_string(error) + ", use default 20MHz")))
                << bandwidth;
        }
    }
}

TEST(BandwidthTest, AxOptions) {
    const std::pair<const char*, const char*> cases[] = {
        {"20",  "--rateBw 8 -M 2"},
        {"40",  "--rateBw 9 -M 3"},
        {"80",  "--rateBw 10 -M 4"},
        {"160", "--rateBw 16 -M 29"},
        {"320", ""}, {"", ""}, {"040", ""}, {"40 ", ""}, {" 40", ""}, {"4", ""}, {"abc", ""},
    };
    RecordedShell shell;
    for (const auto& [bandwidth, options] : cases) {
        EXPECT_EQ(options, axBandwidthOptions(bandwidth)) << bandwidth;
    }
    EXPECT_THAT(shell.log(), IsEmpty());
}

// clang-format on

} // namespace
} // namespace vendor::korvan::bex::wifi::V1_0::implementation
