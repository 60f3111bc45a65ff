// Copyright 2026 The BEX Wi-Fi Authors
// SPDX-License-Identifier: Apache-2.0

#include <hidl/HidlBinderSupport.h>
#include <hidl/HidlTransportSupport.h>
#include <hidl/Static.h>
#include <log/log.h>

namespace android::hardware {

using hidl::base::V1_0::IBase;

hidl_binder_death_recipient::hidl_binder_death_recipient(const sp<hidl_death_recipient>& recipient,
                                                         uint64_t cookie, const wp<IBase>& base)
      : mRecipient(recipient), mCookie(cookie), mBase(base) {}

void hidl_binder_death_recipient::binderDied(const wp<IBinder>& /*who*/) {
    sp<hidl_death_recipient> recipient = mRecipient.promote();
    if (recipient != nullptr) recipient->serviceDied(mCookie, mBase);
}

// A failed transport has no status to carry, and is never in a reply.
status_t readFromParcel(Status* status, const Parcel& parcel) {
    int32_t exception;
    status_t result = parcel.readInt32(&exception);
    if (result != OK) return result;
    if (exception == Status::EX_NONE) {
        *status = Status::ok();
        return OK;
    }
    const char* message = parcel.readCString();
    if (message == nullptr || exception == Status::EX_TRANSACTION_FAILED) return BAD_VALUE;
    status->setException(exception, message);
    return OK;
}

status_t writeToParcel(const Status& status, Parcel* parcel) {
    if (status.exceptionCode() == Status::EX_TRANSACTION_FAILED) return status.transactionError();
    status_t result = parcel->writeInt32(status.exceptionCode());
    if (result != OK || status.isOk()) return result;
    return parcel->writeCString(status.exceptionMessage());
}

status_t readEmbeddedFromParcel(hidl_string& text, const Parcel& parcel, size_t parentHandle,
                                size_t parentOffset) {
    // The sender's flag says who frees the sender's bytes, not these.
    text.disown();
    size_t handle;
    const void* buffer;
    status_t result =
            parcel.readEmbeddedBuffer(text.size() + 1, &handle, parentHandle,
                                      parentOffset + hidl_string::kOffsetOfBuffer, &buffer);
    if (result != OK) return result;
    return static_cast<const char*>(buffer)[text.size()] == '\0' ? OK : BAD_VALUE;
}

status_t writeEmbeddedToParcel(const hidl_string& text, Parcel* parcel, size_t parentHandle,
                               size_t parentOffset) {
    size_t handle;
    return parcel->writeEmbeddedBuffer(text.c_str(), text.size() + 1, &handle, parentHandle,
                                       parentOffset + hidl_string::kOffsetOfBuffer);
}

sp<IBinder> toBinder(const sp<IBase>& interface) {
    if (interface == nullptr) return nullptr;
    if (interface->isRemote()) {
        return IInterface::asBinder(dynamic_cast<IInterface*>(interface.get()));
    }
    sp<BHwBinder> known = details::gBnMap->get(interface.get(), nullptr).promote();
    if (known != nullptr) return known;

    std::string descriptor;
    Return<void> named =
            interface->interfaceDescriptor([&](const hidl_string& name) { descriptor = name; });
    auto construct = details::getBnConstructorMap().get(descriptor, nullptr);
    if (!named.isOk() || !construct) {
        ALOGE("No stub for interface '%s'", descriptor.c_str());
        return nullptr;
    }
    sp<IBinder> stub = construct(interface.get());
    details::gBnMap->set(interface.get(), stub->localBinder());
    return stub;
}

namespace details {

Return<bool> canCastInterface(IBase* interface, const char* name, bool emitError) {
    if (interface == nullptr) return false;
    bool found = false;
    Return<void> asked = interface->interfaceChain([&](const hidl_vec<hidl_string>& chain) {
        for (const hidl_string& ancestor : chain) found = found || ancestor == name;
    });
    if (!asked.isOk()) {
        if (!emitError) return false;
        ALOGE("Cannot cast to %s: %s", name, asked.description().c_str());
        return asked.propagate();
    }
    return found;
}

} // namespace details
} // namespace android::hardware
