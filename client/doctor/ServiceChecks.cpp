// Copyright 2026 The BEX Wi-Fi Authors
// SPDX-License-Identifier: Apache-2.0

#include "client/doctor/ServiceChecks.h"

#include <android-base/properties.h>
#include <android-base/stringprintf.h>
#include <android-base/strings.h>
#include <unistd.h>

#include <algorithm>
#include <climits>

#include "client/base/Json.h"
#include "client/base/Logcat.h"
#include "client/base/Worker.h"
#include "client/doctor/PhoneFiles.h"
#include "client/doctor/Questions.h"

namespace vendor::korvan::bex::wifi::client {
namespace {

using ::android::sp;
using ::android::base::Join;
using ::android::base::StartsWith;
using ::android::base::StringPrintf;

constexpr char kInitService[] = "vendor.bex_wifi";
constexpr char kProgram[] = "/vendor/bin/hw/vendor.korvan.bex.wifi@1.0-service";
constexpr char kFragment[] = "/vendor/etc/vintf/manifest/vendor.korvan.bex.wifi@1.0-service.xml";

const std::vector<FileSet> kManifests = {
        {"/vendor/etc/vintf", "manifest.xml"},
        {"/vendor/etc/vintf/manifest", ""},
        {"/odm/etc/vintf", "manifest.xml"},
        {"/odm/etc/vintf/manifest", ""},
};
const std::vector<FileSet> kMatrices = {
        {"/system/etc/vintf", "compatibility_matrix."},
        {"/system_ext/etc/vintf", "compatibility_matrix."},
        {"/product/etc/vintf", "compatibility_matrix."},
};

constexpr char kSeeAnswering[] = "see \"answering\"";

std::string packageName() {
    const std::string descriptor = IWifiService::descriptor;
    return descriptor.substr(0, descriptor.find('@'));
}

/** The checks of one service, made in turn; each builds on those before it. */
class ServiceExamination {
  public:
    ServiceExamination(const FindService& tryFind, const PhoneView& phone,
                       std::chrono::nanoseconds timeout)
          : mTryFind(tryFind),
            mPhone(phone),
            mDeadline(Clock::now() + timeout),
            mInTime(" in " + seconds(timeout) + " s"),
            mManifests(findMentions(phone.root, kManifests, packageName())) {}

    Checks make() {
        return {declared(),   manifest(),  matrix(), init(),
                registered(), answering(), hash(),   program()};
    }

  private:
    static std::string seconds(std::chrono::nanoseconds duration) {
        return StringPrintf("%g", std::chrono::duration<double>(duration).count());
    }

    Check declared();
    Check manifest() const;
    Check matrix() const;
    static Check init();
    Check registered();
    Check answering();
    Check hash() const;
    Check program() const;

    const FindService& mTryFind;
    const PhoneView& mPhone;
    const Clock::time_point mDeadline;
    const std::string mInTime;
    const Mentions mManifests;

