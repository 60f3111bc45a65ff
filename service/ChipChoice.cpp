// Copyright 2026 The BEX Wi-Fi Authors
// SPDX-License-Identifier: Apache-2.0

#include "service/ChipChoice.h"

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
    ChipFamily family;
    ChipChoice choice;
};

// clang-format off
constexpr FamilyChoice kChoices[] = {
    {ChipFamily::brcm,    {suit<BrcmTestSuit>,    sniffer<SnifferTool>}},
    {ChipFamily::wcn,     {suit<WcnTestSuit>,     sniffer<SnifferTool>}},
    {ChipFamily::qca,     {suit<QcaTestSuit>,     sniffer<SnifferTool>}},
    {ChipFamily::qca639x, {suit<Qca639xTestSuit>, sniffer<Qca639xSnifferTool>}},
    {ChipFamily::wcn685x, {suit<Qca639xTestSuit>, sniffer<Wcn685xSnifferTool>}},
    {ChipFamily::wcn6750, {suit<Wcn6750TestSuit>, sniffer<Wcn685xSnifferTool>}},
    {ChipFamily::wcn39xx, {suit<Wcn39xxTestSuit>, sniffer<SnifferTool>}},
};
// clang-format on

} // namespace

const ChipChoice* chooseChip(const std::string& vendor, const std::string& chip) {
    const std::optional<ChipFamily> family = chipFamily(vendor, chip);
    for (const FamilyChoice& row : kChoices) {
        if (row.family == family) return &row.choice;
    }
    return nullptr;
}

} // namespace vendor::korvan::bex::wifi::V1_0::implementation
