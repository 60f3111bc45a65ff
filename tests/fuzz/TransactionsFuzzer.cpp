// Copyright 2026 The BEX Wi-Fi Authors
// SPDX-License-Identifier: Apache-2.0

// Every transaction, well-formed and not, through the generated stub into the service. See
// tests/fuzz/README.md.

#include <android-base/properties.h>
#include <hidl/HidlBinderSupport.h>
#include <hwbinder/Binder.h>
#include <vendor/korvan/bex/wifi/1.0/BnHwWifiService.h>

#include <array>
#include <cstring>
#include <deque>
#include <string>
#include <vector>

#include "chips/ChipFamily.h"
#include "service/WifiService.h"
#include "tests/fuzz/Check.h"
#include "tests/fuzz/Input.h"
#include "tests/fuzz/Operations.h"
#include "tests/fuzz/Script.h"
#include "tests/fuzz/Wire.h"

namespace fuzz {
namespace {

using android::OK;
using android::sp;
using android::status_t;
using android::hardware::hidl_string;
using android::hardware::hidl_vec;
using android::hardware::Parcel;
using android::hidl::base::V1_0::IBase;
using recorder::RecordedShell;
using vendor::korvan::bex::wifi::chipFamilies;
using vendor::korvan::bex::wifi::ChipFamily;
using vendor::korvan::bex::wifi::V1_0::BnHwWifiService;
using vendor::korvan::bex::wifi::V1_0::IWifiService;
using vendor::korvan::bex::wifi::V1_0::implementation::vendorTestSuit;
using vendor::korvan::bex::wifi::V1_0::implementation::WifiService;

/**
 * A transaction. Arguments: t a text, b a bool, h a handle, v a list of texts. Result: 0 is 0 or
 * -1, m a mode, b a bool, t a text, - the base interface's own, v none, ? not even a reply.
 */
struct Method {
    uint32_t code;
    const char* arguments;
    char result;
};

// clang-format off
constexpr Method kMethods[] = {
    {1, "tt",     '0'}, {2,  "",     '0'}, {3,  "",    'b'}, {4,  "",    'm'},
    {5, "",       'b'}, {6,  "tttt", '0'}, {7,  "ttttbt", '0'}, {8, "tttttt", '0'},
    {9, "t",      '0'}, {10, "ttt",  '0'}, {11, "t",   '0'}, {12, "tt",  '0'},
    {13, "ttt",   't'}, {14, "tttbt", 't'}, {15, "tttt", 't'}, {16, "t", 't'},
    {256067662, "",   '-'}, // interfaceChain
    {256131655, "hv", 'v'}, // debug
    {256136003, "",   '-'}, // interfaceDescriptor
    {256398152, "",   '-'}, // getHashChain
    {256462420, "",   '?'}, // setHALInstrumentation
    {256660548, "",   '?'}, // linkToDeath
    {256921159, "",   'v'}, // ping
    {257049926, "",   '-'}, // getDebugInfo
    {257120595, "",   '?'}, // notifySyspropsChanged
    {257250372, "",   '?'}, // unlinkToDeath
    {0,  "t", '?'},         // none
    {17, "t", '?'},         // none
};
// The first that is a suite's, and the last.
constexpr uint32_t kFirstOperation = 6;
constexpr uint32_t kLastOperation = 16;
// clang-format on

bool isBase(const Method& method) {
    return method.code > 0xffff;
}

/** One call, as the input has it: its parcel, and whether a proxy could have written it. */
class Call {
  public:
    explicit Call(Input& input) : mInput(input), mMethod(input.oneOf(kMethods)) {
        writeToken();
        for (const char* type = mMethod.arguments; *type != '\0'; ++type) writeArgument(*type);
        if (mInput.number(8) == 7) writeRaw();
    }

    const Method& method() const { return mMethod; }
    Parcel& parcel() { return mParcel; }
    const Arguments& arguments() const { return mArguments; }
    bool isWellFormed() const { return mWellFormed; }

  private:
    void writeToken() {
        const char* const own = isBase(mMethod) ? IBase::descriptor : IWifiService::descriptor;
        const char* const other = isBase(mMethod) ? IWifiService::descriptor : IBase::descriptor;
        switch (mInput.number(16)) {
            case 13:
                return writeRaw();
            case 14:
                mWellFormed = false;
                mParcel.writeInterfaceToken(other);
                return;
            case 15:
                mWellFormed = false; // and none
                return;
            default:
                mParcel.writeInterfaceToken(own);
        }
    }

