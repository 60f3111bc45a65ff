// Copyright 2026 The BEX Wi-Fi Authors
// SPDX-License-Identifier: Apache-2.0

#include <hidl/Status.h>
#include <log/log.h>

#include <cstring>
#include <sstream>
#include <utility>

namespace android::hardware {
namespace {

struct Name {
    int32_t value;
    const char* name;
};

const char* find(const Name* begin, const Name* end, int32_t value) {
    for (const Name* entry = begin; entry != end; ++entry) {
        if (entry->value == value) return entry->name;
    }
    return nullptr;
}

std::string exceptionName(int32_t exception) {
    static constexpr Name kNames[] = {
            {Status::EX_NONE, "EX_NONE"},
            {Status::EX_SECURITY, "EX_SECURITY"},
            {Status::EX_BAD_PARCELABLE, "EX_BAD_PARCELABLE"},
            {Status::EX_ILLEGAL_ARGUMENT, "EX_ILLEGAL_ARGUMENT"},
            {Status::EX_NULL_POINTER, "EX_NULL_POINTER"},
            {Status::EX_ILLEGAL_STATE, "EX_ILLEGAL_STATE"},
            {Status::EX_NETWORK_MAIN_THREAD, "EX_NETWORK_MAIN_THREAD"},
            {Status::EX_UNSUPPORTED_OPERATION, "EX_UNSUPPORTED_OPERATION"},
            {Status::EX_HAS_REPLY_HEADER, "EX_HAS_REPLY_HEADER"},
            {Status::EX_TRANSACTION_FAILED, "EX_TRANSACTION_FAILED"},
    };
    const char* name = find(std::begin(kNames), std::end(kNames), exception);
    return name != nullptr ? name : std::to_string(exception);
}

std::string errorName(status_t error) {
    static constexpr Name kNames[] = {
            {OK, "OK"},
            {UNKNOWN_ERROR, "UNKNOWN_ERROR"},
            {NO_MEMORY, "NO_MEMORY"},
            {INVALID_OPERATION, "INVALID_OPERATION"},
            {BAD_VALUE, "BAD_VALUE"},
            {BAD_TYPE, "BAD_TYPE"},
            {NAME_NOT_FOUND, "NAME_NOT_FOUND"},
            {PERMISSION_DENIED, "PERMISSION_DENIED"},
            {NO_INIT, "NO_INIT"},
            {ALREADY_EXISTS, "ALREADY_EXISTS"},
            {DEAD_OBJECT, "DEAD_OBJECT"},
            {FAILED_TRANSACTION, "FAILED_TRANSACTION"},
            {BAD_INDEX, "BAD_INDEX"},
            {NOT_ENOUGH_DATA, "NOT_ENOUGH_DATA"},
            {WOULD_BLOCK, "WOULD_BLOCK"},
            {TIMED_OUT, "TIMED_OUT"},
            {UNKNOWN_TRANSACTION, "UNKNOWN_TRANSACTION"},
            {FDS_NOT_ALLOWED, "FDS_NOT_ALLOWED"},
            {UNEXPECTED_NULL, "UNEXPECTED_NULL"},
    };
    const char* name = find(std::begin(kNames), std::end(kNames), error);
    return name != nullptr ? name : std::to_string(error) + " (" + strerror(-error) + ")";
}

} // namespace

Status Status::fromExceptionCode(int32_t exception, const char* message) {
    Status status;
    status.setException(exception, message);
    return status;
}

Status Status::fromStatusT(status_t error) {
    Status status;
    status.setFromStatusT(error);
    return status;
}

void Status::setException(int32_t exception, const std::string& message) {
    mException = exception;
    mError = OK;
    mMessage = message;
}

void Status::setFromStatusT(status_t error) {
    mException = error == OK ? EX_NONE : EX_TRANSACTION_FAILED;
    mError = error;
    mMessage.clear();
}

std::string Status::description() const {
    std::ostringstream out;
    out << *this;
    return out.str();
}

std::ostream& operator<<(std::ostream& out, const Status& status) {
    if (status.isOk()) return out << "No error";
    out << "Status(" << exceptionName(status.exceptionCode()) << "): '";
    if (status.exceptionCode() == Status::EX_TRANSACTION_FAILED) {
        out << errorName(status.transactionError()) << ": ";
    }
    return out << status.exceptionMessage() << "'";
}

namespace details {

return_status::return_status(return_status&& other) noexcept
      : mStatus(std::move(other.mStatus)), mChecked(other.mChecked) {
    other.mChecked = true;
}

return_status& return_status::operator=(return_status&& other) noexcept {
    if (this == &other) return *this;
    assertChecked();
    mStatus = other.mStatus;
    mChecked = other.mChecked;
    other.mChecked = true;
    return *this;
}

return_status::~return_status() {
    assertChecked();
}

void return_status::assertOk() const {
    LOG_ALWAYS_FATAL_IF(!isOk(), "Failed HIDL return status: %s", description().c_str());
}

void return_status::assertChecked() const {
    LOG_ALWAYS_FATAL_IF(!mChecked && !mStatus.isOk(), "Failed HIDL return status not checked: %s",
                        description().c_str());
}

} // namespace details
} // namespace android::hardware
