// Copyright 2026 The BEX Wi-Fi Authors
// SPDX-License-Identifier: Apache-2.0

// Written by `./dev catalogue` from the running code; do not edit.

#include "chips/MethodUse.h"

namespace vendor::korvan::bex::wifi {

// clang-format off
const std::vector<MethodUse>& methodUses() {
    static const std::vector<MethodUse> kUses = {
        {"snifferStart", {"broadcom", "qca", "wcn", "wcn39xx"},
         {},
         {"bandwidth 40, 80 and 160 MHz run the same lines."}},
        {"RunTxBGStart", {"qca"},
         {"power"},
         {"Its test command is that of a reception."}},
        {"RunTxBGStart", {"wcn"},
         {"antenna"},
         {}},
        {"RunTxNStart", {"qca", "wcn39xx"},
         {},
         {"vht false and true run the same lines with bandwidth 80."}},
        {"RunTxNStart", {"qca639x", "wcn6750", "wcn685x"},
         {},
         {"bandwidth 20 and 80 MHz run the same lines with vht false."}},
        {"RunTxNStart", {"wcn"},
         {"antenna"},
         {"bandwidth 20 and 80 MHz run the same lines with vht false."}},
        {"RunTxAxStart", {"broadcom", "qca", "wcn", "wcn39xx"},
         {"channel", "bandwidth", "rate", "power", "guardInterval", "antenna"},
         {"Transmits nothing: no test command follows what sets the chip up."}},
        {"RunTxStop", {"broadcom", "qca", "wcn", "wcn39xx", "wcn6750"},
         {"channel"},
         {}},
        {"RunTxStStart", {"broadcom", "qca", "qca639x", "wcn39xx", "wcn6750", "wcn685x"},
         {"bandwidth"},
         {}},
        {"RunTxStStart", {"wcn"},
         {"antenna"},
         {"bandwidth 20 and 160 MHz run the same lines."}},
        {"RunTxStStop", {"broadcom", "qca", "wcn", "wcn39xx", "wcn6750"},
         {"channel"},
         {}},
        {"RunRxBgStart", {"broadcom"},
         {"rate"},
         {}},
        {"RunRxBgStart", {"wcn"},
         {"rate", "antenna"},
         {}},
        {"RunRxNStart", {"broadcom"},
         {"rate", "vht"},
         {}},
        {"RunRxNStart", {"qca", "wcn39xx"},
         {},
         {"vht false and true run the same lines with bandwidth 80."}},
        {"RunRxNStart", {"qca639x", "wcn6750", "wcn685x"},
         {},
         {"bandwidth 20 and 80 MHz run the same lines with vht false."}},
        {"RunRxNStart", {"wcn"},
         {"bandwidth", "rate", "vht", "antenna"},
         {}},
        {"RunRxAxStart", {"broadcom", "qca", "wcn", "wcn39xx"},
         {"channel", "bandwidth", "rate", "antenna"},
         {"Receives nothing: no test command follows what sets the chip up."}},
        {"RunRxStop", {"broadcom", "qca", "wcn", "wcn39xx", "wcn6750"},
         {"channel"},
         {}},
    };
    return kUses;
}
// clang-format on

} // namespace vendor::korvan::bex::wifi
