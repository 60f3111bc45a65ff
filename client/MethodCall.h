// Copyright 2026 The BEX Wi-Fi Authors
// SPDX-License-Identifier: Apache-2.0

#pragma once

#include <optional>
#include <type_traits>
#include <utility>

#include "client/Commands.h"

// The call of any of the interface's methods, by its parameters' types: each text and each flag
// takes the next word, a callback keeps the method's answer.

namespace vendor::korvan::bex::wifi::client {

/** What a method answered through its callback. */
struct KeptText {
    std::optional<std::string> text;
    bool again = false;

    Answer answer() const {
        if (!text) return {false, "", "the method returned without an answer"};
        if (again) return {false, "", "the method answered more than once"};
        return {true, *text, ""};
    }
};

inline std::string printed(int32_t number) {
    return std::to_string(number);
}

inline std::string printed(bool flag) {
    return flag ? "true" : "false";
}

/** The argument for one parameter; its value is at `place`, which a callback does not have. */
template <typename Parameter>
auto argumentFor(const std::vector<Value>& values, size_t place, KeptText* kept) {
    using ::android::hardware::hidl_string;
    using Type = std::decay_t<Parameter>;
    if constexpr (std::is_same_v<Type, bool>) {
        return values[place].flag;
    } else if constexpr (std::is_same_v<Type, hidl_string>) {
        return hidl_string(values[place].text);
    } else {
        return [kept](const hidl_string& out) {
            kept->again = kept->text.has_value();
            kept->text.emplace(out.c_str(), out.size());
        };
    }
}

template <typename Result, typename... Parameters, size_t... Places>
Answer callWithParameters(
        ::android::hardware::Return<Result> (IWifiService::*method)(Parameters...),
        std::index_sequence<Places...>, IWifiService& wifi, const std::vector<Value>& values) {
    KeptText kept;
    const ::android::hardware::Return<Result> result =
            (wifi.*method)(argumentFor<Parameters>(values, Places, &kept)...);
    if (!result.isOk()) return {false, "", result.description()};
    if constexpr (std::is_void_v<Result>) {
        return kept.answer();
    } else {
        return {true, printed(static_cast<Result>(result)), ""};
    }
}

template <typename Result, typename... Parameters>
std::index_sequence_for<Parameters...> placesOf(
        ::android::hardware::Return<Result> (IWifiService::*)(Parameters...));

/** Calls `method`, such as &IWifiService::RunTxStop, with the values in order. */
template <auto method>
Answer callMethod(IWifiService& wifi, const std::vector<Value>& values) {
    return callWithParameters(method, decltype(placesOf(method))(), wifi, values);
}

} // namespace vendor::korvan::bex::wifi::client
