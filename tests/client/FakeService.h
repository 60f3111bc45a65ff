// Copyright 2026 The BEX Wi-Fi Authors
// SPDX-License-Identifier: Apache-2.0

#pragma once

#include <vendor/korvan/bex/wifi/1.0/IWifiService.h>

#include <functional>
#include <string>
#include <vector>

namespace vendor::korvan::bex::wifi::client {

/** The interface in the same process: notes each call and answers what the test has set. */
class FakeService : public V1_0::IWifiService {
  public:
    using hidl_string = ::android::hardware::hidl_string;
    template <typename T>
    using Return = ::android::hardware::Return<T>;
    using Words = std::vector<std::string>;

    int32_t number = 0;
    bool flag = false;
    std::string text;
    /** How the transaction fails after the call was noted. */
    ::android::status_t broken = ::android::OK;
    /** A method with a text leaves its callback alone. */
    bool silent = false;
    /** A method with a text calls its callback twice. */
    bool doubled = false;
    /** Runs in each call, on its thread; the answer may be set here. */
    std::function<void()> onCall = [] {};
    std::function<void()> onDestroyed = [] {};
    /** Each call's name and arguments. */
    std::vector<Words> calls;

    ~FakeService() override { onDestroyed(); }

    Return<int32_t> snifferStart(const hidl_string& channel,
                                 const hidl_string& bandwidth) override {
        return answer({"snifferStart", bytes(channel), bytes(bandwidth)}, number);
    }
    Return<int32_t> snifferStop() override { return answer({"snifferStop"}, number); }
    Return<bool> isSnifferMode() override { return answer({"isSnifferMode"}, flag); }
    Return<int32_t> getWlanMode() override { return answer({"getWlanMode"}, number); }
    Return<bool> isMimoSupport() override { return answer({"isMimoSupport"}, flag); }
    Return<int32_t> RunTxBGStart(const hidl_string& channel, const hidl_string& rate,
                                 const hidl_string& power, const hidl_string& antenna) override {
        return answer({"RunTxBGStart", bytes(channel), bytes(rate), bytes(power), bytes(antenna)},
                      number);
    }
    Return<int32_t> RunTxNStart(const hidl_string& channel, const hidl_string& bandwidth,
                                const hidl_string& rate, const hidl_string& power, bool vht,
                                const hidl_string& antenna) override {
        return answer({"RunTxNStart", bytes(channel), bytes(bandwidth), bytes(rate), bytes(power),
                       vht ? "yes" : "no", bytes(antenna)},
                      number);
    }
    Return<int32_t> RunTxAxStart(const hidl_string& channel, const hidl_string& bandwidth,
                                 const hidl_string& rate, const hidl_string& power,
                                 const hidl_string& guardInterval,
                                 const hidl_string& antenna) override {
        return answer({"RunTxAxStart", bytes(channel), bytes(bandwidth), bytes(rate), bytes(power),
                       bytes(guardInterval), bytes(antenna)},
                      number);
    }
    Return<int32_t> RunTxStop(const hidl_string& channel) override {
        return answer({"RunTxStop", bytes(channel)}, number);
    }
    Return<int32_t> RunTxStStart(const hidl_string& channel, const hidl_string& bandwidth,
                                 const hidl_string& antenna) override {
        return answer({"RunTxStStart", bytes(channel), bytes(bandwidth), bytes(antenna)}, number);
    }
    Return<int32_t> RunTxStStop(const hidl_string& channel) override {
        return answer({"RunTxStStop", bytes(channel)}, number);
    }
    Return<int32_t> RunRxApJoinHoc(const hidl_string& ssid, const hidl_string& address) override {
        return answer({"RunRxApJoinHoc", bytes(ssid), bytes(address)}, number);
    }
    Return<void> RunRxBgStart(const hidl_string& channel, const hidl_string& rate,
                              const hidl_string& antenna, RunRxBgStart_cb keep) override {
        return answerText({"RunRxBgStart", bytes(channel), bytes(rate), bytes(antenna)}, keep);
    }
    Return<void> RunRxNStart(const hidl_string& channel, const hidl_string& bandwidth,
                             const hidl_string& rate, bool vht, const hidl_string& antenna,
                             RunRxNStart_cb keep) override {
        return answerText({"RunRxNStart", bytes(channel), bytes(bandwidth), bytes(rate),
                           vht ? "yes" : "no", bytes(antenna)},
                          keep);
    }
    Return<void> RunRxAxStart(const hidl_string& channel, const hidl_string& bandwidth,
                              const hidl_string& rate, const hidl_string& antenna,
                              RunRxAxStart_cb keep) override {
        return answerText({"RunRxAxStart", bytes(channel), bytes(bandwidth), bytes(rate),
                           bytes(antenna)},
                          keep);
    }
    Return<void> RunRxStop(const hidl_string& channel, RunRxStop_cb keep) override {
        return answerText({"RunRxStop", bytes(channel)}, keep);
    }

  private:
    static std::string bytes(const hidl_string& argument) {
        return std::string(argument.c_str(), argument.size());
    }

    template <typename T>
    Return<T> answer(Words call, const T& value) {
        calls.push_back(std::move(call));
        onCall();
        if (broken != ::android::OK) return ::android::hardware::Status::fromStatusT(broken);
        return value;
    }

    Return<void> answerText(Words call, const std::function<void(const hidl_string&)>& keep) {
        calls.push_back(std::move(call));
        onCall();
        if (broken != ::android::OK) return ::android::hardware::Status::fromStatusT(broken);
        if (!silent) keep(text);
        if (doubled) keep(text);
        return ::android::hardware::Void();
    }
};

} // namespace vendor::korvan::bex::wifi::client
