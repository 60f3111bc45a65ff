// Copyright 2026 The BEX Wi-Fi Authors
// SPDX-License-Identifier: Apache-2.0

#pragma once

#include <benchmark/benchmark.h>

#include <algorithm>
#include <vector>

#include "benchmarks/Clock.h"

namespace vendor::korvan::bex::wifi::benchmarks {

/** The durations of one kind of work, in seconds. */
class Durations {
  public:
    template <typename Work>
    void add(const Work& work) {
        const Clock::time_point start = Clock::now();
        work();
        mSeconds.push_back(secondsSince(start));
    }

    /** The one that so many hundredths are not longer than. */
    double percentile(size_t hundredths) {
        std::sort(mSeconds.begin(), mSeconds.end());
        return mSeconds[mSeconds.size() * hundredths / 100];
    }

  private:
    std::vector<double> mSeconds;
};

/**
 * Times floor and subject by turns, `block` of each at a time and each first every other time, so
 * that what else the machine does hits both. Counts the subject's median, and its slowest of a
 * hundred, in those of the floor: "p50" and "p99".
 */
template <typename Floor, typename Subject>
void measureByTurns(benchmark::State& state, int block, const Floor& floor,
                    const Subject& subject) {
    Durations ofFloor;
    Durations ofSubject;
    const auto timeFloor = [&] {
        for (int i = 0; i < block; ++i) ofFloor.add(floor);
    };
    const auto timeSubject = [&] {
        for (int i = 0; i < block; ++i) ofSubject.add(subject);
    };
    bool floorFirst = true;
    while (state.KeepRunning()) {
        if (floorFirst) timeFloor();
        timeSubject();
        if (!floorFirst) timeFloor();
        floorFirst = !floorFirst;
    }
    state.counters["p50"] = ofSubject.percentile(50) / ofFloor.percentile(50);
    state.counters["p99"] = ofSubject.percentile(99) / ofFloor.percentile(99);
}

} // namespace vendor::korvan::bex::wifi::benchmarks