    void writeArgument(char type) {
        const size_t odd = mInput.number(32);
        if (odd == 31) {
            mWellFormed = false; // left out
        } else if (odd == 30) {
            writeRaw();
        } else if (type == 't') {
            writeText(odd);
        } else if (type == 'b') {
            mArguments.vht = mInput.number(2) == 1;
            mParcel.writeBool(mArguments.vht);
        } else if (type == 'h') {
            mParcel.writeUint64(odd == 1 ? mInput.word() : 0);
            mWellFormed = mWellFormed && odd != 1;
        } else {
            writeList();
        }
    }

    void writeRaw() {
        const std::string bytes = mInput.text();
        mParcel.write(bytes.data(), bytes.size());
        mWellFormed = false;
    }

    /** A text; `odd` from 1 to 9 is a way to write one that no proxy has. */
    void writeText(size_t odd) {
        const std::string text = mInput.text();
        if (mTexts < mArguments.texts.size()) mArguments.texts[mTexts++] = text;
        // Longer than any of the sizes below, so that what a wrong one carries exists.
        const std::string& bytes = mBytes.emplace_back(text + std::string(8, '\0'));
        hidl_string head;
        head.setToExternal(bytes.data(), text.size());
        auto& memory = mMemory.emplace_back();
        memcpy(memory.data(), static_cast<const void*>(&head), sizeof(head));
        mWellFormed = mWellFormed && (odd == 0 || odd > 9);

        const uint32_t declared = mInput.number(2) == 0 ? mInput.word() : 0;
        if (odd == 1) memcpy(memory.data() + sizeof(char*), &declared, sizeof(declared));
        size_t parent;
        size_t child;
        mParcel.writeBuffer(memory.data(), odd == 2 ? 8 : odd == 3 ? 24 : sizeof(head), &parent);
        if (odd == 4) return;
        const size_t size = odd == 5 ? text.size() : odd == 6 ? text.size() + 2 : text.size() + 1;
        mParcel.writeEmbeddedBuffer(odd == 7 ? nullptr : bytes.data(), size, &child,
                                    odd == 8 ? mInput.number(8) : parent,
                                    odd == 9 ? mInput.number(16) : 0);
    }

    void writeList() {
        hidl_vec<hidl_string>& list = mLists.emplace_back();
        list.resize(mInput.number(4));
        for (hidl_string& text : list) text = mInput.text();
        size_t parent;
        size_t child;
        mParcel.writeBuffer(&list, sizeof(list), &parent);
        android::hardware::writeEmbeddedToParcel(list, &mParcel, parent, 0, &child);
        for (size_t i = 0; i < list.size(); ++i) {
            writeEmbeddedToParcel(list[i], &mParcel, child, i * sizeof(hidl_string));
        }
    }