    std::optional<Transport> mTransport;
    /** Nothing as long as the search has not ended. */
    std::optional<sp<IWifiService>> mService;
    bool mAnswers = false;
};

Check ServiceExamination::declared() {
    const char* name = "declared";
    const auto asked = ask<Reply<Transport>>(mDeadline, [manager = mPhone.serviceManager] {
        return declaredTransport(manager());
    });
    if (!asked) {
        return problem(name, "the service manager has not answered" + mInTime,
                       "see whether hwservicemanager runs: getprop init.svc.hwservicemanager");
    }
    if (!asked->error.empty()) {
        return problem(name, "the service manager cannot be asked: " + jsonString(asked->error),
                       "run this as root; refusals are in: " + logcat(" | grep avc"));
    }
    mTransport = asked->value;
    if (mTransport == Transport::HWBINDER) {
        return ok(name, "clients may get " + std::string(IWifiService::descriptor) + "/" +
                                kInstance + " by hwbinder");
    }
    if (mTransport == Transport::PASSTHROUGH) {
        return problem(name, "as passthrough: clients look for a library, not for the service",
                       "write <transport>hwbinder</transport> into the VINTF entry and reboot");
    }
    if (mManifests.files.empty()) {
        return problem(name,
                       "not in the VINTF manifest: the service may not register, or clients get "
                       "null",
                       std::string("install ") + kFragment + " and reboot");
    }
    return problem(name,
                   "a VINTF file names it, but the service manager does not give it to this user",
                   "compare version, interface and instance in " + mManifests.files[0] +
                           "; reboot, since manifests are read once; a denied \"find\" is in: " +
                           logcat(" | grep 'avc.*hwservice_manager'"));
}

Check ServiceExamination::manifest() const {
    const char* name = "manifest";
    const std::string files = Join(mManifests.files, ", ");
    if (mManifests.files.size() == 1) return ok(name, "one entry, in " + files);
    if (mManifests.files.size() > 1) {
        return problem(name, "more than one entry: " + files,
                       "remove all but one: duplicates make checkvintf fail, and on the phone no "
                       "HAL of the whole manifest is found");
    }
    if (!mManifests.hidden.empty()) {
        return unknown(name, mManifests.hidden + " cannot be read", "run this as root");
    }
    if (mTransport == Transport::HWBINDER) {
        return unknown(name, "declared, but not in the usual files",
                       "lshal shows what else this phone reads; look for a second entry there");
    }
    return problem(name, "no file names " + packageName(),
                   std::string("install ") + kFragment + " and reboot");
}

Check ServiceExamination::matrix() const {
    const char* name = "matrix";
    const Mentions matrices = findMentions(mPhone.root, kMatrices, packageName());
    if (!matrices.files.empty()) return ok(name, "in " + matrices.files[0]);
    if (!matrices.hidden.empty()) {
        return unknown(name, matrices.hidden + " cannot be read", "run this as root");
    }
    if (matrices.read == 0) {
        return unknown(name, "no framework compatibility matrix is here",
                       "see whether checkvintf passes in the build");
    }
    return problem(name, "no framework compatibility matrix names " + packageName(),
                   "add it, optional, to a file of DEVICE_FRAMEWORK_COMPATIBILITY_MATRIX_FILE: "
                   "without it checkvintf fails");
}

Check ServiceExamination::init() {
    const char* name = "init";
    const std::string property = std::string("init.svc.") + kInitService;
    const std::string state = ::android::base::GetProperty(property, "");
    if (state == "running") return ok(name, property + " is running");
    if (state.empty()) {
        return unknown(name, property + " is not set: init has not started it, or cannot be asked",
                       std::string("as root: grep -r ") + kInitService +
                               " /vendor/etc/init; dmesg | grep -e bex -e avc");
    }
    return problem(name, property + " is " + jsonString(state),
                   std::string("start ") + kInitService +
                           "; when it does not stay: dmesg | grep -e bex -e avc (\"execute\" "
                           "denied: label " +
                           kProgram + " as its domain's exec type), " + logcat(" -b crash"));
}

Check ServiceExamination::registered() {
    const char* name = "registered";
    if (!mTransport)
        return unknown(name, "the service manager does not answer", "see \"declared\"");
    // On a phone the search itself asks the service what it is.
    mService = ask<sp<IWifiService>>(mDeadline, mTryFind);
    if (!mService) return unknown(name, "the search has not ended" + mInTime, kSeeAnswering);
    if (*mService != nullptr) return ok(name, "found");
    if (mTransport != Transport::HWBINDER) {
        return unknown(name, "clients get null as long as it is not declared",
                       "mend \"declared\" first; lshal shows what is registered");
    }
    return problem(name, "no service is registered: getService waits until there is one",
                   std::string("look again, since a search makes init start a service that is "
                               "stopped; start ") +
                           kInitService +
                           "; when it runs, hwservice_contexts or its right to \"add\", or this "
                           "user's to \"find\", is missing: " +
                           logcat(" | grep 'avc.*hwservice_manager'"));
}

Check ServiceExamination::answering() {
    const char* name = "answering";
    if (!mTransport || (mService && *mService == nullptr)) {
        return unknown(name, "there is nobody to ask", "see \"registered\"");
    }
    std::optional<std::string> error;
    if (mService) {
        error = ask<std::string>(mDeadline, [service = *mService] { return pingError(service); });
    }
    if (!error) {
        return problem(name, "the service is there and has not answered" + mInTime,
                       std::string("both its threads may be in calls, or wait for ever for a tool "
                                   "that left a process behind with its output open: ") +
                               logcat(" | grep wifi@1.0-") + " shows its last command; then stop " +
                               kInitService + "; start " + kInitService +
                               "; a station gives every call --timeout, and every adb a deadline "
                               "of its own");
    }
    if (!error->empty()) {
        return problem(name, "the service does not answer: " + jsonString(*error),
                       "it has died: " + logcat(" -b crash") + "; dmesg | grep bex");
    }
    mAnswers = true;
    return ok(name, "to a ping");
}

Check ServiceExamination::hash() const {
    const char* name = "hash";
    if (!mAnswers) return unknown(name, "the service does not answer", kSeeAnswering);
    const sp<IWifiService>& service = *mService;
    const auto reply = ask<Reply<Hash>>(mDeadline, [service] { return servedHash(service); });
    if (!reply) return unknown(name, "the service has not told it" + mInTime, kSeeAnswering);
    if (!reply->error.empty()) {
        return unknown(name, "the service has not told it: " + jsonString(reply->error),
                       kSeeAnswering);
    }
    const Hash& served = reply->value;
    const Hash own = ownHash(service);
    const bool zero =
            std::all_of(served.begin(), served.end(), [](char byte) { return byte == 0; });
    if (zero) {
        return problem(name, "all zero: the service was built from an interface that is not frozen",
                       "freeze it: the line of hidl-gen -L hash into current.txt; then build "
                       "service and client anew");
    }
    if (served != own) {
        return problem(name,
                       "the service has " + hexDigits(served) + ", this client " + hexDigits(own),
                       "build both from the same IWifiService.hal");
    }
    return ok(name, hexDigits(served) + ", as in this client");
}

Check ServiceExamination::program() const {
    const char* name = "program";
    if (!mAnswers) return unknown(name, "the service does not answer", kSeeAnswering);
    const sp<IWifiService>& service = *mService;
    const auto reply = ask<Reply<int>>(mDeadline, [service] { return servedPid(service); });
    const int pid = reply && reply->error.empty() ? reply->value : -1;
    if (pid <= 0) {
        return unknown(name, "this build does not tell the service's process",
                       "as root: ls -l /proc/*/exe | grep bex; it has to lie in /vendor");
    }
    const std::string link = "/proc/" + std::to_string(pid) + "/exe";
    char target[PATH_MAX];
    const ssize_t length = readlink((mPhone.root + link).c_str(), target, sizeof(target));
    if (length < 0) return unknown(name, link + " cannot be read", "run this as root");
    const std::string path(target, length);
    if (!StartsWith(path, "/vendor/")) {
        return problem(name,
                       jsonString(path) +
                               " is not below /vendor/, so its commands get the "
                               "system's shell",
                       std::string("install it as ") + kProgram + " and start it from there");
    }
    return ok(name, path);
}

} // namespace

Checks checkService(const FindService& tryFind, const PhoneView& phone,
                    std::chrono::nanoseconds timeout) {
    return ServiceExamination(tryFind, phone, timeout).make();
}

} // namespace vendor::korvan::bex::wifi::client
