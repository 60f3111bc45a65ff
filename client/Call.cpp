// Copyright 2026 The BEX Wi-Fi Authors
// SPDX-License-Identifier: Apache-2.0

#include "client/Call.h"

#include <atomic>
#include <memory>

namespace vendor::korvan::bex::wifi::client {
namespace {

/** What the worker reports. Read the answer only when the worker is done. */
struct Shared {
    std::atomic<Stage> stage = Stage::lookup;
    bool found = false;
    Answer answer;
};

void work(const Request& request, const FindService& find, Shared* shared) {
    const ::android::sp<IWifiService> service = find();
    if (service == nullptr) return;
    shared->found = true;
    shared->stage = Stage::call;
    shared->answer = request.command->call(*service, request.values);
    if (shared->answer.delivered) shared->stage = Stage::done;
}

} // namespace

void applyWait(const Waited& waited, Outcome* outcome) {
    outcome->number = waited.number;
    switch (waited.end) {
        case Waited::End::done:
            break;
        case Waited::End::late:
            outcome->ending = Ending::late;
            break;
        case Waited::End::interrupted:
            outcome->ending = Ending::interrupted;
            break;
        case Waited::End::notStarted:
            outcome->ending = Ending::notStarted;
            break;
    }
}

Outcome callService(const Request& request, const FindService& find,
                    std::optional<std::chrono::nanoseconds> timeout, const Progress& progress) {
    Outcome outcome;
    outcome.started = std::chrono::system_clock::now();
    const Clock::time_point start = Clock::now();
    const auto shared = std::make_shared<Shared>();
    const Waited waited = waitFor([request, find, shared] { work(request, find, shared.get()); },
                                  timeout ? start + *timeout : kNever, progress);
    outcome.stage = shared->stage;
    if (waited.end == Waited::End::done) {
        outcome.answer = shared->answer;
        outcome.ending = !shared->found             ? Ending::notFound
                         : outcome.answer.delivered ? Ending::answered
                                                    : Ending::transportFailed;
    }
    applyWait(waited, &outcome);
    outcome.duration = Clock::now() - start;
    return outcome;
}

} // namespace vendor::korvan::bex::wifi::client
