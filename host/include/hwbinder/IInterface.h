// Copyright 2026 The BEX Wi-Fi Authors
// SPDX-License-Identifier: Apache-2.0

#pragma once

#include <hwbinder/Binder.h>

namespace android::hardware {

/** The binder side of a generated proxy. */
class IInterface : public virtual RefBase {
  public:
    static sp<IBinder> asBinder(IInterface* interface) {
        return interface == nullptr ? nullptr : sp<IBinder>(interface->onAsBinder());
    }

  protected:
    virtual IBinder* onAsBinder() = 0;
};

/** The base of a generated proxy for INTERFACE. */
template <typename INTERFACE>
class BpInterface : public INTERFACE, public IInterface, public BpHwRefBase {
  public:
    explicit BpInterface(const sp<IBinder>& remote) : BpHwRefBase(remote) {}

  protected:
    IBinder* onAsBinder() override { return remote(); }
};

} // namespace android::hardware
