// Copyright 2026 The BEX Wi-Fi Authors
// SPDX-License-Identifier: Apache-2.0

#pragma once

#include <hwbinder/IBinder.h>

// The kernel's name, which the generated code uses; the C library of a host has another one.
#ifndef SCHED_NORMAL
#define SCHED_NORMAL 0
#endif

namespace android::hardware {

/** A local object: the base of the generated stubs. */
class BHwBinder : public IBinder {
  public:
    status_t transact(uint32_t code, const Parcel& data, Parcel* reply, uint32_t flags = 0,
                      TransactCallback callback = nullptr) override;
    status_t linkToDeath(const sp<DeathRecipient>& recipient, void* cookie = nullptr,
                         uint32_t flags = 0) override;
    status_t unlinkToDeath(const wp<DeathRecipient>& recipient, void* cookie = nullptr,
                           uint32_t flags = 0, wp<DeathRecipient>* out = nullptr) override;
    BHwBinder* localBinder() override { return this; }

  protected:
    virtual status_t onTransact(uint32_t code, const Parcel& data, Parcel* reply,
                                uint32_t flags = 0, TransactCallback callback = nullptr) = 0;

    // A phone's driver uses these; a host has neither per-object priorities nor security contexts.
    void setRequestingSid(bool /*requesting*/) {}
    int mSchedPolicy = SCHED_NORMAL;
    int mSchedPriority = 0;
};

/** Holds the remote object of a generated proxy. */
class BpHwRefBase : public virtual RefBase {
  protected:
    explicit BpHwRefBase(const sp<IBinder>& remote) : mRemote(remote) {}
    IBinder* remote() const { return mRemote.get(); }

  private:
    const sp<IBinder> mRemote;
};

} // namespace android::hardware
