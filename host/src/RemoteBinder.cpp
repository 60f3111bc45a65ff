// Copyright 2026 The BEX Wi-Fi Authors
// SPDX-License-Identifier: Apache-2.0

#include "host/src/RemoteBinder.h"

#include <hwbinder/Parcel.h>

#include <algorithm>
#include <utility>

#include "host/src/Channel.h"
#include "host/src/DeathWatch.h"

namespace android::hardware::host {
namespace {

/** One answer, and whether more can be expected of the connection. */
status_t awaitReply(int connection, Parcel* reply) {
    FrameHeader header;
    switch (FrameReader(connection).receive(0, &header, reply)) {
        case Receipt::kFrame:
            return header.status;
        case Receipt::kNoRoom:
            return FAILED_TRANSACTION;
        default:
            return DEAD_OBJECT;
    }
}

} // namespace

RemoteBinder::RemoteBinder(std::unique_ptr<Session> session) : mSession(std::move(session)) {}

RemoteBinder::~RemoteBinder() {
    if (mWatch != 0) DeathWatch::get().unwatch(mWatch, mSession->first());
}

status_t RemoteBinder::transact(uint32_t code, const Parcel& data, Parcel* reply, uint32_t flags,
                                TransactCallback callback) {
    const bool oneway = (flags & FLAG_ONEWAY) != 0;
    const int connection = mSession->acquire();
    if (connection < 0) return DEAD_OBJECT;

    FrameHeader header;
    header.flags = oneway ? uint32_t{FrameHeader::kOneway} : 0;
    header.code = code;
    Parcel ignored;
    if (reply == nullptr) reply = &ignored;
    status_t result = sendFrame(connection, header, &data, 0);
    if (result == OK && !oneway) result = awaitReply(connection, reply);
    if (result == DEAD_OBJECT) mSession->markDead();
    mSession->release(connection);
    if (result == OK && !oneway && callback) callback(*reply);
    return result;
}

status_t RemoteBinder::linkToDeath(const sp<DeathRecipient>& recipient, void* /*cookie*/,
                                   uint32_t /*flags*/) {
    std::lock_guard<std::mutex> lock(mMutex);
    if (mObituariesSent) return DEAD_OBJECT;
    mRecipients.emplace_back(recipient);
    if (mWatch == 0) {
        wp<RemoteBinder> self(this);
        mWatch = DeathWatch::get().watch(mSession->first(), [self] {
            sp<RemoteBinder> binder = self.promote();
            if (binder != nullptr) binder->sendObituaries();
        });
    }
    return OK;
}

status_t RemoteBinder::unlinkToDeath(const wp<DeathRecipient>& recipient, void* /*cookie*/,
                                     uint32_t /*flags*/, wp<DeathRecipient>* out) {
    std::lock_guard<std::mutex> lock(mMutex);
    if (mObituariesSent) return DEAD_OBJECT;
    auto found = std::find(mRecipients.begin(), mRecipients.end(), recipient);
    if (found == mRecipients.end()) return NAME_NOT_FOUND;
    if (out != nullptr) *out = *found;
    mRecipients.erase(found);
    return OK;
}

void RemoteBinder::sendObituaries() {
    mSession->markDead();
    std::vector<wp<DeathRecipient>> recipients;
    {
        std::lock_guard<std::mutex> lock(mMutex);
        mObituariesSent = true;
        recipients.swap(mRecipients);
    }
    // Without the lock: a recipient may link or unlink.
    for (const auto& weak : recipients) {
        sp<DeathRecipient> recipient = weak.promote();
        if (recipient != nullptr) recipient->binderDied(this);
    }
}

} // namespace android::hardware::host
