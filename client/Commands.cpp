// Copyright 2026 The BEX Wi-Fi Authors
// SPDX-License-Identifier: Apache-2.0

#include "client/Commands.h"

#include <strings.h>

#include <optional>

#include "client/base/Json.h"

namespace vendor::korvan::bex::wifi::client {
namespace {

using ::android::hardware::hidl_string;
using ::android::hardware::Return;
using Values = std::vector<Value>;

constexpr auto kText = ArgumentKind::Type::text;
constexpr auto kBoolean = ArgumentKind::Type::boolean;

// clang-format off
constexpr ArgumentKind
    kChannel{"channel", kText, "the IEEE 802.11 channel number", "",
             "decimal: 1 to 14 (2.4 GHz), 36 and up (5 GHz)"},
    kBandwidth{"bandwidth", kText, "the channel width", "MHz", "20, 40, 80 or 160"},
    kNarrowBandwidth{"bandwidth", kText, "the channel width", "MHz", "20, 40 or 80"},
    kRate{"rate", kText, "the data rate", "Mbit/s",
          "1, 2, 5.5, 6, 9, 11, 12, 18, 24, 36, 48 or 54"},
    kMcs{"rate", kText, "the MCS index", "", "decimal, such as 0 or 7"},
    kPower{"power", kText, "the transmit power", "that of the chip's tool",
           "as the chip's tool expects"},
    kVht{"vht", kBoolean, "802.11ac (VHT) rates when true, 802.11n (HT) rates when false", "",
         "true, false, 1 or 0"},
    kGuardInterval{"guardInterval", kText, "the guard interval", "that of the chip's tool",
                   "as the chip's tool expects"},
    kTxAntenna{"antenna", kText, "the transmit chain or chain mask", "",
               "as the chip's tool expects"},
    kRxAntenna{"antenna", kText, "the receive chain or chain mask", "",
               "as the chip's tool expects"},
    kSsid{"ssid", kText, "the network name of the open access point", "",
          "any text; a name with blanks becomes several words"},
    kAddress{"address", kText, "the IPv4 address to give to the interface", "", "dotted decimal"};

constexpr char kCommandLog[] =
    "which command failed is in the service's log (logcat, tags that begin with \"wifi@1.0-\")";
constexpr char kModeLog[] =
    "the driver is in another mode or its mode cannot be read: see the service's log (logcat, tag "
    "\"wifi@1.0-SnifferTool\")";

constexpr ResultKind
    kStatus{ResultKind::Type::int32, "0 when every command succeeded, -1 when at least one failed",
            "-1", kCommandLog},
    kMode{ResultKind::Type::int32,
          "0 (normal), 4 (monitor) or 5 (factory test); -1 for any other mode and when the mode "
          "cannot be read", "-1", kModeLog},
    kMonitor{ResultKind::Type::boolean,
             "true in monitor mode, and also when the driver's mode cannot be read", "", ""},
    kMimo{ResultKind::Type::boolean, "true when the device declares MIMO support", "", ""},
    kStarted{ResultKind::Type::text,
             "\"ok\" or \"failure\", or the packet count at the start, as the chip family defines",
             "failure", kCommandLog},
    kAxStarted{ResultKind::Type::text,
               "\"ok\" or \"failure\"; one blank on chips that only reset", "failure", kCommandLog},
    kPackets{ResultKind::Type::text,
             "the packets received, in decimal; on most Qualcomm chips with \"Rx: \" in front; no "
             "number when the chip's tool printed none", "failure", kCommandLog};
// clang-format on

std::string printed(int32_t number) {
    return std::to_string(number);
}

std::string printed(bool flag) {
    return flag ? "true" : "false";
}

template <typename T>
Answer answer(const Return<T>& result) {
    if (!result.isOk()) return {false, "", result.description()};
    return {true, printed(static_cast<T>(result)), ""};
}

// For the methods that answer through a callback, which `call` gets as its only argument.
template <typename Call>
Answer answerText(Call call) {
    std::optional<std::string> text;
    bool again = false;
    const Return<void> result = call([&](const hidl_string& out) {
        again = text.has_value();
        text.emplace(out.c_str(), out.size());
    });
    if (!result.isOk()) return {false, "", result.description()};
    if (!text) return {false, "", "the method returned without an answer"};
    if (again) return {false, "", "the method answered more than once"};
    return {true, *text, ""};
}

const std::vector<Command> kCommands = {
        {"snifferStart",
         "Puts the driver into monitor mode on a channel and starts the packet capture.",
         {&kChannel, &kBandwidth},
         &kStatus,
         [](IWifiService& wifi, const Values& v) {
             return answer(wifi.snifferStart(v[0].text, v[1].text));
         }},
        {"snifferStop",
         "Ends the packet capture and monitor mode; leaves the interface down.",
         {},
         &kStatus,
         [](IWifiService& wifi, const Values&) { return answer(wifi.snifferStop()); }},
        {"isSnifferMode",
         "Tells whether the driver is in monitor mode.",
         {},
         &kMonitor,
         [](IWifiService& wifi, const Values&) { return answer(wifi.isSnifferMode()); }},
        {"getWlanMode",
         "Reads the driver's connection mode.",
         {},
         &kMode,
         [](IWifiService& wifi, const Values&) { return answer(wifi.getWlanMode()); }},
        {"isMimoSupport",
         "Tells whether the device declares MIMO support.",
         {},
         &kMimo,
         [](IWifiService& wifi, const Values&) { return answer(wifi.isMimoSupport()); }},
        {"RunTxBGStart",
         "Starts continuous 802.11b/g (and a) transmission, until RunTxStop.",
         {&kChannel, &kRate, &kPower, &kTxAntenna},
         &kStatus,
         [](IWifiService& wifi, const Values& v) {
             return answer(wifi.RunTxBGStart(v[0].text, v[1].text, v[2].text, v[3].text));
         }},
        {"RunTxNStart",
         "Starts continuous 802.11n or 802.11ac transmission, until RunTxStop.",
         {&kChannel, &kNarrowBandwidth, &kMcs, &kPower, &kVht, &kTxAntenna},
         &kStatus,
         [](IWifiService& wifi, const Values& v) {
             return answer(wifi.RunTxNStart(v[0].text, v[1].text, v[2].text, v[3].text, v[4].flag,
                                            v[5].text));
         }},
        {"RunTxAxStart",
         "Starts continuous 802.11ax transmission where the chip supports it, until RunTxStop.",
         {&kChannel, &kBandwidth, &kMcs, &kPower, &kGuardInterval, &kTxAntenna},
         &kStatus,
         [](IWifiService& wifi, const Values& v) {
             return answer(wifi.RunTxAxStart(v[0].text, v[1].text, v[2].text, v[3].text, v[4].text,
                                             v[5].text));
         }},
        {"RunTxStop",
         "Ends the transmission on a channel.",
         {&kChannel},
         &kStatus,
         [](IWifiService& wifi, const Values& v) { return answer(wifi.RunTxStop(v[0].text)); }},
        {"RunTxStStart",
         "Starts an unmodulated carrier (single tone), until RunTxStStop.",
         {&kChannel, &kBandwidth, &kTxAntenna},
         &kStatus,
         [](IWifiService& wifi, const Values& v) {
             return answer(wifi.RunTxStStart(v[0].text, v[1].text, v[2].text));
         }},
        {"RunTxStStop",
         "Ends the single tone on a channel.",
         {&kChannel},
         &kStatus,
         [](IWifiService& wifi, const Values& v) { return answer(wifi.RunTxStStop(v[0].text)); }},
        {"RunRxApJoinHoc",
         "Joins an open access point, for a check over the air.",
         {&kSsid, &kAddress},
         &kStatus,
         [](IWifiService& wifi, const Values& v) {
             return answer(wifi.RunRxApJoinHoc(v[0].text, v[1].text));
         }},
        {"RunRxBgStart",
         "Starts 802.11b/g (and a) reception with a packet count, until RunRxStop.",
         {&kChannel, &kRate, &kRxAntenna},
         &kStarted,
         [](IWifiService& wifi, const Values& v) {
             return answerText([&](auto keep) {
                 return wifi.RunRxBgStart(v[0].text, v[1].text, v[2].text, keep);
             });
         }},
        {"RunRxNStart",
         "Starts 802.11n or 802.11ac reception with a packet count, until RunRxStop.",
         {&kChannel, &kNarrowBandwidth, &kMcs, &kVht, &kRxAntenna},
         &kStarted,
         [](IWifiService& wifi, const Values& v) {
             return answerText([&](auto keep) {
                 return wifi.RunRxNStart(v[0].text, v[1].text, v[2].text, v[3].flag, v[4].text,
                                         keep);
             });
         }},
        {"RunRxAxStart",
         "Starts 802.11ax reception where the chip supports it, until RunRxStop.",
         {&kChannel, &kBandwidth, &kMcs, &kRxAntenna},
         &kAxStarted,
         [](IWifiService& wifi, const Values& v) {
             return answerText([&](auto keep) {
                 return wifi.RunRxAxStart(v[0].text, v[1].text, v[2].text, v[3].text, keep);
             });
         }},
        {"RunRxStop",
         "Ends the reception and reads its packet count.",
         {&kChannel},
         &kPackets,
         [](IWifiService& wifi, const Values& v) {
             return answerText([&](auto keep) { return wifi.RunRxStop(v[0].text, keep); });
         }},
};

std::optional<bool> readFlag(const std::string& text) {
    if (text == "true" || text == "1") return true;
    if (text == "false" || text == "0") return false;
    return std::nullopt;
}

std::string wrongCount(const Command& command, size_t given) {
    const size_t expected = command.arguments.size();
    std::string problem = std::string(command.name) + " takes " +
                          (expected == 0 ? "no" : std::to_string(expected)) +
                          (expected == 1 ? " argument" : " arguments");
    const char* separator = " (";
    for (const ArgumentKind* argument : command.arguments) {
        problem.append(separator).append(argument->name);
        separator = " ";
    }
    return problem + (expected == 0 ? "" : ")") + ", not " + std::to_string(given);
}

} // namespace

bool Command::tellsFailure(const Answer& answer) const {
    return *result->failure != '\0' && answer.text == result->failure;
}

const std::vector<Command>& commands() {
    return kCommands;
}

const Command* findCommand(const std::string& name) {
    for (const Command& command : kCommands) {
        if (name == command.name) return &command;
    }
    return nullptr;
}

std::string unknownCommand(const std::string& name) {
    std::string problem = "unknown method " + jsonString(name);
    for (const Command& command : kCommands) {
        if (strcasecmp(name.c_str(), command.name) == 0) {
            problem.append(": did you mean ").append(command.name).append("?");
        }
    }
    return problem;
}

bool readRequest(const std::vector<std::string>& words, Request* request, std::string* problem) {
    if (words.empty()) {
        *problem = "no method given";
        return false;
    }
    const Command* command = findCommand(words[0]);
    if (command == nullptr) {
        *problem = unknownCommand(words[0]);
        return false;
    }
    const size_t given = words.size() - 1;
    if (given != command->arguments.size()) {
        *problem = wrongCount(*command, given);
        return false;
    }
    *request = {command, {}};
    for (size_t i = 0; i < given; ++i) {
        Value value{words[i + 1]};
        if (command->arguments[i]->type == ArgumentKind::Type::boolean) {
            const std::optional<bool> flag = readFlag(value.text);
            if (!flag) {
                *problem = std::string(command->arguments[i]->name) +
                           " is true, false, 1 or 0, not " + jsonString(value.text);
                return false;
            }
            value.flag = *flag;
        }
        request->values.push_back(value);
    }
    return true;
}

} // namespace vendor::korvan::bex::wifi::client
