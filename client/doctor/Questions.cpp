// Copyright 2026 The BEX Wi-Fi Authors
// SPDX-License-Identifier: Apache-2.0

#include "client/doctor/Questions.h"

namespace vendor::korvan::bex::wifi::client {

using ::android::sp;
using ::android::hardware::Return;
using ::android::hidl::manager::V1_0::IServiceManager;

namespace {

constexpr size_t kHashBytes = 32;

/** Keeps a chain's first hash, the interface's own. */
auto keepHash(Hash* hash) {
    return [hash](const auto& chain) {
        if (chain.size() > 0) hash->assign(chain[0].data(), chain[0].data() + kHashBytes);
    };
}

} // namespace

Reply<Transport> declaredTransport(const sp<IServiceManager>& manager) {
    if (manager == nullptr) return {"there is none", Transport::EMPTY};
    const Return<Transport> transport = manager->getTransport(IWifiService::descriptor, kInstance);
    if (!transport.isOk()) return {transport.description(), Transport::EMPTY};
    return {"", transport};
}

std::string pingError(const sp<IWifiService>& service) {
    const Return<void> result = service->ping();
    return result.isOk() ? "" : result.description();
}

Reply<Hash> servedHash(const sp<IWifiService>& service) {
    Reply<Hash> reply;
    const Return<void> result = service->getHashChain(keepHash(&reply.value));
    if (!result.isOk()) reply.error = result.description();
    return reply;
}

// The qualified call does not go to the service.
Hash ownHash(const sp<IWifiService>& service) {
    Hash hash;
    const Return<void> result = service->IWifiService::getHashChain(keepHash(&hash));
    return result.isOk() ? hash : "";
}

Reply<int> servedPid(const sp<IWifiService>& service) {
    Reply<int> reply = {"", -1};
    const Return<void> result =
            service->getDebugInfo([&reply](const auto& info) { reply.value = info.pid; });
    if (!result.isOk()) reply.error = result.description();
    return reply;
}

} // namespace vendor::korvan::bex::wifi::client
