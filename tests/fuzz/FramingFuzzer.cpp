// Copyright 2026 The BEX Wi-Fi Authors
// SPDX-License-Identifier: Apache-2.0

// A peer that sends anything over its connection, and a reader that reads anything out of what a
// peer sent. See tests/fuzz/README.md.

#include <android-base/properties.h>
#include <android-base/unique_fd.h>
#include <fcntl.h>
#include <hwbinder/Binder.h>
#include <sys/mman.h>
#include <sys/socket.h>
#include <unistd.h>
#include <vendor/korvan/bex/wifi/1.0/BnHwWifiService.h>

#include <cstring>
#include <memory>
#include <optional>
#include <string>
#include <thread>
#include <vector>

#include "host/src/Channel.h"
#include "host/src/Closing.h"
#include "host/src/Connection.h"
#include "host/src/Engine.h"
#include "host/src/TransactionBuffer.h"
#include "recorder/RecordedShell.h"
#include "service/WifiService.h"
#include "tests/Message.h"
#include "tests/fuzz/Check.h"
#include "tests/fuzz/Frames.h"
#include "tests/fuzz/Input.h"
#include "tests/fuzz/Wire.h"

namespace fuzz {
namespace {

using android::OK;
using android::sp;
using android::base::unique_fd;
using android::hardware::BHwBinder;
using android::hardware::hidl_string;
using android::hardware::Parcel;
using android::hardware::host::closingElsewhere;
using android::hardware::host::Connection;
using android::hardware::host::Engine;
using android::hardware::host::FrameHeader;
using android::hardware::host::FrameReader;
using android::hardware::host::Receipt;
using android::hardware::host::Reservation;
using vendor::korvan::bex::wifi::V1_0::BnHwWifiService;
using vendor::korvan::bex::wifi::V1_0::implementation::WifiService;

constexpr uint32_t kRunTxStop = 9;

/** The service of a Broadcom phone, for all inputs. */
const sp<BHwBinder>& target() {
    static const sp<BHwBinder> stub = [] {
        android::base::SetProperty("ro.hardware.wlan.vendor", "broadcom");
        return sp<BHwBinder>(new BnHwWifiService(new WifiService()));
    }();
    return stub;
}

struct Ends {
    unique_fd server;
    unique_fd peer;
};

Ends makeEnds() {
    int ends[2];
    const int made = socketpair(AF_UNIX, SOCK_SEQPACKET | SOCK_CLOEXEC, 0, ends);
    check(made == 0, "a pair of sockets can be made", strerror(errno));
    return {unique_fd(ends[0]), unique_fd(ends[1])};
}

/** Sends one message; one that the socket has no room for is dropped. */
void sendMessage(int socket, const Bytes& bytes, const std::vector<int>& descriptors = {}) {
    vendor::korvan::bex::wifi::tests::sendMessage(socket, bytes, descriptors, MSG_DONTWAIT);
}

unique_fd memoryWith(const Bytes& bytes) {
    unique_fd file(memfd_create("fuzz", MFD_CLOEXEC));
    const ssize_t written = write(file.get(), bytes.data(), bytes.size());
    check(written == static_cast<ssize_t>(bytes.size()), "a memory file can be written", "less");
    return file;
}

/** Sends a frame's payload beside it, or something else in the payload's place. */
void sendBeside(Input& input, int socket) {
    Bytes frame = readFrame(input);
    uint32_t flags;
    memcpy(&flags, frame.data() + offsetof(FrameHeader, flags), sizeof(flags));
    flags |= FrameHeader::kPayloadBeside;
    memcpy(frame.data() + offsetof(FrameHeader, flags), &flags, sizeof(flags));
    Bytes payload(frame.begin() + sizeof(FrameHeader), frame.end());
    frame.resize(sizeof(FrameHeader));
    sendMessage(socket, frame);

    const Bytes one(1);
    switch (input.number(8)) {
        case 1:
            return sendMessage(socket, one);
        case 2:
            return sendMessage(socket, Bytes(2), {memoryWith(payload).get()});
        case 3: {
            const unique_fd file = memoryWith(payload);
            return sendMessage(socket, one, {file.get(), file.get()});
        }
        case 4:
            return sendMessage(socket, one, {socket});
        case 5:
            return sendMessage(socket, one,
                               {unique_fd(open("/proc/self/exe", O_RDONLY | O_CLOEXEC)).get()});
        case 6:
            payload.resize(payload.size() / 2);
            break;
        case 7:
            payload.resize(payload.size() * 2);
            break;
        default:
            break;
    }
    sendMessage(socket, one, {memoryWith(payload).get()});
}

/** Sends what the input says next. */
void sendNext(Input& input, int socket) {
    switch (input.number(5)) {
        case 0:
            return sendMessage(socket, readFrame(input));
        case 1:
            return sendBeside(input, socket);
        case 2: {
            const std::string bytes = input.text();
            return sendMessage(socket, Bytes(bytes.begin(), bytes.end()));
        }
        case 3:
            return sendMessage(socket, readFrame(input), {memoryWith(Bytes(8)).get()});
        default:
            shutdown(socket, SHUT_WR);
    }
}

/** One client's connection to the service, served on this thread. */
class Peer {
  public:
    Peer() : Peer(makeEnds()) {}
    ~Peer() { Engine::get().remove(mConnection->id()); }
    Peer(const Peer&) = delete;
    Peer& operator=(const Peer&) = delete;

