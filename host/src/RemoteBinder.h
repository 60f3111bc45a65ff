// Copyright 2026 The BEX Wi-Fi Authors
// SPDX-License-Identifier: Apache-2.0

#pragma once

#include <hwbinder/IBinder.h>

#include <memory>
#include <mutex>
#include <vector>

#include "host/src/Session.h"

namespace android::hardware::host {

/** An object in another process. */
class RemoteBinder : public IBinder {
  public:
    explicit RemoteBinder(std::unique_ptr<Session> session);
    ~RemoteBinder() override;

    status_t transact(uint32_t code, const Parcel& data, Parcel* reply, uint32_t flags = 0,
                      TransactCallback callback = nullptr) override;
    status_t linkToDeath(const sp<DeathRecipient>& recipient, void* cookie = nullptr,
                         uint32_t flags = 0) override;
    status_t unlinkToDeath(const wp<DeathRecipient>& recipient, void* cookie = nullptr,
                           uint32_t flags = 0, wp<DeathRecipient>* out = nullptr) override;

    /** Whether the server is there, and had no room for this client: so end all calls. */
    bool isRefused() { return mSession->isRefused(); }

  private:
    void sendObituaries();

    const std::unique_ptr<Session> mSession;
    std::mutex mMutex;
    std::vector<wp<DeathRecipient>> mRecipients;
    uint64_t mWatch = 0;
    bool mObituariesSent = false;
};

} // namespace android::hardware::host
