// Copyright 2026 The BEX Wi-Fi Authors
// SPDX-License-Identifier: Apache-2.0

#include "client/Commands.h"

#include <android-base/parseint.h>
#include <android-base/strings.h>
#include <unistd.h>

#include <algorithm>
#include <cctype>
#include <initializer_list>
#include <numeric>
#include <optional>

#include "client/MethodCall.h"
#include "client/base/Logcat.h"
#include "client/base/Text.h"

namespace vendor::korvan::bex::wifi::client {
namespace {

constexpr auto kText = ArgumentKind::Type::text;
constexpr auto kBoolean = ArgumentKind::Type::boolean;

bool isOneOf(std::initializer_list<const char*> texts, const std::string& text) {
    return std::find(texts.begin(), texts.end(), text) != texts.end();
}

/** Whether it is a number in plain decimal, such as "7", in this range. */
bool isNumber(const std::string& text, int lowest, int highest) {
    int number = 0;
    return ::android::base::ParseInt(text, &number, lowest, highest) &&
           text == std::to_string(number);
}

bool isChannel(const std::string& text) {
    return isNumber(text, 1, 14) || isNumber(text, 36, 177);
}

bool isNarrowBandwidth(const std::string& text) {
    return isOneOf({"20", "40", "80"}, text);
}

bool isBandwidth(const std::string& text) {
    return isNarrowBandwidth(text) || text == "160";
}

bool isRate(const std::string& text) {
    return isOneOf({"1", "2", "5.5", "6", "9", "11", "12", "18", "24", "36", "48", "54"}, text);
}

bool isMcs(const std::string& text) {
    return isNumber(text, 0, 15);
}

// clang-format off
constexpr ArgumentKind
    kChannel{"channel", kText, "the IEEE 802.11 channel number", "",
             "decimal: 1 to 14 (2.4 GHz), 36 and up (5 GHz)", "6", isChannel},
    kBandwidth{"bandwidth", kText, "the channel width", "MHz", "20, 40, 80 or 160", "20", isBandwidth},
    kNarrowBandwidth{"bandwidth", kText, "the channel width", "MHz", "20, 40 or 80", "20",
                     isNarrowBandwidth},
    kRate{"rate", kText, "the data rate", "Mbit/s",
          "1, 2, 5.5, 6, 9, 11, 12, 18, 24, 36, 48 or 54", "54", isRate},
    kMcs{"rate", kText, "the MCS index", "", "decimal, such as 0 or 7", "7", isMcs},
    kPower{"power", kText, "the transmit power", "that of the chip's tool",
           "as the chip's tool expects", "15"},
    kVht{"vht", kBoolean, "802.11ac (VHT) rates when true, 802.11n (HT) rates when false", "",
         "true, false, 1 or 0", "false"},
    kGuardInterval{"guardInterval", kText, "the guard interval", "that of the chip's tool",
                   "as the chip's tool expects", "0"},
    kTxAntenna{"antenna", kText, "the transmit chain or chain mask", "",
               "as the chip's tool expects", "1"},
    kRxAntenna{"antenna", kText, "the receive chain or chain mask", "",
               "as the chip's tool expects", "1"},
    kSsid{"ssid", kText, "the network name of the open access point", "",
          "any text; a name with blanks becomes several words", "test-ap"},
    kAddress{"address", kText, "the IPv4 address to give to the interface", "", "dotted decimal",
             "192.168.1.7"};

constexpr char kModeLog[] =
    "the driver is in another mode or its mode cannot be read: see the service's log, tag "
    "\"wifi@1.0-SnifferTool\"";

constexpr ResultKind
    kStatus{ResultKind::Type::int32,
            "0 when every command succeeded, -1 when at least one failed; some chip families tolerate "
            "an insmod that fails",
            "-1", kWhichCommandFailed},
    kMode{ResultKind::Type::int32,
          "0 (normal), 4 (monitor) or 5 (factory test); -1 for any other number and when the mode "
          "cannot be read; text that is no number reads as 0", "-1", kModeLog},
    kMonitor{ResultKind::Type::boolean,
             "true in monitor mode, and also when the driver's mode cannot be read", "", ""},
    kMimo{ResultKind::Type::boolean, "true when the device declares MIMO support", "", ""},
    kStarted{ResultKind::Type::text,
             "\"ok\" or \"failure\", or the packet count at the start, as the chip family defines",
             "failure", kWhichCommandFailed, true},
    kAxStarted{ResultKind::Type::text,
               "\"ok\" or \"failure\"; one blank on the WCN chips, which only enter test mode",
               "failure", kWhichCommandFailed, true},
    kPackets{ResultKind::Type::text,
             "the packets received, in decimal; on most Qualcomm chips with \"Rx: \" in front; no "
             "number when the chip's tool printed none", "failure", kWhichCommandFailed, true};
// clang-format on

const std::vector<Command> kCommands = {
        {"snifferStart",
         "Puts the driver into monitor mode on a channel and starts the packet capture.",
         {&kChannel, &kBandwidth},
         &kStatus,
         "monitor mode",
         callMethod<&IWifiService::snifferStart>},
        {"snifferStop",
         "Ends the packet capture and monitor mode; leaves the interface down.",
         {},
         &kStatus,
         "",
         callMethod<&IWifiService::snifferStop>},
        {"isSnifferMode",
         "Tells whether the driver is in monitor mode.",
         {},
         &kMonitor,
         "",
         callMethod<&IWifiService::isSnifferMode>},
        {"getWlanMode",
         "Reads the driver's connection mode.",
         {},
         &kMode,
         "",
         callMethod<&IWifiService::getWlanMode>},
        {"isMimoSupport",
         "Tells whether the device declares MIMO support.",
         {},
         &kMimo,
         "",
         callMethod<&IWifiService::isMimoSupport>},
        {"RunTxBGStart",
         "Starts continuous 802.11b/g (and a) transmission, until RunTxStop.",
         {&kChannel, &kRate, &kPower, &kTxAntenna},
         &kStatus,
         "the transmission",
         callMethod<&IWifiService::RunTxBGStart>},
        {"RunTxNStart",
         "Starts continuous 802.11n or 802.11ac transmission, until RunTxStop.",
         {&kChannel, &kNarrowBandwidth, &kMcs, &kPower, &kVht, &kTxAntenna},
         &kStatus,
         "the transmission",
         callMethod<&IWifiService::RunTxNStart>},
        {"RunTxAxStart",
         "Starts continuous 802.11ax transmission where the chip supports it, until RunTxStop.",
         {&kChannel, &kBandwidth, &kMcs, &kPower, &kGuardInterval, &kTxAntenna},
         &kStatus,
         "the transmission",
         callMethod<&IWifiService::RunTxAxStart>},
        {"RunTxStop",
         "Ends the transmission on a channel.",
         {&kChannel},
         &kStatus,
         "",
         callMethod<&IWifiService::RunTxStop>},
        {"RunTxStStart",
         "Starts an unmodulated carrier (single tone), until RunTxStStop.",
         {&kChannel, &kBandwidth, &kTxAntenna},
         &kStatus,
         "the tone",
         callMethod<&IWifiService::RunTxStStart>},
        {"RunTxStStop",
         "Ends the single tone on a channel.",
         {&kChannel},
         &kStatus,
         "",
         callMethod<&IWifiService::RunTxStStop>},
        {"RunRxApJoinHoc",
         "Joins an open access point, for a check over the air.",
         {&kSsid, &kAddress},
         &kStatus,
         "",
         callMethod<&IWifiService::RunRxApJoinHoc>},
        {"RunRxBgStart",
         "Starts 802.11b/g (and a) reception with a packet count, until RunRxStop.",
         {&kChannel, &kRate, &kRxAntenna},
         &kStarted,
         "the reception",
         callMethod<&IWifiService::RunRxBgStart>},
        {"RunRxNStart",
         "Starts 802.11n or 802.11ac reception with a packet count, until RunRxStop.",
         {&kChannel, &kNarrowBandwidth, &kMcs, &kVht, &kRxAntenna},
         &kStarted,
         "the reception",
         callMethod<&IWifiService::RunRxNStart>},
        {"RunRxAxStart",
         "Starts 802.11ax reception where the chip supports it, until RunRxStop.",
         {&kChannel, &kBandwidth, &kMcs, &kRxAntenna},
         &kAxStarted,
         "the reception",
         callMethod<&IWifiService::RunRxAxStart>},
        {"RunRxStop",
         "Ends the reception and reads its packet count.",
         {&kChannel},
         &kPackets,
         "",
         callMethod<&IWifiService::RunRxStop>},
};

std::optional<bool> readFlag(const std::string& text) {
    if (text == "true" || text == "1") return true;
    if (text == "false" || text == "0") return false;
    return std::nullopt;
}

// Letters to insert, to leave out or to replace, whatever their case.
constexpr size_t kFarthestMisspelling = 3;

/** The number of such letters; a higher one for texts that are far apart in length. */
size_t editDistance(const std::string& text, const std::string& other) {
    if (text.size() > other.size() + kFarthestMisspelling) return kFarthestMisspelling + 1;
    std::vector<size_t> row(other.size() + 1);
    std::iota(row.begin(), row.end(), 0);
    for (size_t i = 0; i < text.size(); ++i) {
        size_t diagonal = row[0]++;
        for (size_t j = 0; j < other.size(); ++j) {
            const bool same = tolower(static_cast<unsigned char>(text[i])) ==
                              tolower(static_cast<unsigned char>(other[j]));
            const size_t replaced = diagonal + (same ? 0 : 1);
            diagonal = row[j + 1];
            row[j + 1] = std::min({replaced, row[j] + 1, row[j + 1] + 1});
        }
    }
    return row.back();
}

std::string wrongCount(const Command& command, size_t given) {
    const size_t expected = command.arguments.size();
    std::vector<const char*> names;
    for (const ArgumentKind* argument : command.arguments) names.push_back(argument->name);
    return std::string(command.name) + " takes " +
           (expected == 0 ? "no" : std::to_string(expected)) +
           (expected == 1 ? " argument" : " arguments") +
           (expected == 0 ? "" : " (" + ::android::base::Join(names, ' ') + ")") + ", not " +
           std::to_string(given);
}

/** The kernel accepts 32 pages for one argument of a program, such as the shell's, with its NUL. */
size_t longestCommandLine() {
    return 32 * static_cast<size_t>(getpagesize()) - 1;
}

// A command of one letter, and the blanks after it and after the argument.
constexpr size_t kLeastBesideArgument = 3;

} // namespace

bool Command::tellsFailure(const Answer& answer) const {
    return *result->failure != '\0' && answer.text == result->failure;
}

std::optional<std::string> packetCount(const std::string& answer) {
    std::string number = ::android::base::Trim(answer);
    if (::android::base::StartsWith(number, "Rx: ")) number.erase(0, 4);
    if (number.empty() || number.find_first_not_of("0123456789") != number.npos) {
        return std::nullopt;
    }
    return number.erase(0, std::min(number.find_first_not_of('0'), number.size() - 1));
}

std::vector<std::string> warningsOf(const Request& request) {
    std::vector<std::string> warnings;
    for (size_t i = 0; i < request.values.size(); ++i) {
        const ArgumentKind& kind = *request.command->arguments[i];
        const std::string& text = request.values[i].text;
        if (text.empty()) {
            warnings.push_back(std::string(kind.name) +
                               " is empty: on most chips the command line ends there");
        } else if (kind.isKnown != nullptr && !kind.isKnown(text)) {
            warnings.push_back(std::string(kind.name) + " " + quote(text) +
                               " is none that a chip knows (" + kind.accepted + ")");
        }
    }
    return warnings;
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
    const Command* nearest = nullptr;
    size_t distance = kFarthestMisspelling + 1;
    for (const Command& command : kCommands) {
        const size_t edits = editDistance(name, command.name);
        if (edits < distance) {
            distance = edits;
            nearest = &command;
        }
    }
    const std::string problem = "unknown method " + quote(name);
    return nearest == nullptr ? problem : problem + ", perhaps " + nearest->name;
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
                           " is true, false, 1 or 0, not " + quote(value.text);
                return false;
            }
            value.flag = *flag;
        } else if (value.text.size() > longestCommandLine() - kLeastBesideArgument) {
            *problem = std::string(command->arguments[i]->name) + " has " +
                       std::to_string(value.text.size()) + " bytes: a command line may have " +
                       std::to_string(longestCommandLine()) + ", so none with it can run";
            return false;
        }
        request->values.push_back(value);
    }
    return true;
}

} // namespace vendor::korvan::bex::wifi::client
