// Copyright 2026 The BEX Wi-Fi Authors
// SPDX-License-Identifier: Apache-2.0

#pragma once

#include <android-base/unique_fd.h>
#include <hwbinder/Binder.h>
#include <hwbinder/Parcel.h>

#include <atomic>

#include "host/src/Channel.h"
#include "host/src/Engine.h"
#include "host/src/Frame.h"

namespace android::hardware::host {

/** Whether the process at the other end may talk to this one: the same user's, or root's. */
bool isTrustedPeer(int socket);

/** The socket of a registered instance: its clients become Connections. */
class Listener : public Endpoint {
  public:
    Listener(base::unique_fd socket, const sp<BHwBinder>& target)
          : Endpoint(std::move(socket)), mTarget(target) {}
    void onReady(uint32_t events) override;

  private:
    const sp<BHwBinder> mTarget;
    std::atomic<bool> mRefused = false;
};

/**
 * One client's way to one object, which carries one call at a time. A thread owns it from the
 * call's arrival until the reply goes out; then another thread may serve the next call while the
 * first still finishes its method.
 */
class Connection : public Endpoint {
  public:
    Connection(base::unique_fd client, const sp<BHwBinder>& target)
          : Endpoint(std::move(client)), mTarget(target), mReader(socket()) {}
    void onReady(uint32_t events) override;

  private:
    enum class State { kIdle, kOwned, kOwnedAndReady };

    bool own();
    bool disownIfNothingCame();
    void disown();
    void serve(const FrameHeader& header, Parcel* request);
    void answer(status_t status, const Parcel* reply);
    void close();

    const sp<BHwBinder> mTarget;
    FrameReader mReader;
    std::atomic<State> mState{State::kIdle};
};

} // namespace android::hardware::host