    int socket() const { return mSocket.get(); }

    /** Lets the service read what has come, and returns how many answers it sent. */
    size_t answers() {
        mConnection->onReady(0);
        FrameReader reader(mSocket.get());
        for (size_t count = 0;; ++count) {
            FrameHeader header;
            Parcel reply;
            const Receipt receipt = reader.receive(MSG_DONTWAIT, &header, &reply);
            if (receipt == Receipt::kNothing || receipt == Receipt::kClosed) return count;
            check(receipt == Receipt::kFrame, "an answer is a frame",
                  std::to_string(static_cast<int>(receipt)));
            check(header.flags == FrameHeader::kReply, "an answer is marked as one",
                  std::to_string(header.flags));
            mStatus = header.status;
        }
    }

    /** The status of the last answer. */
    int32_t status() const { return mStatus; }

  private:
    explicit Peer(Ends ends)
          : mSocket(std::move(ends.peer)),
            mConnection(std::make_shared<Connection>(std::move(ends.server), target())) {
        // The engine has no threads here: nobody else serves it.
        Engine::get().add(mConnection);
    }

    const unique_fd mSocket;
    const std::shared_ptr<Connection> mConnection;
    int32_t mStatus = OK;
};

void fuzzConnection(Input& input) {
    const Bytes call = frameOf(kRunTxStop, 0, {"6"});
    {
        Peer peer;
        for (int steps = 0; steps < 8 && !input.atEnd(); ++steps) {
            sendNext(input, peer.socket());
            const size_t answers = peer.answers();
            check(answers <= 1, "a call is answered once", std::to_string(answers));
        }
    }
    Peer other;
    sendMessage(other.socket(), call);
    const size_t answers = other.answers();
    check(answers == 1 && other.status() == OK, "a peer harms none but itself",
          std::to_string(answers) + " answers, status " + std::to_string(other.status()));
}

/** Looks at every byte that a reader was handed. */
void touch(const void* bytes, size_t size) {
    volatile uint8_t sum = 0;
    for (size_t i = 0; i < size; ++i) sum = sum + static_cast<const uint8_t*>(bytes)[i];
}

/** Reads anything in any order, by the rule that a parent is one that was read. */
void readOnce(Input& input, const Parcel& parcel, std::vector<size_t>& handles) {
    const size_t sizes[] = {sizeof(hidl_string), input.number(64), input.word()};
    const size_t size = input.oneOf(sizes);
    const size_t parent = handles.empty() ? 0 : handles[input.number(handles.size())];
    const size_t offset = input.number(32);
    size_t handle;
    const void* buffer = nullptr;
    int64_t number;
    const size_t kind = input.number(9);
    // An embedded one needs a parent.
    if (handles.empty() && (kind == 1 || kind == 2)) return;
    android::status_t status = OK;
    switch (kind) {
        case 0:
            status = parcel.readBuffer(size, &handle, &buffer);
            break;
        case 1:
            status = parcel.readEmbeddedBuffer(size, &handle, parent, offset, &buffer);
            break;
        case 2:
            status = parcel.readNullableEmbeddedBuffer(size, &handle, parent, offset, &buffer);
            break;
        case 3:
            if (const char* text = parcel.readCString()) touch(text, strlen(text) + 1);
            return;
        case 4:
            parcel.readInt64(&number);
            return;
        case 5: {
            bool value;
            parcel.readBool(&value);
            return;
        }
        case 6: {
            const native_handle_t* native;
            parcel.readNullableNativeHandleNoDup(&native);
            return;
        }
        case 7:
            readText(parcel);
            return;
        default:
            parcel.setDataPosition(size);
            return;
    }
    if (status != OK) return;
    check(parcel.dataPosition() <= parcel.dataSize(), "an object lies in the data",
          std::to_string(parcel.dataPosition()));
    if (buffer != nullptr) touch(buffer, size);
    if (buffer != nullptr) handles.push_back(handle);
}

/** What was taken is itself a parcel that can be sent on, and may be read in any way. */
void fuzzParcel(Input& input, const FrameHeader& header, const Parcel& parcel) {
    check(parcel.dataSize() == header.dataSize, "a parcel has the frame's size",
          std::to_string(parcel.dataSize()));
    FrameHeader again;
    const std::optional<Bytes> payload = payloadOf(parcel, &again);
    check(payload && again.dataSize == header.dataSize && again.objectCount == header.objectCount &&
                  again.bufferSize == header.bufferSize,
          "what was received can be sent", "something else");
    Parcel copy;
    check(receive(again, *payload, &copy), "what was sent on is taken again", "refused");

    std::vector<size_t> handles;
    for (int reads = 0; reads < 32 && !input.atEnd(); ++reads) readOnce(input, parcel, handles);
}

void fuzzReader(Input& input) {
    const Ends ends = makeEnds();
    sendNext(input, ends.peer.get());
    FrameHeader header;
    Parcel parcel;
    const Receipt receipt = FrameReader(ends.server.get()).receive(MSG_DONTWAIT, &header, &parcel);
    if (receipt == Receipt::kFrame) fuzzParcel(input, header, parcel);
}

void fuzzRules(Input& input) {
    const Ends ends = makeEnds();
    Bytes frame = readLayout(input);
    patch(input, frame);
    sendMessage(ends.peer.get(), frame);
    FrameHeader header;
    Parcel parcel;
    const Receipt receipt = FrameReader(ends.server.get()).receive(MSG_DONTWAIT, &header, &parcel);
    const bool taken = receipt == Receipt::kFrame;
    // One that announces a payload beside it is waited for.
    if (receipt == Receipt::kNothing) return;
    check(taken == keepsTheRules(frame), "a frame that keeps the rules is taken, and no other",
          taken ? "one taken" : "one refused");
    if (taken) fuzzParcel(input, header, parcel);
}

size_t openDescriptors() {
    size_t count = 0;
    for (int descriptor = 0; descriptor < 64; ++descriptor) {
        if (fcntl(descriptor, F_GETFD) >= 0) ++count;
    }
    return count;
}

} // namespace
} // namespace fuzz

extern "C" int LLVMFuzzerTestOneInput(const uint8_t* data, size_t size) {
    using namespace fuzz; // NOLINT: its own entry
    Input input(data, size);
    const recorder::RecordedShell shell;
    // What the process keeps from the first use on is there before the count.
    target();
    Engine::get();
    const size_t before = openDescriptors();
    void (*const subjects[])(Input&) = {fuzzConnection, fuzzReader, fuzzRules};
    input.oneOf(subjects)(input);
    while (closingElsewhere() != 0) std::this_thread::yield();
    check(openDescriptors() == before, "every descriptor is closed",
          std::to_string(openDescriptors()));
    check(static_cast<bool>(Reservation(android::hardware::host::kTransactionBufferSize)),
          "the whole transaction buffer is free again", "less");
    return 0;
}
