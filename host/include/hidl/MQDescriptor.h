// Copyright 2026 The BEX Wi-Fi Authors
// SPDX-License-Identifier: Apache-2.0

#pragma once

#include <hidl/HidlSupport.h>

#include <cstdint>

namespace android::hardware {

/** The modes of a fast message queue: who may write while others read. */
enum MQFlavor : uint32_t { kSynchronizedReadWrite = 0x01, kUnsynchronizedWrite = 0x02 };

/** A fast message queue in an argument list. Only its layout is known here: no method uses one. */
template <typename T, MQFlavor flavor>
struct MQDescriptor {
    hidl_vec<uint8_t> grantors;
    alignas(8) native_handle_t* handle = nullptr;
    uint32_t quantum = 0;
    uint32_t flags = flavor;
};

} // namespace android::hardware
