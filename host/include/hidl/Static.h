// Copyright 2026 The BEX Wi-Fi Authors
// SPDX-License-Identifier: Apache-2.0

#pragma once

#include <android/hidl/base/1.0/IBase.h>
#include <hidl/ConcurrentMap.h>
#include <hwbinder/IBinder.h>
#include <hwbinder/IInterface.h>
#include <utils/StrongPointer.h>

#include <functional>
#include <string>

namespace android::hardware::details {

/** Makes a stub (Bn) or a passthrough wrapper (Bs) of a local object. The argument is an IBase*. */
using BnConstructorMap = ConcurrentMap<std::string, std::function<sp<IBinder>(void*)>>;
using BsConstructorMap =
        ConcurrentMap<std::string, std::function<sp<hidl::base::V1_0::IBase>(void*)>>;

// Filled by the generated code's constructors, so they exist from the first use on, and for ever.
BnConstructorMap& getBnConstructorMap();
BsConstructorMap& getBsConstructorMap();

/** A thread's scheduling, which a phone's driver gives to the thread that serves an object. */
struct SchedPrio {
    int sched_policy;
    int prio;
};

/** The stub that a local object has, so that it has only one. */
using BnMap = ConcurrentMap<const hidl::base::V1_0::IBase*, wp<BHwBinder>>;
extern BnMap* const gBnMap;
using ServicePrioMap = ConcurrentMap<wp<hidl::base::V1_0::IBase>, SchedPrio>;
extern ServicePrioMap* const gServicePrioMap;
using ServiceSidMap = ConcurrentMap<wp<hidl::base::V1_0::IBase>, bool>;
extern ServiceSidMap* const gServiceSidMap;

} // namespace android::hardware::details
