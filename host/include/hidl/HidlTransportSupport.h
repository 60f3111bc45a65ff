// Copyright 2026 The BEX Wi-Fi Authors
// SPDX-License-Identifier: Apache-2.0

#pragma once

#include <android/hidl/base/1.0/IBase.h>
#include <hidl/HidlBinderSupport.h>
#include <hidl/HidlPassthroughSupport.h>
#include <hidl/HidlSupport.h>
#include <hidl/HidlTransportUtils.h>
#include <hidl/ServiceManagement.h>

#include <cstddef>
#include <mutex>
#include <string>

namespace android::hardware {

/**
 * Sets how many calls this process serves at a time. Comes before any registration.
 *
 * @param maxThreads The number of threads, at least 1.
 * @param callerWillJoin true when one of them is the caller's, which then calls
 *     joinRpcThreadpool().
 */
void configureRpcThreadpool(size_t maxThreads, bool callerWillJoin);

/** Serves calls for ever. Aborts unless configureRpcThreadpool() was called. */
[[noreturn]] void joinRpcThreadpool();

namespace details {

/** Process ids and addresses stay private unless the build is debuggable, which it never is here.
 */
inline int32_t getPidIfSharable() {
    return -1;
}
inline bool debuggable() {
    return false;
}

/** The checked cast for the generated castFrom(): null when the object is something else. */
template <typename IChild, typename IParent, typename BpChild>
Return<sp<IChild>> castInterface(const sp<IParent>& parent, const char* name, bool emitError) {
    if (parent == nullptr) return sp<IChild>(nullptr);
    Return<bool> canCast = canCastInterface(parent.get(), name, emitError);
    if (!canCast.isOk()) {
        if (emitError) return canCast.propagate();
        return sp<IChild>(nullptr);
    }
    if (!canCast) return sp<IChild>(nullptr);
    if (parent->isRemote()) return sp<IChild>(new BpChild(toBinder(parent)));
    return sp<IChild>(static_cast<IChild*>(parent.get()));
}

/** The body of the generated getService() and tryGetService(). There are no passthrough objects. */
template <typename BpType>
sp<typename BpType::Pure> getServiceInternal(const std::string& instance, bool retry,
                                             bool getStub) {
    using IType = typename BpType::Pure;
    const sp<hidl::base::V1_0::IBase> found =
            getRawServiceInternal(IType::descriptor, instance, retry, getStub);
    if (found == nullptr) return nullptr;
    if (found->isRemote()) return new BpType(toBinder(found));
    return static_cast<IType*>(found.get());
}

} // namespace details
} // namespace android::hardware
