// Copyright 2026 The BEX Wi-Fi Authors
// SPDX-License-Identifier: Apache-2.0

#pragma once

#include <android/hidl/base/1.0/IBase.h>

namespace android::hardware::details {

/** Whether the object implements the interface; a remote one is asked for its interfaceChain(). */
Return<bool> canCastInterface(hidl::base::V1_0::IBase* interface, const char* name, bool emitError);

} // namespace android::hardware::details
