// Copyright 2026 The BEX Wi-Fi Authors
// SPDX-License-Identifier: Apache-2.0

#include <gtest/gtest.h>
#include <hidl/ServiceManagement.h>
#include <stdio.h>
#include <stdlib.h>

#include <string>

#include "tests/target/Call.h"
#include "tests/target/Watchdog.h"

namespace {

using vendor::korvan::bex::wifi::target::IWifiService;
using vendor::korvan::bex::wifi::target::kProgram;
using vendor::korvan::bex::wifi::target::Watchdog;

constexpr int kFailed = 1;
constexpr int kWrongUsage = 2;

constexpr char kConsent[] = "--disrupts-wifi";
constexpr char kDeadline[] = "--deadline=";

constexpr char kUsage[] =
        "This program:\n"
        "  --disrupts-wifi     without it no test is run: the tests take Wi-Fi away and transmit\n"
        "  --deadline=SECONDS  how long one call may take before the program gives up: 180\n";

constexpr char kBanner[] =
        "********************************************************************************\n"
        "  %s\n"
        "  This test DISRUPTS WI-FI: it reloads the driver, transmits, receives and\n"
        "  captures on many channels. Every connection is lost; switch Wi-Fi off and on\n"
        "  again afterwards.\n"
        "********************************************************************************\n";

struct Options {
    bool consent = false;
    bool help = false;
};

int wrongUsage(const std::string& problem) {
    fprintf(stderr, "%s: %s; see --help\n", kProgram, problem.c_str());
    return kWrongUsage;
}

/** The seconds in a text, 0 when it holds none. */
long readSeconds(const std::string& text) {
    constexpr size_t kMostDigits = 6;
    const bool digits = !text.empty() && text.size() <= kMostDigits &&
                        text.find_first_not_of("0123456789") == std::string::npos;
    return digits ? strtol(text.c_str(), nullptr, 10) : 0;
}

/** Reads what GoogleTest has left of the command line; 0 or an exit code. */
int readOptions(int argc, char** argv, Options* options) {
    for (int i = 1; i < argc; ++i) {
        const std::string word = argv[i];
        if (word == kConsent) {
            options->consent = true;
        } else if (word == "--help" || word == "-h") {
            options->help = true;
        } else if (word.rfind(kDeadline, 0) == 0) {
            const long seconds = readSeconds(word.substr(sizeof(kDeadline) - 1));
            if (seconds == 0) return wrongUsage("no number of seconds in " + word);
            Watchdog::setDeadline(std::chrono::seconds(seconds));
        } else {
            return wrongUsage("unknown option " + word);
        }
    }
    return 0;
}

} // namespace

int main(int argc, char** argv) {
    ::testing::InitGoogleTest(&argc, argv);
    Options options;
    if (const int wrong = readOptions(argc, argv, &options); wrong != 0) return wrong;
    if (options.help) {
        fputs(kUsage, stdout);
        return 0;
    }
    if (::testing::GTEST_FLAG(list_tests)) return RUN_ALL_TESTS();
    if (!options.consent) {
        return wrongUsage(std::string("takes Wi-Fi away and transmits, so it runs only with ") +
                          kConsent);
    }
    // Without an instance there would be no test, and nothing to fail.
    if (::android::hardware::getAllHalInstanceNames(IWifiService::descriptor).empty()) {
        fprintf(stderr, "%s: the VINTF manifest declares no instance of %s\n", kProgram,
                IWifiService::descriptor);
        return kFailed;
    }
    fprintf(stderr, kBanner, kProgram);
    return RUN_ALL_TESTS();
}
