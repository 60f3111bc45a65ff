// Copyright 2026 The BEX Wi-Fi Authors
// SPDX-License-Identifier: Apache-2.0

#pragma once

#include <utils/Errors.h>
#include <utils/RefBase.h>

#include <cstdint>
#include <functional>

namespace android::hardware {

class Parcel;
class BHwBinder;

/** An object that takes transactions: the local one (BHwBinder) or the way to one elsewhere. */
class IBinder : public virtual RefBase {
  public:
    enum : uint32_t {
        FLAG_ONEWAY = 0x01,
    };

    /** Called with the reply as soon as there is one, on the thread that serves the call. */
    using TransactCallback = std::function<void(Parcel&)>;

    class DeathRecipient : public virtual RefBase {
      public:
        virtual void binderDied(const wp<IBinder>& who) = 0;
    };

    /**
     * Carries a call to the object and waits for its reply, or for nothing with FLAG_ONEWAY.
     *
     * @return OK; what the object answered in place of a reply (UNKNOWN_TRANSACTION, BAD_TYPE,
     *     BAD_VALUE...); FAILED_TRANSACTION when the call or its reply does not fit the buffer;
     *     DEAD_OBJECT when the object's process is gone.
     */
    virtual status_t transact(uint32_t code, const Parcel& data, Parcel* reply, uint32_t flags = 0,
                              TransactCallback callback = nullptr) = 0;

    /**
     * A recipient that is linked twice is notified twice; one that is linked after the death, at
     * once. DEAD_OBJECT when notices have gone out already, INVALID_OPERATION locally.
     */
    virtual status_t linkToDeath(const sp<DeathRecipient>& recipient, void* cookie = nullptr,
                                 uint32_t flags = 0) = 0;
    /** NAME_NOT_FOUND when the recipient is not linked. */
    virtual status_t unlinkToDeath(const wp<DeathRecipient>& recipient, void* cookie = nullptr,
                                   uint32_t flags = 0, wp<DeathRecipient>* out = nullptr) = 0;

    /** This object when it lives in this process, else null. */
    virtual BHwBinder* localBinder() { return nullptr; }
};

} // namespace android::hardware
