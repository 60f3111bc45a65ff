// Copyright 2026 The BEX Wi-Fi Authors
// SPDX-License-Identifier: Apache-2.0

#pragma once

#include <hidl/HidlInternal.h>
#include <utils/Errors.h>
#include <utils/StrongPointer.h>

#include <cstdint>
#include <sstream>
#include <string>
#include <type_traits>
#include <utility>

namespace android::hardware {

/** The outcome of a call: none, an exception that the other side answered, or a failed transport.
 */
class Status final {
  public:
    enum Exception : int32_t {
        EX_NONE = 0,
        EX_SECURITY = -1,
        EX_BAD_PARCELABLE = -2,
        EX_ILLEGAL_ARGUMENT = -3,
        EX_NULL_POINTER = -4,
        EX_ILLEGAL_STATE = -5,
        EX_NETWORK_MAIN_THREAD = -6,
        EX_UNSUPPORTED_OPERATION = -7,
        EX_HAS_REPLY_HEADER = -128,
        // Never carried: the transport itself failed, transactionError() says how.
        EX_TRANSACTION_FAILED = -129,
    };

    Status() = default;
    static Status ok() { return Status(); }
    static Status fromExceptionCode(int32_t exception, const char* message = "");
    static Status fromStatusT(status_t error);

    void setException(int32_t exception, const std::string& message);
    void setFromStatusT(status_t error);

    bool isOk() const { return mException == EX_NONE; }
    int32_t exceptionCode() const { return mException; }
    const char* exceptionMessage() const { return mMessage.c_str(); }
    status_t transactionError() const { return mError; }

    /** "No error", or for example "Status(EX_TRANSACTION_FAILED): 'DEAD_OBJECT: '". */
    std::string description() const;

  private:
    int32_t mException = EX_NONE;
    status_t mError = OK;
    std::string mMessage;
};

std::ostream& operator<<(std::ostream& out, const Status& status);

namespace details {

/**
 * The Status half of a Return. The process aborts when a failed one is destroyed before anybody has
 * looked at it, or when its value is taken: isOk(), isDeadObject() and withDefault() count as
 * having looked.
 */
class return_status {
  public:
    bool isOk() const {
        mChecked = true;
        return mStatus.isOk();
    }
    bool isDeadObject() const {
        mChecked = true;
        return mStatus.transactionError() == DEAD_OBJECT;
    }
    std::string description() const { return mStatus.description(); }
    /** Aborts, with the description, when the call failed. */
    void assertOk() const;
    /** Hands a failure on, into a Return of another type. */
    const Status& propagate() const {
        mChecked = true;
        return mStatus;
    }

  protected:
    return_status() = default;
    return_status(const Status& status) : mStatus(status) {} // NOLINT
    return_status(return_status&& other) noexcept;
    return_status& operator=(return_status&& other) noexcept;
    ~return_status();

  private:
    void assertChecked() const;

    Status mStatus;
    mutable bool mChecked = false;
};

} // namespace details

/** What an interface method returns: a value, or the Status that says why there is none. */
template <typename T>
class Return : public details::return_status {
  public:
    // The value may be of a type that converts, as an sp<> of a derived class does.
    template <typename U,
              std::enable_if_t<std::is_convertible_v<U, T> &&
                                       !std::is_base_of_v<return_status, std::decay_t<U>>,
                               int> = 0>
    Return(U&& value) : mValue(std::forward<U>(value)) {}   // NOLINT
    Return(const Status& status) : return_status(status) {} // NOLINT

    Return(Return&&) noexcept = default;
    Return& operator=(Return&&) noexcept = default;

    operator T() const { // NOLINT(google-explicit-constructor)
        assertOk();
        return mValue;
    }

    /** The value, or `fallback` when the call failed. */
    T withDefault(T fallback) const { return isOk() ? mValue : fallback; }

  private:
    T mValue{};
};

template <>
class Return<void> : public details::return_status {
  public:
    Return() = default;
    Return(const Status& status) : return_status(status) {} // NOLINT
    Return(Return&&) noexcept = default;
    Return& operator=(Return&&) noexcept = default;
};

inline Return<void> Void() {
    return Return<void>();
}

} // namespace android::hardware
