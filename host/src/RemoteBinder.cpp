// Copyright 2026 The BEX Wi-Fi Authors
// SPDX-License-Identifier: Apache-2.0

#include "host/src/RemoteBinder.h"

#include <hwbinder/Parcel.h>
#include <sys/socket.h>

#include <algorithm>
#include <utility>

#include "host/src/Channel.h"
#include "host/src/DeathWatch.h"

namespace android::hardware::host {
namespace {

/** Receives the answer; waits for it unless MSG_DONTWAIT is set. */
status_t receiveReply(int connection, int flags, Parcel* reply) {
    FrameReader reader(connection);
    FrameHeader header;
    Receipt receipt = reader.receive(flags, &header, reply);
    // The socket reports the hang-up first, and then what the server had sent before it.
    if (receipt == Receipt::kClosed) receipt = reader.receive(MSG_DONTWAIT, &header, reply);
    if (receipt == Receipt::kNoRoom) return FAILED_TRANSACTION;
    const bool answered = receipt == Receipt::kFrame && (header.flags & FrameHeader::kReply) != 0;
    return answered ? header.status : status_t{DEAD_OBJECT};
}

status_t call(int connection, const FrameHeader& header, const Parcel& data, Parcel* reply) {
    const status_t sent = sendFrame(connection, header, &data, 0);
    // A server that does not take the call may have sent the reason.
    if (sent == DEAD_OBJECT) return receiveReply(connection, MSG_DONTWAIT, reply);
    if (sent != OK || (header.flags & FrameHeader::kOneway) != 0) return sent;
    return receiveReply(connection, 0, reply);
}

} // namespace

RemoteBinder::RemoteBinder(std::unique_ptr<Session> session) : mSession(std::move(session)) {}

RemoteBinder::~RemoteBinder() {
    if (mWatch != 0) DeathWatch::get().unwatch(mWatch, mSession->first());
}

status_t RemoteBinder::transact(uint32_t code, const Parcel& data, Parcel* reply, uint32_t flags,
                                TransactCallback callback) {
    const bool oneway = (flags & FLAG_ONEWAY) != 0;
    FrameHeader header;
    header.flags = oneway ? uint32_t{FrameHeader::kOneway} : 0;
    header.code = code;
    Parcel ignored;
    if (reply == nullptr) reply = &ignored;
    int connection = -1;
    status_t result = WOULD_BLOCK;
    while (result == WOULD_BLOCK) {
        result = mSession->acquire(&connection);
        if (result != OK) return result;
        result = call(connection, header, data, reply);
        // Nothing ran. Another connection may serve it.
        if (result == WOULD_BLOCK) mSession->drop(connection);
    }
    if (result == DEAD_OBJECT) mSession->end(DEAD_OBJECT);
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
    mSession->end(DEAD_OBJECT);
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
