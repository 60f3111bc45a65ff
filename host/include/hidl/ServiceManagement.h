// Copyright 2026 The BEX Wi-Fi Authors
// SPDX-License-Identifier: Apache-2.0

#pragma once

#include <android/hidl/base/1.0/IBase.h>
#include <utils/StrongPointer.h>

#include <string>
#include <vector>

namespace android::hidl::manager::V1_0 {
struct IServiceManager;
}

namespace android::hardware {

/**
 * Answers from the VINTF manifest's files. There is no service manager on a host: the file system
 * takes its place, and lookups do not use this class.
 */
sp<hidl::manager::V1_0::IServiceManager> defaultServiceManager();

/**
 * The instances of an interface that the VINTF manifest declares, running or not, sorted.
 *
 *     for (const std::string& name : getAllHalInstanceNames(IWifiService::descriptor)) {
 *         sp<IWifiService> wifi = IWifiService::getService(name);
 *     }
 */
std::vector<std::string> getAllHalInstanceNames(const std::string& descriptor);

namespace details {

/**
 * Makes the object reachable under its interface's name and the instance name. The last
 * registration of a name wins, also over one by another process.
 *
 * @return OK; BAD_VALUE when the name is too long for a socket's path; UNEXPECTED_NULL without an
 *     object; else why the socket could not be made. Every failure also writes one line to the log.
 */
status_t registerAsServiceInternal(const sp<hidl::base::V1_0::IBase>& service,
                                   const std::string& name);

/**
 * Looks up "interface/instance": the same object in the process that registered it, elsewhere a
 * remote IBase, not yet wrapped into the interface's proxy. Null when it is not registered, unless
 * `retry` is set and the VINTF manifest declares it: then waits until it is, with a line in the log
 * each second. Null for `getStub`, as there are no passthrough objects.
 */
sp<hidl::base::V1_0::IBase> getRawServiceInternal(const std::string& descriptor,
                                                  const std::string& instance, bool retry,
                                                  bool getStub);

} // namespace details
} // namespace android::hardware
