// Copyright 2026 The BEX Wi-Fi Authors
// SPDX-License-Identifier: Apache-2.0

#pragma once

#include <vendor/korvan/bex/wifi/1.0/IWifiService.h>

#include <atomic>
#include <string>

namespace vendor::korvan::bex::wifi::tests {

/**
 * The interface, as a test wants it to behave. RunRxStop's argument is the script, up to the first
 * blank; what follows may be padding:
 *
 *     wait        reports "entered", waits for the gate, answers "done", reports "left"
 *     late        answers "early", reports "answered", waits for the gate, reports "left"
 *     never       leaves the callback alone
 *     twice       answers "first", then "second"
 *     throw       lets an exception out; throw-late: after answering "first"
 *     status      returns a failed status; status-late: after answering "first"
 *     large N     answers N bytes
 *     count       answers how many methods ran before
 *     else        answers the argument
 */
class ScriptedService : public V1_0::IWifiService {
  public:
    using hidl_string = ::android::hardware::hidl_string;
    template <typename T>
    using Return = ::android::hardware::Return<T>;

    /**
     * @param events The descriptor that reports go to, one line each; -1 for none.
     * @param gate The descriptor of which one byte lets one waiting method go on.
     * @param tag What getWlanMode() answers, so that a client can tell servers apart.
     */
    ScriptedService(int events, int gate, int32_t tag) : mEvents(events), mGate(gate), mTag(tag) {}

    void report(const std::string& line);
    void passGate();

    Return<int32_t> snifferStart(const hidl_string& channel, const hidl_string& bandwidth) override;
    Return<int32_t> snifferStop() override { return run(); }
    Return<bool> isSnifferMode() override { return run() == 0; }
    Return<int32_t> getWlanMode() override;
    Return<bool> isMimoSupport() override { return run() != 0; }
    Return<int32_t> RunTxBGStart(const hidl_string&, const hidl_string&, const hidl_string&,
                                 const hidl_string&) override {
        return run();
    }
    Return<int32_t> RunTxNStart(const hidl_string& channel, const hidl_string& bandwidth,
                                const hidl_string& rate, const hidl_string& power, bool vht,
                                const hidl_string& antenna) override;
    Return<int32_t> RunTxAxStart(const hidl_string&, const hidl_string&, const hidl_string&,
                                 const hidl_string&, const hidl_string&,
                                 const hidl_string&) override {
        return run();
    }
    Return<int32_t> RunTxStop(const hidl_string&) override { return run(); }
    Return<int32_t> RunTxStStart(const hidl_string&, const hidl_string&,
                                 const hidl_string&) override {
        return run();
    }
    Return<int32_t> RunTxStStop(const hidl_string&) override { return run(); }
    Return<int32_t> RunRxApJoinHoc(const hidl_string&, const hidl_string&) override {
        return run();
    }
    Return<void> RunRxBgStart(const hidl_string& channel, const hidl_string& rate,
                              const hidl_string& antenna, RunRxBgStart_cb callback) override;
    Return<void> RunRxNStart(const hidl_string& channel, const hidl_string& bandwidth,
                             const hidl_string& rate, bool vht, const hidl_string& antenna,
                             RunRxNStart_cb callback) override;
    Return<void> RunRxAxStart(const hidl_string& channel, const hidl_string&, const hidl_string&,
                              const hidl_string&, RunRxAxStart_cb callback) override;
    Return<void> RunRxStop(const hidl_string& script, RunRxStop_cb callback) override;

  private:
    int32_t run();

    const int mEvents;
    const int mGate;
    const int32_t mTag;
    std::atomic<int> mRuns{0};
};

} // namespace vendor::korvan::bex::wifi::tests
