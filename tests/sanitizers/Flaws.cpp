// Copyright 2026 The BEX Wi-Fi Authors
// SPDX-License-Identifier: Apache-2.0

#include "tests/sanitizers/Flaws.h"

#include <utils/RefBase.h>
#include <utils/StrongPointer.h>

#include <limits>
#include <map>
#include <mutex>
#include <thread>

namespace {

using ::android::RefBase;
using ::android::sp;

// Out of the optimiser's sight.
volatile int gIndex = 8;
volatile int gLargest = std::numeric_limits<int>::max();
int* volatile gPointer;
RefBase* volatile gObject;

/** Counted as the service object and the proxies are. */
struct Counted : RefBase {
    int value = 0;
};

void leak() {
    gPointer = new int[8];
    gPointer = nullptr;
}

void loseReference() {
    gObject = new Counted;
    gObject->incStrong(nullptr);
    gObject = nullptr;
}

void overflow() {
    gPointer = new int[8];
    gPointer[gIndex] = 1;
    delete[] gPointer;
}

void useAfterFree() {
    gPointer = new int[8];
    delete[] gPointer;
    gPointer[0] = 1;
}

void overflowInteger() {
    gLargest = gLargest + 1;
}

template <typename Work>
void onTwoThreads(Work work) {
    std::thread other(work);
    work();
    other.join();
}

void race() {
    int value = 0;
    onTwoThreads([&value] { ++value; });
}

/** Each thread gives its reference back, and the counting hides nothing of what they did before. */
void raceBesideCount() {
    sp<Counted> object = new Counted;
    onTwoThreads([object]() mutable {
        ++object->value;
        object.clear();
    });
}

/** Two locks, taken in both orders, though never at once. */
void invertLocks() {
    std::mutex first;
    std::mutex second;
    {
        const std::lock_guard one(first);
        const std::lock_guard two(second);
    }
    const std::lock_guard two(second);
    const std::lock_guard one(first);
}

const std::map<std::string, void (*)()> kFlaws = {
        {"leak", leak},
        {"lost-reference", loseReference},
        {"overflow", overflow},
        {"use-after-free", useAfterFree},
        {"undefined", overflowInteger},
        {"race", race},
        {"count-race", raceBesideCount},
        {"deadlock", invertLocks},
};

} // namespace

void commitFlaw(const std::string& name) {
    const auto flaw = kFlaws.find(name);
    if (flaw != kFlaws.end()) flaw->second();
}
