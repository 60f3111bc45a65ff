// Copyright 2026 The BEX Wi-Fi Authors
// SPDX-License-Identifier: Apache-2.0

#include <hwbinder/Binder.h>
#include <hwbinder/Parcel.h>
#include <hwbinder/ProcessState.h>

#include <utility>

namespace android::hardware {

status_t BHwBinder::transact(uint32_t code, const Parcel& data, Parcel* reply, uint32_t flags,
                             TransactCallback callback) {
    data.setDataPosition(0);
    return onTransact(code, data, reply, flags, [&](Parcel& result) {
        result.setDataPosition(0);
        if (callback) callback(result);
    });
}

// No notice is needed: the object and the recipient die together.
status_t BHwBinder::linkToDeath(const sp<DeathRecipient>& /*recipient*/, void* /*cookie*/,
                                uint32_t /*flags*/) {
    return INVALID_OPERATION;
}

status_t BHwBinder::unlinkToDeath(const wp<DeathRecipient>& /*recipient*/, void* /*cookie*/,
                                  uint32_t /*flags*/, wp<DeathRecipient>* /*out*/) {
    return INVALID_OPERATION;
}

sp<ProcessState> ProcessState::self() {
    static const sp<ProcessState> state = new ProcessState;
    return state;
}

} // namespace android::hardware
