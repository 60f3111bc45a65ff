// Copyright 2026 The BEX Wi-Fi Authors
// SPDX-License-Identifier: Apache-2.0

#include "service/ChipChoice.h"

#include <string_view>

#include "sniffer/Qca639xSnifferTool.h"
#include "sniffer/Wcn685xSnifferTool.h"
#include "suites/BrcmTestSuit.h"
#include "suites/Qca639xTestSuit.h"
#include "suites/QcaTestSuit.h"
#include "suites/Wcn39xxTestSuit.h"
#include "suites/Wcn6750TestSuit.h"
#include "suites/WcnTestSuit.h"

namespace vendor::korvan::bex::wifi::V1_0::implementation {

namespace {

template <typename Suit>
VendorTestSuit* suit() {
    return new Suit();
}

template <typename Sniffer>
SnifferTool* sniffer() {
    return new Sniffer();
}

struct ChipFamily {
    std::string_view vendor;
    std::string_view partOfName;
    ChipChoice choice;
};

// The first row that fits wins: a name with WCN or QCA in upper case never gets to the digits. The
// empty part of a name is in every name.
// clang-format off
constexpr ChipFamily kChipFamilies[] = {
    {"broadcom", "",     {suit<BrcmTestSuit>,    sniffer<SnifferTool>}},
    {"qcom",     "WCN",  {suit<WcnTestSuit>,     sniffer<SnifferTool>}},
    {"qcom",     "QCA",  {suit<QcaTestSuit>,     sniffer<SnifferTool>}},
    {"qcom",     "639x", {suit<Qca639xTestSuit>, sniffer<Qca639xSnifferTool>}},
    {"qcom",     "685x", {suit<Qca639xTestSuit>, sniffer<Wcn685xSnifferTool>}},
    {"qcom",     "6750", {suit<Wcn6750TestSuit>, sniffer<Wcn685xSnifferTool>}},
    {"qcom",     "",     {suit<Wcn39xxTestSuit>, sniffer<SnifferTool>}},
};
// clang-format on

} // namespace

const ChipChoice* chooseChip(const std::string& vendor, const std::string& chip) {
    for (const ChipFamily& family : kChipFamilies) {
        const bool fits = chip.find(family.partOfName) != std::string::npos;
        if (family.vendor == vendor && fits) return &family.choice;
    }
    return nullptr;
}

} // namespace vendor::korvan::bex::wifi::V1_0::implementation
