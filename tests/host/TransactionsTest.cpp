// Copyright 2026 The BEX Wi-Fi Authors
// SPDX-License-Identifier: Apache-2.0

// What comes back from the raw transact(), and the limits on its size.

#include <android-base/unique_fd.h>
#include <hidl/HidlTransportSupport.h>
#include <hwbinder/Parcel.h>

#include <future>
#include <map>
#include <thread>

#include "tests/host/HostTest.h"

namespace vendor::korvan::bex::wifi::tests {
namespace {

using ::android::BAD_TYPE;
using ::android::BAD_VALUE;
using ::android::FAILED_TRANSACTION;
using ::android::NOT_ENOUGH_DATA;
using ::android::OK;
using ::android::UNKNOWN_TRANSACTION;
using ::android::hardware::hidl_string;
using ::android::hardware::IBinder;
using ::android::hardware::Parcel;
using ::android::hardware::Status;
using ::android::hidl::base::V1_0::IBase;

constexpr uint32_t kRunTxNStart = 7;
constexpr uint32_t kRunTxStop = 9;
constexpr uint32_t kPing = 0x0f504e47;

/** The parts of a text in a call, each as the proxy writes it unless a test says otherwise. */
struct RawText {
    size_t structSize = sizeof(hidl_string);
    size_t textSize = 3;
    size_t parentOffset = 0;
    bool hasText = true;
    bool isNull = false;
};

void writeText(Parcel* parcel, const hidl_string& text, const RawText& raw) {
    size_t parent;
    size_t child;
    ASSERT_EQ(parcel->writeBuffer(&text, raw.structSize, &parent), OK);
    if (!raw.hasText) return;
    ASSERT_EQ(parcel->writeEmbeddedBuffer(raw.isNull ? nullptr : text.c_str(), raw.textSize, &child,
                                          parent, raw.parentOffset),
              OK);
}

class TransactionsTest : public ServedTest {
  protected:
    void SetUp() override {
        ServedTest::SetUp();
        binder = android::hardware::toBinder(service);
    }

    status_t transact(uint32_t code, const Parcel& data, uint32_t flags = 0) {
        Parcel reply;
        return binder->transact(code, data, &reply, flags);
    }

    status_t withToken(uint32_t code, const char* token) {
        Parcel data;
        if (token != nullptr) {
            EXPECT_EQ(data.writeInterfaceToken(token), OK);
        }
        return transact(code, data);
    }

    status_t stopWith(const RawText& raw) {
        // Two, so that a struct of 24 bytes reads memory that exists.
        hidl_string texts[2];
        texts[0].setToExternal("36\0more", 2);
        Parcel data;
        EXPECT_EQ(data.writeInterfaceToken(IWifiService::descriptor), OK);
        writeText(&data, texts[0], raw);
        return transact(kRunTxStop, data);
    }

