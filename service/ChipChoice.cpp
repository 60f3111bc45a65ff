// Copyright 2026 The BEX Wi-Fi Authors
// SPDX-License-Identifier: Apache-2.0

#include "service/ChipChoice.h"

#include <string_view>

#include "chips/ChipFamily.h"
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

struct FamilyChoice {
    std::string_view family;
    ChipChoice choice;
};

// clang-format off
constexpr FamilyChoice kChoices[] = {
    {"broadcom", {suit<BrcmTestSuit>,    sniffer<SnifferTool>}},
    {"wcn",      {suit<WcnTestSuit>,     sniffer<SnifferTool>}},
    {"qca",      {suit<QcaTestSuit>,     sniffer<SnifferTool>}},
    {"qca639x",  {suit<Qca639xTestSuit>, sniffer<Qca639xSnifferTool>}},
    {"wcn685x",  {suit<Qca639xTestSuit>, sniffer<Wcn685xSnifferTool>}},
    {"wcn6750",  {suit<Wcn6750TestSuit>, sniffer<Wcn685xSnifferTool>}},
    {"wcn39xx",  {suit<Wcn39xxTestSuit>, sniffer<SnifferTool>}},
};
// clang-format on

} // namespace

const ChipChoice* chooseChip(const std::string& vendor, const std::string& chip) {
    const ChipFamily* family = findChipFamily(vendor, chip);
    if (family == nullptr) return nullptr;
    for (const FamilyChoice& row : kChoices) {
        if (row.family == family->name) return &row.choice;
    }
    return nullptr;
}

} // namespace vendor::korvan::bex::wifi::V1_0::implementation
