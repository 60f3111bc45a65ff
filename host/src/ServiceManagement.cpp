// Copyright 2026 The BEX Wi-Fi Authors
// SPDX-License-Identifier: Apache-2.0

#define LOG_TAG "hidl-host"

#include <android/hidl/base/1.0/BpHwBase.h>
#include <android/hidl/manager/1.0/IServiceManager.h>
#include <hidl/HidlTransportSupport.h>
#include <hidl/ServiceManagement.h>
#include <log/log.h>

#include <chrono>

#include "host/src/Engine.h"
#include "host/src/Manifest.h"
#include "host/src/RegistrationWatch.h"
#include "host/src/Registry.h"
#include "host/src/RemoteBinder.h"
#include "host/src/SocketFile.h"

namespace android::hardware {

using hidl::base::V1_0::BpHwBase;
using hidl::base::V1_0::IBase;
using hidl::manager::V1_0::IServiceManager;
using hidl::manager::V1_0::IServiceNotification;

namespace {

class ManifestReader : public IServiceManager {
    Return<Transport> getTransport(const hidl_string& fqName, const hidl_string& name) override {
        const bool declared = host::isDeclaredInManifest(fqName, name);
        return declared ? Transport::HWBINDER : Transport::EMPTY;
    }
    Return<bool> registerForNotifications(const hidl_string&, const hidl_string&,
                                          const sp<IServiceNotification>&) override {
        return false;
    }
};

} // namespace

void configureRpcThreadpool(size_t maxThreads, bool callerWillJoin) {
    host::Engine::get().configure(maxThreads, callerWillJoin);
}

void joinRpcThreadpool() {
    host::Engine::get().join();
}

sp<IServiceManager> defaultServiceManager() {
    return new ManifestReader;
}

std::vector<std::string> getAllHalInstanceNames(const std::string& descriptor) {
    const std::set<std::string> names = host::instancesInManifest(descriptor);
    return {names.begin(), names.end()};
}

namespace details {
namespace {

/**
 * The object that has the name now. A remote object is asked for its interfaces, so this waits
 * until a busy service has a thread free, and until a service that has just registered begins to
 * serve.
 */
sp<IBase> lookUp(const std::string& path, const std::string& descriptor) {
    host::FileIdentity identity;
    if (host::FileIdentity::of(path, &identity) != OK) return nullptr;
    // Asking its own socket would wait for a thread that may be the caller's.
    if (sp<IBase> local = host::Registry::get().find(identity); local != nullptr) {
        return local;
    }
    std::unique_ptr<host::Session> session = host::Session::open(path);
    if (session == nullptr) return nullptr;
    const sp<host::RemoteBinder> binder = new host::RemoteBinder(std::move(session));
    sp<IBase> remote = new BpHwBase(binder);
    const Return<bool> fits = canCastInterface(remote.get(), descriptor.c_str(), true);
    // A full server is there all the same: the call is what tells the caller.
    if (!fits.isOk()) return binder->isRefused() ? remote : nullptr;
    return fits ? remote : nullptr;
}

sp<IBase> waitFor(const std::string& path, const std::string& descriptor,
                  const std::string& instance) {
    using std::chrono::steady_clock;
    auto nextLine = steady_clock::now() + std::chrono::seconds(1);
    for (;;) {
        host::RegistrationWatch watch;
        if (sp<IBase> found = lookUp(path, descriptor); found != nullptr) return found;
        const auto left = nextLine - steady_clock::now();
        if (!watch.wait(std::chrono::ceil<std::chrono::milliseconds>(left)) &&
            steady_clock::now() >= nextLine) {
            ALOGW("Waited one second for %s/%s", descriptor.c_str(), instance.c_str());
            nextLine += std::chrono::seconds(1);
        }
    }
}

} // namespace

status_t registerAsServiceInternal(const sp<IBase>& service, const std::string& name) {
    sp<IBinder> binder = toBinder(service);
    if (binder == nullptr) return UNEXPECTED_NULL;
    if (binder->localBinder() == nullptr) {
        ALOGE("Only objects of this process can be registered");
        return INVALID_OPERATION;
    }
    std::string path;
    Return<void> named = service->interfaceDescriptor(
            [&](const hidl_string& descriptor) { path = host::socketPath(descriptor, name); });
    if (!named.isOk()) return UNKNOWN_ERROR;
    status_t result = host::Registry::get().add(path, service, binder->localBinder());
    if (result == OK) host::Engine::get().start();
    return result;
}

sp<IBase> getRawServiceInternal(const std::string& descriptor, const std::string& instance,
                                bool retry, bool getStub) {
    if (getStub) return nullptr;
    const std::string path = host::socketPath(descriptor, instance);
    sp<IBase> found = lookUp(path, descriptor);
    if (found != nullptr || !retry) return found;
    if (!host::isDeclaredInManifest(descriptor, instance)) {
        ALOGW("%s/%s is not registered, and the VINTF manifest does not declare it",
              descriptor.c_str(), instance.c_str());
        return nullptr;
    }
    return waitFor(path, descriptor, instance);
}

} // namespace details
} // namespace android::hardware
