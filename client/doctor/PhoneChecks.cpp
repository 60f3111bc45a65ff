// Copyright 2026 The BEX Wi-Fi Authors
// SPDX-License-Identifier: Apache-2.0

#include "client/doctor/PhoneChecks.h"

#include <android-base/properties.h>
#include <android-base/strings.h>

#include <cctype>
#include <cstring>
#include <iterator>
#include <optional>

#include "chips/ModuleFiles.h"
#include "client/base/Json.h"
#include "client/base/Logcat.h"
#include "client/doctor/PhoneFiles.h"

namespace vendor::korvan::bex::wifi::client {
namespace {

using ::android::base::GetProperty;
using ::android::base::Join;
using ::android::base::StartsWith;

constexpr char kVendor[] = "ro.hardware.wlan.vendor";
constexpr char kChip[] = "ro.hardware.wlan.chip";
constexpr char kMimo[] = "ro.hardware.wlan.mimo";

constexpr char kVendorBin[] = "/vendor/bin/";
constexpr char kShell[] = "/vendor/bin/sh";
const std::string kExecuteDenied =
        "; when it is there and commands still fail, \"execute\" is denied: " +
        logcat(" | grep avc");
const std::string kInsmodDenied =
        "; when insmod is refused, the service lacks the capability sys_module, or \"module_load\" "
        "for the file's label: " +
        logcat(" | grep avc");

// Where the service's shell looks for a bare name, as the init script says. A vendor process may
// execute only programs in the vendor's own folders, unless its policy makes an exception.
constexpr const char* kVendorFolders[] = {"/vendor/bin/", "/vendor/xbin/", "/odm/bin/"};
constexpr const char* kOtherFolders[] = {"/system/bin/", "/system/xbin/"};

Check unseen(const std::string& name, const std::string& path, const FileState& state) {
    return unknown(name, path + ": " + strerror(state.error), "run this as root");
}

Check notExecutable(const std::string& name, const std::string& path) {
    return problem(name, path + " is not an executable file",
                   "install it with mode 755: chmod 755 " + path);
}

/** The vendors that the service knows: "broadcom or qcom". */
std::string vendors() {
    std::string all;
    std::string last;
    for (const ChipFamily& family : chipFamilies()) {
        if (last == family.vendor) continue;
        last = family.vendor;
        all += (all.empty() ? "" : " or ") + last;
    }
    return all;
}

Check checkVendorProperty(bool known) {
    const std::string vendor = GetProperty(kVendor, "");
    if (known) return ok("vendor", std::string(kVendor) + " is " + vendor);
    const std::string found =
            std::string(kVendor) + (vendor.empty() ? " is not set" : " is " + jsonString(vendor));
    return problem("vendor", found + ": the first call ends the service",
                   "set it to " + vendors() + " in vendor/build.prop, and reboot");
}

Check checkChipProperty(const ChipFamily* family) {
    const std::string chip = GetProperty(kChip, "");
    const std::string taken = family != nullptr
                                      ? std::string("taken for the family ") + family->name
                                      : "of no known vendor";
    if (chip.empty()) {
        return problem("chip", std::string(kChip) + " is not set: " + taken,
                       "set it to the chip's name in vendor/build.prop, and reboot");
    }
    const std::string found = std::string(kChip) + " is " + jsonString(chip) + ": " + taken;
    return family != nullptr ? ok("chip", found) : unknown("chip", found, "mend \"vendor\" first");
}

Check checkMimoProperty() {
    const std::string mimo = GetProperty(kMimo, "");
    return ok("mimo", std::string(kMimo) +
                              (mimo.empty() ? " is not set" : " is " + jsonString(mimo)) +
                              ": isMimoSupport answers " + (mimo == "1" ? "true" : "false"));
}

Check checkShell(const std::string& root) {
    const FileState state = look(root + kShell);
    if (state.executable()) return ok("shell", kShell);
    if (state.exists()) return notExecutable("shell", kShell);
    if (state.hidden()) return unseen("shell", kShell, state);
    return problem("shell", std::string(kShell) + " is not there: no command can run",
                   "build the vendor's shell in: PRODUCT_PACKAGES += sh_vendor");
}

Check missingTool(const std::string& name, const std::string& tool) {
    return problem(name, tool + " is not there: calls that use it answer -1, failure or no count",
                   "install it in /vendor/bin with mode 755" + kExecuteDenied);
}

Check checkPath(const std::string& root, const std::string& path) {
    const std::string name = "tool " + path;
    const FileState state = look(root + path);
    if (state.executable()) return ok(name, path);
    if (state.exists()) return notExecutable(name, path);
    if (state.hidden()) return unseen(name, path, state);
    return missingTool(name, path);
}

Check checkName(const std::string& root, const std::string& tool) {
    const std::string name = "tool " + tool;
    std::string unusable;
    std::optional<Check> hidden;
    const auto isIn = [&](const std::string& folder) {
        const FileState state = look(root + folder + tool);
        if (unusable.empty() && state.exists() && !state.executable()) unusable = folder + tool;
        if (state.hidden()) hidden = unseen(name, folder + tool, state);
        return state.executable();
    };
    for (const char* folder : kVendorFolders) {
        if (isIn(folder)) return ok(name, folder + tool);
    }
    for (const char* folder : kOtherFolders) {
        if (!isIn(folder)) continue;
        return unknown(name,
                       "only as " + std::string(folder) + tool +
                               ", which a vendor process may usually not execute",
                       "install it in /vendor/bin, or see that a call with it succeeds; refusals "
                       "are in: " +
                               logcat(" | grep avc"));
    }
    if (!unusable.empty()) return notExecutable(name, unusable);
    return hidden ? *hidden : missingTool(name, tool);
}

Check checkModuleCandidates(const std::string& root) {
    const std::vector<const char*> places(std::begin(kModuleCandidates),
                                          std::end(kModuleCandidates));
    std::optional<Check> hidden;
    for (const char* candidate : places) {
        const FileState state = look(root + candidate);
        if (state.exists() && (state.mode & 0444) != 0) return ok("module", candidate);
        if (state.hidden()) hidden = unseen("module", candidate, state);
    }
    if (hidden) return *hidden;
    return problem("module", "none can be read of " + Join(places, ", "),
                   "install the driver's module in one of these places and restart the service, "
                   "which looks for it once");
}

Check checkModuleFolder(const std::string& root) {
    const Folder folder = listFolder(root + kModuleFolder);
    if (folder.hidden()) return unseen("module", kModuleFolder, {folder.error, 0, 0});
    std::vector<std::string> modules;
    for (const std::string& name : folder.names) {
        if (StartsWith(name, kModulePrefix)) modules.push_back(name);
    }
    if (!modules.empty())
        return ok("module", std::string(kModuleFolder) + ": " + Join(modules, ", "));
    return problem("module", std::string("no ") + kModulePrefix + "* in " + kModuleFolder,
                   "install the driver's modules there and restart the service, which looks for "
                   "them once");
}

/** A file that comes and goes with a module of the driver. */
Check checkParameter(const std::string& root, const DriverFile& file) {
    const std::string name = std::string("file ") + file.path;
    const FileState state = look(root + file.path);
    if (state.hidden()) return unseen(name, file.path, state);
    if (state.exists()) {
        if ((state.mode & 0222) != 0) return ok(name, "there");
        return problem(name, "nobody may write it",
                       std::string("use a build of the driver ") + file.module +
                               " whose parameter is writable");
    }
    const std::string module = std::string("/sys/module/") + file.module;
    if (look(root + module).exists()) {
        return problem(name, "the driver " + std::string(file.module) + " is loaded and lacks it",
                       "use a build of the driver with this parameter");
    }
    const std::string absent = std::string("the driver ") + file.module + " is not loaded";
    if (file.comesAndGoes) {
        return unknown(name, absent,
                       "it comes with the driver: turn Wi-Fi on, or insmod, and look "
                       "again" +
                               kInsmodDenied);
    }
    return problem(name, absent, "load it, no call does" + kInsmodDenied);
}

Check checkImage(const std::string& root, const std::string& path) {
    const FileState state = look(root + path);
    if (state.hasContent()) return ok("file " + path, std::to_string(state.size) + " bytes");
    if (state.hidden()) return unseen("file " + path, path, state);
    return problem("file " + path, state.exists() ? "empty, or no file" : "not there",
                   "install the chip's firmware image under this name");
}

/**
 * The property that keeps a tag's debug lines out of the log: the first that is set decides. Empty
 * when they are logged.
 */
std::string debugHiddenBy(const std::string& tag) {
    for (const std::string& name : {"persist.log.tag." + tag, "log.tag." + tag,
                                    std::string("persist.log.tag"), std::string("log.tag")}) {
        const std::string level = GetProperty(name, "");
        const int letter = level.empty() ? 0 : toupper(static_cast<unsigned char>(level[0]));
        if (letter == 'V' || letter == 'D') return "";
        if (letter != 0 && strchr("IWEFAS", letter) != nullptr) return name;
    }
    return "";
}

} // namespace

const std::vector<std::string> kCommandTags = {"wifi@1.0-VendorTestSuit", "wifi@1.0-SnifferTool"};

const ChipFamily* phoneFamily() {
    return findChipFamily(GetProperty(kVendor, ""), GetProperty(kChip, ""));
}

Checks checkProperties(const ChipFamily* family) {
    return {checkVendorProperty(family != nullptr), checkChipProperty(family), checkMimoProperty()};
}

Checks checkTools(const std::string& root, const ChipFamily* family) {
    Checks checks = {checkShell(root)};
    if (family == nullptr) {
        checks.push_back(
                unknown("tools", "which ones depends on the chip", "mend \"vendor\" first"));
        return checks;
    }
    for (const char* tool : family->toolsByPath)
        checks.push_back(checkPath(root, kVendorBin + std::string(tool)));
    for (const char* tool : family->toolsByName) checks.push_back(checkName(root, tool));
    return checks;
}

Checks checkDriver(const std::string& root, const ChipFamily* family) {
    if (family == nullptr) {
        return {unknown("driver", "its files depend on the chip", "mend \"vendor\" first")};
    }
    Checks checks;
    if (family->modules == DriverModules::oneOfSeveral)
        checks.push_back(checkModuleCandidates(root));
    if (family->modules == DriverModules::allOfAFolder) checks.push_back(checkModuleFolder(root));
    for (const DriverFile& file : family->files) {
        const bool always = *file.module == '\0';
        checks.push_back(always ? checkImage(root, file.path) : checkParameter(root, file));
    }
    return checks;
}

Check checkCommandLog() {
    std::string found;
    std::vector<std::string> remedies;
    for (const std::string& tag : kCommandTags) {
        const std::string cause = debugHiddenBy(tag);
        if (cause.empty()) continue;
        const std::string persistent = "persist.log.tag." + tag;
        if (found.empty()) found = cause + " is " + jsonString(GetProperty(cause, "")) + ": ";
        remedies.push_back("setprop " + (cause == persistent ? persistent : "log.tag." + tag) +
                           " D");
    }
    if (remedies.empty())
        return ok("command-log", logcat(" | grep 'cmd:'") + " shows which commands run");
    return problem("command-log", found + "the log does not show all commands that run",
                   Join(remedies, "; "));
}

} // namespace vendor::korvan::bex::wifi::client
