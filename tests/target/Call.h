// Copyright 2026 The BEX Wi-Fi Authors
// SPDX-License-Identifier: Apache-2.0

#pragma once

#include <vendor/korvan/bex/wifi/1.0/IWifiService.h>

#include <functional>
#include <string>
#include <type_traits>

// A call of the interface as a value, so that tests can hold calls in tables:
//
//     constexpr Method kRunTxStop{"RunTxStop", &IWifiService::RunTxStop, kStatus, Effect::radio};
//     const Call call = kRunTxStop("6");
//     const Answer answer = call.run(*service);
//     EXPECT_TRUE(call.form->fits(answer.text)) << call.text; // RunTxStop("6")

namespace vendor::korvan::bex::wifi::target {

using ::android::hardware::hidl_string;
using ::android::hardware::Return;
using V1_0::IWifiService;

/** What a method may answer on any phone. */
struct Form {
    const char* words;
    bool (*fits)(const std::string& text);
};

/** What a method changes on the phone. */
enum class Effect { none, radio, capture };

struct Answer {
    /** The result as text: a number in decimal, "true" or "false", the text itself. */
    std::string text;
    /** Why there is no result; empty when there is one. */
    std::string problem;
};

struct Call {
    /** As in a source file: RunTxStop("6") */
    std::string text;
    const Form* form;
    Effect effect;
    std::function<Answer(IWifiService&)> run;
};

/** A method of the interface: called with arguments, it gives a Call. */
template <typename Member>
class Method {
  public:
    constexpr Method(const char* name, Member member, const Form& form, Effect effect)
          : mName(name), mMember(member), mForm(&form), mEffect(effect) {}

    template <typename... Arguments>
    Call operator()(Arguments... arguments) const {
        std::string text = std::string(mName) + "(";
        ((text += (text.back() == '(' ? "" : ", ") + quoted(arguments)), ...);
        auto run = [member = mMember, arguments...](IWifiService& wifi) {
            if constexpr (std::is_invocable_v<Member, IWifiService&, Arguments...>) {
                return answer((wifi.*member)(arguments...));
            } else {
                return answerText(
                        [&](const auto& take) { return (wifi.*member)(arguments..., take); });
            }
        };
        return {text + ")", mForm, mEffect, run};
    }

  private:
    static std::string printed(bool flag) { return flag ? "true" : "false"; }
    static std::string printed(int32_t number) { return std::to_string(number); }
    static std::string quoted(bool flag) { return printed(flag); }
    static std::string quoted(const char* text) { return std::string("\"") + text + '"'; }

    template <typename Result>
    static Answer answer(const Return<Result>& result) {
        if (!result.isOk()) return {"", result.description()};
        return {printed(static_cast<Result>(result)), ""};
    }

    template <typename CallWith>
    static Answer answerText(const CallWith& callWith) {
        std::string text;
        int callbacks = 0;
        const Return<void> result = callWith([&](const hidl_string& out) {
            text = std::string(out.c_str(), out.size());
            ++callbacks;
        });
        if (!result.isOk()) return {"", result.description()};
        if (callbacks != 1) return {"", "it called back " + std::to_string(callbacks) + " times"};
        return {text, ""};
    }

    const char* mName;
    Member mMember;
    const Form* mForm;
    Effect mEffect;
};

} // namespace vendor::korvan::bex::wifi::target