    Input& mInput;
    const Method& mMethod;
    Parcel mParcel;
    Arguments mArguments;
    size_t mTexts = 0;
    bool mWellFormed = true;
    // What the parcel refers to.
    std::deque<std::string> mBytes;
    std::deque<std::array<uint8_t, 32>> mMemory;
    std::deque<hidl_vec<hidl_string>> mLists;
};

/** A reply as the proxy would see it. */
struct Reply {
    std::string text;
    int32_t number = 0;
};

Reply readReply(const Method& method, const Parcel& written) {
    android::hardware::host::FrameHeader header;
    const std::optional<Bytes> payload = payloadOf(written, &header);
    check(payload.has_value(), "a reply can be carried", "none");
    Parcel parcel;
    check(receive(header, *payload, &parcel), "a reply is well-formed", "a malformed one");
    Reply reply;
    int32_t exception = -1;
    check(parcel.readInt32(&exception) == OK && exception == 0, "a reply begins with success",
          std::to_string(exception));
    bool read = true;
    if (method.result == 't') {
        const std::optional<std::string> text = readText(parcel);
        read = text.has_value();
        reply.text = text.value_or("");
    } else if (method.result == 'b') {
        bool value;
        read = parcel.readBool(&value) == OK;
    } else if (method.result != '-' && method.result != 'v') {
        read = parcel.readInt32(&reply.number) == OK;
        const bool mode = method.result == 'm' && (reply.number == 4 || reply.number == 5);
        check(reply.number == 0 || reply.number == -1 || mode,
              "a result is 0 or -1, a mode also "
              "4 or 5",
              std::to_string(reply.number));
    }
    check(read, "a reply holds its result", std::string(1, method.result));
    check(method.result == '-' || parcel.dataPosition() == parcel.dataSize(),
          "a reply has nothing after its result", std::to_string(parcel.dataSize()));
    return reply;
}

bool isDocumented(status_t status) {
    return status == OK || status == android::UNKNOWN_TRANSACTION || status == android::BAD_TYPE ||
           status == android::BAD_VALUE || status == android::NOT_ENOUGH_DATA ||
           status == android::UNKNOWN_ERROR;
}

/** Whether the stub answered that a text was null. */
bool isNullPointer(const Parcel& reply) {
    int32_t exception = 0;
    reply.setDataPosition(0);
    const status_t read = reply.readInt32(&exception);
    reply.setDataPosition(0);
    return read == OK && exception == android::hardware::Status::EX_NULL_POINTER;
}

/** A well-formed call does what its suite does with the same arguments. */
void checkPassedOn(const Call& call, const Reply& reply, RecordedShell& shell) {
    const std::vector<std::string> lines = shell.lines();
    shell.clear();
    std::string out;
    const int status = kOperations[call.method().code - kFirstOperation].run(*vendorTestSuit,
                                                                             call.arguments(), out);
    check(lines == shell.lines(), "a call runs its suite's lines", std::to_string(lines.size()));
    checkEqual(out, reply.text, "a call gives its suite's text");
    check(call.method().result == 't' || reply.number == status, "a call gives its suite's result",
          std::to_string(reply.number));
}

void makeCall(Input& input, const sp<BnHwWifiService>& stub, RecordedShell& shell) {
    Call call(input);
    const bool oneway = input.number(16) == 15;
    android::hardware::host::FrameHeader header;
    std::optional<Bytes> payload = payloadOf(call.parcel(), &header);
    if (!payload) return check(!call.isWellFormed(), "a proxy's parcel can be carried", "not");
    const Bytes written = *payload;
    patch(input, *payload);
    const bool wellFormed = call.isWellFormed() && *payload == written;
    Parcel request;
    if (!receive(header, *payload, &request)) {
        return check(!wellFormed, "a proxy's parcel is taken", "refused");
    }

    shell.clear();
    int replies = 0;
    Parcel reply;
    Reply result;
    const status_t status = stub->transact(call.method().code, request, &reply, oneway ? 1 : 0,
                                           [&](Parcel& written) {
                                               ++replies;
                                               result = readReply(call.method(), written);
                                           });
    check(isDocumented(status), "a status is one of IBinder's", std::to_string(status));
    if (status == OK && isNullPointer(reply)) {
        return check(!wellFormed && replies == 0, "only a null text is refused so", "another one");
    }
    // The stub leaves a reply without a result to the transport, which has it when this returns.
    if (status == OK && call.method().result == 'v') {
        check(replies == 0, "a reply without a result is sent once", std::to_string(replies + 1));
        ++replies;
        readReply(call.method(), reply);
    }
    const bool answers = status == OK && call.method().result != '?';
    check(replies == (answers ? 1 : 0), "a call that succeeds is answered once, another one never",
          std::to_string(replies));
    if (!wellFormed || call.method().result == '?') return;
    check((status == OK) != oneway, "a proxy's call succeeds unless it does not wait",
          std::to_string(status));
    const uint32_t code = call.method().code;
    if (status == OK && code >= kFirstOperation && code <= kLastOperation) {
        checkPassedOn(call, result, shell);
    }
}

} // namespace
} // namespace fuzz

extern "C" int LLVMFuzzerTestOneInput(const uint8_t* data, size_t size) {
    using namespace fuzz; // NOLINT: its own entry
    Input input(data, size);
    RecordedShell shell;
    // The same on every run: some suites keep the first that they find.
    shell.readable("/vendor/lib/modules/wlan.ko");
    shell.directory("/vendor/lib/modules", {"qca_cld3_a.ko", "qca_cld3_b.ko"});
    const std::vector<ChipFamily>& families = chipFamilies();
    const ChipFamily& family = families[input.number(families.size())];
    android::base::SetProperty("ro.hardware.wlan.vendor", family.vendor);
    android::base::SetProperty("ro.hardware.wlan.chip", family.partOfName);
    const Script script(input);
    script.apply(shell);

    const sp<BnHwWifiService> stub = new BnHwWifiService(new WifiService());
    for (size_t calls = 1 + input.number(3); calls > 0; --calls) makeCall(input, stub, shell);
    return 0;
}
