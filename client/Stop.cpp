// Copyright 2026 The BEX Wi-Fi Authors
// SPDX-License-Identifier: Apache-2.0

#include "client/Stop.h"

#include <algorithm>
#include <memory>
#include <mutex>
#include <thread>
#include <utility>

namespace vendor::korvan::bex::wifi::client {
namespace {

using ::android::sp;

constexpr const char* kMethods[] = {"RunTxStop", "RunTxStStop", "RunRxStop", "snifferStop"};
constexpr int kPasses = 3;
constexpr std::chrono::microseconds kBetweenQuestions(200);
// Looks follow each other quickly at first: on a busy phone one may see nothing where the next one
// does.
constexpr std::chrono::milliseconds kFirstPause(5);
constexpr std::chrono::milliseconds kLongestPause(100);

// What the answer 0 proves, by the lines that must have succeeded for it:
//
//   broadcom      snifferStop   "ifconfig wlan0 down" ends the firmware, and every test with it.
//                               RunTxStop and RunTxStStop do so too, and fail when nothing runs
//   the others    RunTxStStop   "rmmod wlan" ends the driver, and every test with it; the driver
//                               that is loaded afterwards starts in normal mode. On wcn RunTxStop
//                               only ends the transmission
//                 snifferStop   "echo 0" ends monitor mode
//
// RunRxStop proves nothing on any chip: its answer is a count, also after failed commands.
struct Proof {
    const char* family;
    std::vector<std::string> methods;
};
const std::vector<Proof> kProofs = {{"broadcom", {"snifferStop"}}};
const std::vector<std::string> kProofOfOthers = {"RunTxStStop", "snifferStop"};

// Questions and a call run at the same time. If each answer follows the one before within this part
// of the call's time, no question has waited for the call's end.
constexpr int kPromptly = 4;

/** What the worker reports; the caller may give up at any time. */
struct Shared {
    std::mutex lock;
    Stopped stopped;
};

bool proves(const std::vector<StopCall>& calls, const std::vector<std::string>& methods) {
    return std::all_of(methods.begin(), methods.end(), [&calls](const std::string& method) {
        return std::any_of(calls.begin(), calls.end(), [&method](const StopCall& call) {
            return call.command->name == method && call.answer.text == "0";
        });
    });
}

class Work {
  public:
    Work(std::string channel, const std::string& family, std::shared_ptr<Shared> shared)
          : mChannel(std::move(channel)), mProof(proofOf(family)), mShared(std::move(shared)) {}

    void run(const FindService& find) {
        mService = find();
        if (mService == nullptr) return end(Ending::notFound);
        set([](Stopped* stopped) { stopped->outcome.stage = Stage::call; });
        while (!makeCalls() && mError.empty()) waitUntilAlone();
        set([](Stopped* stopped) { stopped->alone = true; });
        for (int pass = 0; pass < kPasses && mError.empty(); ++pass) {
            makeCalls();
            if (judge()) break;
        }
        if (!mError.empty()) return fail();
        end(Ending::answered);
    }

  private:
    template <typename Change>
    void set(Change change) {
        const std::lock_guard<std::mutex> guard(mShared->lock);
        change(&mShared->stopped);
    }
    void end(Ending how) {
        set([how](Stopped* stopped) { stopped->outcome.ending = how; });
    }
    void fail() {
        set([this](Stopped* stopped) {
            stopped->outcome.ending = Ending::transportFailed;
            stopped->outcome.answer.transportError = mError;
        });
    }

    /**
     * Runs the work, which is a call, and asks the service until it is done; tells whether the
     * service was in no other call at that time. The longest time without an answer decides. It
     * counts even when this thread had no processor to ask: what it missed proves nothing.
     */
    bool isAloneDuring(std::function<void()> work) {
        const Clock::time_point begin = Clock::now();
        Clock::duration longest{};
        Clock::time_point heard = begin;
        const auto hear = [&longest, &heard] {
            const Clock::time_point now = Clock::now();
            longest = std::max(longest, now - std::exchange(heard, now));
        };
        Worker worker(std::move(work));
        if (worker.error() != 0) mError = "no second thread can be started";
        while (mError.empty() && !worker.done()) {
            const auto answer = mService->isMimoSupport();
            if (!answer.isOk()) mError = answer.description();
            hear();
            std::this_thread::sleep_for(kBetweenQuestions);
        }
        hear();
        if (mError.empty()) worker.join();
        return mError.empty() && longest < (Clock::now() - begin) / kPromptly;
    }

    /** Until no other call is under way. Changes nothing. */
    void waitUntilAlone() {
        std::chrono::milliseconds pause = kFirstPause;
        while (!isAloneDuring([service = mService] { service->getWlanMode().isOk(); }) &&
               mError.empty()) {
            std::this_thread::sleep_for(pause);
            pause = std::min(2 * pause, kLongestPause);
        }
    }

    /**
     * Makes all calls once; tells whether the service was in no other call during one of them, and
     * so during those after it.
     */
    bool makeCalls() {
        set([](Stopped* stopped) { stopped->calls.clear(); });
        bool alone = false;
        for (const char* method : kMethods) {
            const Command& command = *findCommand(method);
            const std::vector<Value> values(command.arguments.size(), {mChannel});
            const auto answer = std::make_shared<Answer>();
            alone |= isAloneDuring([service = mService, &command, values, answer] {
                *answer = command.call(*service, values);
            });
            if (mError.empty() && !answer->delivered) mError = answer->transportError;
            if (!mError.empty()) return false;
            set([&](Stopped* stopped) { stopped->calls.push_back({&command, *answer}); });
        }
        return alone;
    }

    /** Whether the calls that were made last prove that the radio is off. */
    bool judge() {
        bool off = false;
        set([&](Stopped* stopped) { off = stopped->off = proves(stopped->calls, mProof); });
        return off;
    }

    const std::string mChannel;
    const std::vector<std::string> mProof;
    const std::shared_ptr<Shared> mShared;
    sp<IWifiService> mService;
    /** Why the service cannot be asked any more; empty as long as it can. */
    std::string mError;
};

} // namespace

std::vector<std::string> proofOf(const std::string& family) {
    for (const Proof& proof : kProofs) {
        if (family == proof.family) return proof.methods;
    }
    return kProofOfOthers;
}

Stopped stopRadio(const std::string& channel, const std::string& family, const FindService& find,
                  std::chrono::nanoseconds timeout, const Progress& progress) {
    const auto started = std::chrono::system_clock::now();
    const Clock::time_point start = Clock::now();
    const auto shared = std::make_shared<Shared>();
    const auto work = std::make_shared<Work>(channel, family, shared);
    const Waited waited = waitFor([work, find] { work->run(find); }, start + timeout, progress);
    const std::lock_guard<std::mutex> guard(shared->lock);
    Stopped stopped = shared->stopped;
    applyWait(waited, &stopped.outcome);
    if (stopped.outcome.ending == Ending::answered) stopped.outcome.stage = Stage::done;
    stopped.outcome.started = started;
    stopped.outcome.duration = Clock::now() - start;
    return stopped;
}

} // namespace vendor::korvan::bex::wifi::client
