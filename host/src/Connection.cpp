// Copyright 2026 The BEX Wi-Fi Authors
// SPDX-License-Identifier: Apache-2.0

#define LOG_TAG "hidl-host"

#include "host/src/Connection.h"

#include <errno.h>
#include <log/log.h>
#include <sys/epoll.h>
#include <sys/socket.h>
#include <unistd.h>

#include <cstring>
#include <memory>
#include <utility>

#include "host/src/Closing.h"

namespace android::hardware::host {

bool isTrustedPeer(int socket) {
    ucred peer = {};
    socklen_t size = sizeof(peer);
    if (getsockopt(socket, SOL_SOCKET, SO_PEERCRED, &peer, &size) != 0) return false;
    return peer.uid == geteuid() || peer.uid == 0;
}

void Listener::onReady(uint32_t /*events*/) {
    for (;;) {
        base::unique_fd client(
                TEMP_FAILURE_RETRY(accept4(socket(), nullptr, nullptr, SOCK_CLOEXEC)));
        if (!client.ok()) {
            if (errno == ECONNABORTED) continue;
            if (errno == EAGAIN) return;
            // For example no descriptor is free: the client waits. epoll does not announce it a
            // second time.
            if (!mRefused.exchange(true)) ALOGE("accept: %s", strerror(errno));
            return Engine::get().retry(id());
        }
        mRefused = false;
        if (!isTrustedPeer(client.get())) {
            ALOGW("A client of another user was turned away");
            closeConnection(std::move(client));
        } else if (Engine::get().isFull()) {
            ALOGW("Too many clients, one was turned away");
            FrameHeader refusal;
            refusal.flags = FrameHeader::kReply;
            refusal.status = WOULD_BLOCK;
            sendFrame(client.get(), refusal, nullptr, MSG_DONTWAIT);
            closeConnection(std::move(client));
        } else {
            Engine::get().add(std::make_shared<Connection>(std::move(client), mTarget));
        }
    }
}

void Connection::onReady(uint32_t events) {
    if (!own()) return;
    for (;;) {
        FrameHeader header;
        Parcel request;
        const Receipt receipt = mReader.receive(MSG_DONTWAIT, &header, &request);
        if (receipt == Receipt::kNothing) {
            if (disownIfNothingCame()) return;
            continue;
        }
        if (receipt == Receipt::kClosed) return close();
        if (receipt == Receipt::kMalformed || (header.flags & FrameHeader::kReply) != 0) {
            ALOGW("A client sent something malformed and was turned away");
            return close();
        }
        const bool oneway = (header.flags & FrameHeader::kOneway) != 0;
        // A client that gave up while its call waited for a thread does not want it to begin now.
        if (!oneway && (events & EPOLLHUP) != 0) continue;
        if (receipt == Receipt::kFrame) {
            serve(header, &request);
        } else if (!oneway) {
            answer(FAILED_TRANSACTION, nullptr);
        }
        // Sending the answer gave up the ownership; without an answer this thread is still the
        // owner.
        if (!oneway) return;
    }
}

bool Connection::own() {
    State state = State::kIdle;
    if (mState.compare_exchange_strong(state, State::kOwned)) return true;
    // Leaves a mark for the owner, unless the owner has just let go.
    while (!mState.compare_exchange_weak(state, state == State::kIdle ? State::kOwned
                                                                      : State::kOwnedAndReady)) {
    }
    return state == State::kIdle;
}

bool Connection::disownIfNothingCame() {
    State state = State::kOwned;
    if (mState.compare_exchange_strong(state, State::kIdle)) return true;
    mState = State::kOwned;
    return false;
}

void Connection::disown() {
    if (mState.exchange(State::kIdle) == State::kOwnedAndReady) Engine::get().rearm(*this);
}

void Connection::serve(const FrameHeader& header, Parcel* request) {
    const bool oneway = (header.flags & FrameHeader::kOneway) != 0;
    bool answered = oneway;
    Parcel reply;
    auto answerOnce = [&](status_t status, const Parcel* result) {
        if (std::exchange(answered, true)) return;
        // Before the client can send its next call, which may need the room.
        ParcelAccess::releaseReservation(request);
        answer(status, result);
    };
    const status_t status = mTarget->transact(header.code, *request, &reply,
                                              oneway ? uint32_t{IBinder::FLAG_ONEWAY} : 0,
                                              [&](Parcel& result) { answerOnce(OK, &result); });
    answerOnce(status, status == OK ? &reply : nullptr);
}

void Connection::answer(status_t status, const Parcel* reply) {
    FrameHeader header;
    header.flags = FrameHeader::kReply;
    header.status = status;
    disown();
    // A client has one call under way, so its socket has room. A client that lets it fill is not
    // served.
    status_t sent = sendFrame(socket(), header, reply, MSG_DONTWAIT);
    if (sent == FAILED_TRANSACTION) {
        header.status = FAILED_TRANSACTION;
        sent = sendFrame(socket(), header, nullptr, MSG_DONTWAIT);
    }
    if (sent != OK) close();
}

void Connection::close() {
    // This also notifies a client that is still there. Another thread may be using the descriptor,
    // so it is not closed here.
    shutdown(socket(), SHUT_RDWR);
    Engine::get().remove(id());
}

} // namespace android::hardware::host