    sp<IBinder> binder;
};

TEST_F(TransactionsTest, UnknownCode) {
    for (uint32_t code : {0u, 17u, 100u, 0xffffffffu}) {
        for (const char* token : {IWifiService::descriptor, IBase::descriptor, "other",
                                  static_cast<const char*>(nullptr)}) {
            EXPECT_EQ(withToken(code, token), UNKNOWN_TRANSACTION) << code;
        }
    }
}

TEST_F(TransactionsTest, WrongToken) {
    const std::string cut(IWifiService::descriptor, strlen(IWifiService::descriptor) - 1);
    for (const char* token :
         {"other", "", cut.c_str(), IBase::descriptor, static_cast<const char*>(nullptr)}) {
        for (uint32_t code = 1; code <= 16; ++code) {
            EXPECT_EQ(withToken(code, token), BAD_TYPE) << code;
        }
    }
    EXPECT_EQ(withToken(kPing, IWifiService::descriptor), BAD_TYPE);

    Parcel withoutNul;
    ASSERT_EQ(withoutNul.write(IWifiService::descriptor, 40), OK);
    EXPECT_EQ(transact(kRunTxStop, withoutNul), BAD_TYPE);
}

TEST_F(TransactionsTest, BaseMethods) {
    EXPECT_EQ(withToken(kPing, IBase::descriptor), OK);
    EXPECT_EQ(withToken(256067662, IBase::descriptor), OK); // interfaceChain
    EXPECT_EQ(withToken(256136003, IBase::descriptor), OK); // interfaceDescriptor
    EXPECT_EQ(withToken(256398152, IBase::descriptor), OK); // getHashChain
    EXPECT_TRUE(service->ping().isOk());
}

TEST_F(TransactionsTest, WellFormedText) {
    EXPECT_EQ(stopWith({}), OK);
}

TEST_F(TransactionsTest, MalformedText) {
    std::map<std::string, RawText> cases;
    cases["its text missing"].hasText = false;
    cases["a struct of 8 bytes"].structSize = 8;
    cases["a struct of 24 bytes"].structSize = 24;
    cases["text shorter than the size says"].textSize = 2;
    cases["text longer than the size says"].textSize = 4;
    cases["no text at all"].textSize = 0;
    cases["null of no length"].isNull = true;
    cases["null of no length"].textSize = 0;
    cases["another parent offset"].parentOffset = 8;
    cases["a parent offset across the size"].parentOffset = 4;
    for (const auto& [name, raw] : cases) EXPECT_EQ(stopWith(raw), BAD_VALUE) << name;
}

TEST_F(TransactionsTest, NullText) {
    const hidl_string text = "36";
    RawText raw;
    raw.isNull = true;
    Parcel data;
    ASSERT_EQ(data.writeInterfaceToken(IWifiService::descriptor), OK);
    writeText(&data, text, raw);
    Parcel reply;
    EXPECT_EQ(binder->transact(kRunTxStop, data, &reply), OK);
    Status status;
    EXPECT_EQ(readFromParcel(&status, reply), OK);
    EXPECT_EQ(status.exceptionCode(), Status::EX_NULL_POINTER);
}

TEST_F(TransactionsTest, TextMissing) {
    EXPECT_EQ(withToken(kRunTxStop, IWifiService::descriptor), BAD_VALUE);
}

TEST_F(TransactionsTest, TextWithoutNul) {
    hidl_string text;
    text.setToExternal("36", 2);
    // The struct says 1 byte of text: the byte after it is a 6.
    const uint32_t shorter = 1;
    memcpy(reinterpret_cast<char*>(&text) + 8, &shorter, sizeof(shorter));
    Parcel data;
    ASSERT_EQ(data.writeInterfaceToken(IWifiService::descriptor), OK);
    RawText raw;
    raw.textSize = 2;
    writeText(&data, text, raw);
    EXPECT_EQ(transact(kRunTxStop, data), BAD_VALUE);
}

TEST_F(TransactionsTest, IntegerInPlaceOfText) {
    const hidl_string text = "36";
    Parcel data;
    ASSERT_EQ(data.writeInterfaceToken(IWifiService::descriptor), OK);
    ASSERT_EQ(data.writeInt32(36), OK);
    writeText(&data, text, {});
    EXPECT_EQ(transact(kRunTxStop, data), BAD_VALUE);
}

// The driver of a phone lets the places in a parent only ascend. A second buffer for the same one
// would lend its address to the first one's size.
TEST_F(TransactionsTest, TwoTextsForOneStruct) {
    const hidl_string text = "a text that is longer than the other one";
    Parcel data;
    size_t parent;
    size_t child;
    ASSERT_EQ(data.writeInterfaceToken(IWifiService::descriptor), OK);
    ASSERT_EQ(data.writeBuffer(&text, sizeof(text), &parent), OK);
    ASSERT_EQ(data.writeEmbeddedBuffer(text.c_str(), text.size() + 1, &child, parent, 0), OK);
    ASSERT_EQ(data.writeEmbeddedBuffer("x", 2, &child, parent, 0), OK);
    EXPECT_EQ(transact(kRunTxStop, data), FAILED_TRANSACTION);
}

TEST_F(TransactionsTest, TextsForAnEarlierStruct) {
    const hidl_string text = "36";
    Parcel data;
    size_t first;
    size_t second;
    size_t child;
    ASSERT_EQ(data.writeInterfaceToken(IWifiService::descriptor), OK);
    ASSERT_EQ(data.writeBuffer(&text, sizeof(text), &first), OK);
    ASSERT_EQ(data.writeBuffer(&text, sizeof(text), &second), OK);
    ASSERT_EQ(data.writeEmbeddedBuffer("36", 3, &child, first, 0), OK);
    EXPECT_EQ(transact(kRunTxStop, data), FAILED_TRANSACTION);
}

TEST_F(TransactionsTest, ParentOutOfRange) {
    const hidl_string text = "36";
    Parcel data;
    size_t parent;
    size_t child;
    EXPECT_EQ(data.writeEmbeddedBuffer("36", 3, &child, 0, 0), BAD_VALUE);
    ASSERT_EQ(data.writeBuffer(&text, sizeof(text), &parent), OK);
    for (size_t offset : {9, 16, 1 << 20}) {
        EXPECT_EQ(data.writeEmbeddedBuffer("36", 3, &child, parent, offset), BAD_VALUE) << offset;
    }
    EXPECT_EQ(data.writeEmbeddedBuffer("36", 3, &child, parent + 1, 0), BAD_VALUE);
}

class BoolTest : public TransactionsTest {
  protected:
    /** RunTxNStart's arguments up to the bool. */
    void writeUpToBool(Parcel* data) {
        ASSERT_EQ(data->writeInterfaceToken(IWifiService::descriptor), OK);
        for (int i = 0; i < 4; ++i) writeText(data, text, {});
    }
    const hidl_string text = "36";
};

TEST_F(BoolTest, MissingAtTheEnd) {
    Parcel data;
    writeUpToBool(&data);
    EXPECT_EQ(transact(kRunTxNStart, data), NOT_ENOUGH_DATA);
}

TEST_F(BoolTest, TwoIsTrue) {
    Parcel data;
    writeUpToBool(&data);
    ASSERT_EQ(data.writeInt8(2), OK);
    writeText(&data, text, {});
    Parcel reply;
    ASSERT_EQ(binder->transact(kRunTxNStart, data, &reply), OK);
    int32_t exception = -1;
    int32_t vht = -1;
    EXPECT_EQ(reply.readInt32(&exception), OK);
    EXPECT_EQ(reply.readInt32(&vht), OK);
    EXPECT_EQ(exception, 0);
    EXPECT_EQ(vht, 1);
}

TEST_F(TransactionsTest, DataAfterTheLastArgument) {
    const hidl_string text = "36";
    Parcel data;
    ASSERT_EQ(data.writeInterfaceToken(IWifiService::descriptor), OK);
    writeText(&data, text, {});
    ASSERT_EQ(data.writeInt64(1), OK);
    writeText(&data, text, {});
    EXPECT_EQ(transact(kRunTxStop, data), OK);
}

TEST_F(TransactionsTest, OnewayIsRefusedBeforeTheMethod) {
    const hidl_string text = "36";
    Parcel data;
    ASSERT_EQ(data.writeInterfaceToken(IWifiService::descriptor), OK);
    writeText(&data, text, {});
    EXPECT_EQ(transact(kRunTxStop, data, IBinder::FLAG_ONEWAY), OK);
    EXPECT_EQ(transact(100, data, IBinder::FLAG_ONEWAY), OK);
    // The same connection carries this one, after them.
    EXPECT_EQ(call(service, "count"), "0");
    EXPECT_EQ(transact(kRunTxStop, data), OK);
    EXPECT_EQ(call(service, "count"), "2");
}

TEST_F(TransactionsTest, LargestRequest) {
    const std::string largest(1'040'223, 'x');
    EXPECT_EQ(call(service, largest), largest);
    EXPECT_EQ(call(service, largest + "x"), transportFailure("FAILED_TRANSACTION"));
    EXPECT_EQ(call(service, "alive"), "alive");
}

TEST_F(TransactionsTest, LargestReply) {
    EXPECT_EQ(call(service, "large 1040263").size(), 1'040'263u);
    EXPECT_EQ(call(service, "large 1040264"), transportFailure("FAILED_TRANSACTION"));
    EXPECT_EQ(call(service, "alive"), "alive");
}

// On either side of where a payload no longer travels in the message itself.
TEST_F(TransactionsTest, EverySizeAroundTheMessage) {
    for (size_t size : {15'000, 16'100, 16'159, 16'160, 16'161, 16'200, 16'384, 16'385, 70'000}) {
        const std::string text(size, 'x');
        EXPECT_EQ(call(service, text), text) << size;
    }
}

TEST_F(TransactionsTest, TwoRequestsTogetherTooLarge) {
    const std::string padding(600'000, 'x');
    auto first = std::async(std::launch::async, [&] { return call(service, "wait " + padding); });
    ASSERT_EQ(server->report(), "entered");
    EXPECT_EQ(call(service, padding), transportFailure("FAILED_TRANSACTION"));
    EXPECT_EQ(call(service, "small"), "small");
    server->openGate();
    EXPECT_EQ(first.get(), "done");
    EXPECT_EQ(call(service, padding), padding);
}

// The reply lies in the client's buffer until the client has done with it.
TEST_F(TransactionsTest, TwoRepliesTogetherTooLarge) {
    std::string inner;
    auto outer = service->RunRxStop("large 600000", [&](const auto& out) {
        EXPECT_EQ(out.size(), 600'000u);
        inner = call(service, "large 600000");
    });
    EXPECT_TRUE(outer.isOk());
    EXPECT_EQ(inner, transportFailure("FAILED_TRANSACTION"));
    EXPECT_EQ(call(service, "large 600000").size(), 600'000u);
}

// No reply's memory, and no share of the buffer, stays behind.
TEST_F(TransactionsTest, LargeCallsInARow) {
    const std::string text(900'000, 'x');
    for (int i = 0; i < 50; ++i) ASSERT_EQ(call(service, text), text) << i;
}

} // namespace
} // namespace vendor::korvan::bex::wifi::tests
