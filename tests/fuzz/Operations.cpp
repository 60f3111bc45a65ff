// Copyright 2026 The BEX Wi-Fi Authors
// SPDX-License-Identifier: Apache-2.0

#include "tests/fuzz/Operations.h"

#include <algorithm>

#include "suites/BrcmTestSuit.h"
#include "suites/Qca639xTestSuit.h"
#include "suites/QcaTestSuit.h"
#include "suites/Wcn39xxTestSuit.h"
#include "suites/Wcn6750TestSuit.h"
#include "suites/WcnTestSuit.h"
#include "tests/fuzz/Model.h"

namespace fuzz {

using namespace vendor::korvan::bex::wifi::V1_0::implementation;

namespace {

template <typename Suit>
std::unique_ptr<VendorTestSuit> make() {
    return std::make_unique<Suit>();
}

/** The process keeps the module file, so look for it again: no input may see another one's. */
template <typename Suit>
std::unique_ptr<VendorTestSuit> makeAndLookAgain() {
    auto suite = std::make_unique<Suit>();
    suite->getFwPath();
    return suite;
}

// clang-format off
constexpr Suite kSuites[] = {
//   make                               label                       field  insmod  first  axText
    {make<BrcmTestSuit>,                "pktengrxdmcast",           0,     false,  true,  nullptr},
    {makeAndLookAgain<WcnTestSuit>,     "wlan0     get_rxpktcnt:",  0,     false,  false, " "},
    {makeAndLookAgain<QcaTestSuit>,     nullptr,                    1,     false,  false, nullptr},
    {make<Qca639xTestSuit>,             nullptr,                    2,     true,   false, nullptr},
    {make<Wcn6750TestSuit>,             nullptr,                    2,     true,   false, nullptr},
    {makeAndLookAgain<Wcn39xxTestSuit>, nullptr,                    1,     false,  false, nullptr},
};
// clang-format on

constexpr const char* kModules[] = {
        "/system/lib/modules/wlan.ko",
        "/vendor/lib/modules/wlan.ko",
        "/system/lib/modules/qca_cld3_wlan.ko",
        "/vendor/lib/modules/qca_cld3_wlan.ko",
        "/vendor/lib/modules/qca_cld3/qca_cld3_wlan.ko",
};

using Kind = Operation::Kind;

} // namespace

// clang-format off
const std::array<Operation, 11> kOperations = {{
    {4, Kind::kTransmission, [](VendorTestSuit& suite, const Arguments& a, std::string&) {
        return suite.RunTxBGStart(a.texts[0], a.texts[1], a.texts[2], a.texts[3]); }},
    {5, Kind::kTransmission, [](VendorTestSuit& suite, const Arguments& a, std::string&) {
        return suite.RunTxNStart(a.texts[0], a.texts[1], a.texts[2], a.texts[3], a.vht,
                                 a.texts[4]); }},
    {6, Kind::kTransmission, [](VendorTestSuit& suite, const Arguments& a, std::string&) {
        return suite.RunTxAxStart(a.texts[0], a.texts[1], a.texts[2], a.texts[3], a.texts[4],
                                  a.texts[5]); }},
    {1, Kind::kTransmission, [](VendorTestSuit& suite, const Arguments& a, std::string&) {
        return suite.RunTxStop(a.texts[0]); }},
    {3, Kind::kTransmission, [](VendorTestSuit& suite, const Arguments& a, std::string&) {
        return suite.RunTxStStart(a.texts[0], a.texts[1], a.texts[2]); }},
    {1, Kind::kTransmission, [](VendorTestSuit& suite, const Arguments& a, std::string&) {
        return suite.RunTxStStop(a.texts[0]); }},
    {2, Kind::kTransmission, [](VendorTestSuit& suite, const Arguments& a, std::string&) {
        return suite.RunRxApJoinHoc(a.texts[0], a.texts[1]); }},
    {3, Kind::kStart, [](VendorTestSuit& suite, const Arguments& a, std::string& out) {
        return suite.RunRxBgStart(a.texts[0], a.texts[1], a.texts[2], out); }},
    {4, Kind::kStart, [](VendorTestSuit& suite, const Arguments& a, std::string& out) {
        return suite.RunRxNStart(a.texts[0], a.texts[1], a.texts[2], a.vht, a.texts[3], out); }},
    {4, Kind::kAxStart, [](VendorTestSuit& suite, const Arguments& a, std::string& out) {
        return suite.RunRxAxStart(a.texts[0], a.texts[1], a.texts[2], a.texts[3], out); }},
    {1, Kind::kStop, [](VendorTestSuit& suite, const Arguments& a, std::string& out) {
        return suite.RunRxStop(a.texts[0], out); }},
}};
// clang-format on

const Suite& readSuite(Input& input) {
    return input.oneOf(kSuites);
}

void readModules(Input& input, recorder::RecordedShell& shell) {
    shell.readable(input.oneOf(kModules));
    const size_t names = input.number(4);
    if (names == 3) return; // no such folder
    std::vector<std::string> entries;
    while (entries.size() < names) entries.push_back(input.text());
    shell.directory("/vendor/lib/modules", entries);
}

std::optional<std::string> countOf(const Suite& suite, const std::string& output) {
    return suite.label != nullptr ? countWithoutLabel(suite.label, output)
                                  : received(suite.field, output);
}

Arguments readArguments(Input& input, size_t count) {
    Arguments arguments;
    for (size_t i = 0; i < count; ++i) arguments.texts[i] = input.text();
    arguments.vht = input.number(2) == 1;
    return arguments;
}

Outcome outcomeOf(const Suite& suite, const Operation& operation, const Script& script,
                  const std::vector<std::string>& lines, const std::string& outBefore) {
    auto isFine = [&](const std::string& line) {
        return script.succeeds(line) || (suite.insmodMayFail && line.rfind("insmod", 0) == 0);
    };
    const bool firstOnly = suite.firstLineDecides && operation.kind == Kind::kStop;
    const auto end = firstOnly ? lines.begin() + 1 : lines.end();
    const int status = std::all_of(lines.begin(), end, isFine) ? 0 : -1;
    const char* word = status == 0 ? "ok" : "failure";
    switch (operation.kind) {
        case Kind::kTransmission:
            return {status, outBefore};
        case Kind::kStop:
            return {status, countOf(suite, script.outputOf(lines.front()))};
        case Kind::kStart:
            if (suite.label == nullptr) return {status, word};
            return {status, countOf(suite, script.outputOf(lines.back()))};
        case Kind::kAxStart:
            return {status, suite.axText != nullptr ? suite.axText : word};
    }
    return {status, {}};
}

} // namespace fuzz
