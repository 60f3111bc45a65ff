// Copyright 2026 The BEX Wi-Fi Authors
// SPDX-License-Identifier: Apache-2.0

#include "client/Call.h"

#include <atomic>
#include <memory>

namespace vendor::korvan::bex::wifi::client {
namespace {

/** What the worker tells of itself; the answer may be read when it is done. */
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

Ending endingOf(const Waited& waited, const Shared& shared) {
    switch (waited.end) {
        case Waited::End::late:
            return Ending::late;
        case Waited::End::interrupted:
            return Ending::interrupted;
        case Waited::End::notStarted:
            return Ending::notStarted;
        case Waited::End::done:
            break;
    }
    if (!shared.found) return Ending::notFound;
    return shared.answer.delivered ? Ending::answered : Ending::transportFailed;
}

} // namespace

Outcome callService(const Request& request, const FindService& find,
                    std::optional<std::chrono::nanoseconds> timeout, const Progress& progress) {
    const Clock::time_point start = Clock::now();
    const auto shared = std::make_shared<Shared>();
    const Waited waited = waitFor([request, find, shared] { work(request, find, shared.get()); },
                                  timeout ? start + *timeout : kNever, progress);
    Outcome outcome;
    outcome.ending = endingOf(waited, *shared);
    outcome.stage = shared->stage;
    outcome.number = waited.number;
    if (waited.end == Waited::End::done) outcome.answer = shared->answer;
    outcome.duration = Clock::now() - start;
    return outcome;
}

} // namespace vendor::korvan::bex::wifi::client
