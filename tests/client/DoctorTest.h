// Copyright 2026 The BEX Wi-Fi Authors
// SPDX-License-Identifier: Apache-2.0

#pragma once

#include <android-base/file.h>
#include <android-base/properties.h>
#include <gmock/gmock.h>
#include <gtest/gtest.h>

#include <algorithm>
#include <filesystem>
#include <fstream>

#include "FakeService.h"
#include "chips/ChipFamily.h"
#include "client/doctor/Doctor.h"

namespace vendor::korvan::bex::wifi::client {

/** A service as the doctor asks it. */
class Patient : public FakeService {
  public:
    std::function<void()> onPing = [] {};
    bool dead = false;
    /** The interface's own hash is this byte, over and over; -1: the one that is compiled in. */
    int hashByte = -1;
    int pid = -1;

    ::android::hardware::Return<void> ping() override {
        onPing();
        using ::android::hardware::Status;
        if (dead) return Status::fromExceptionCode(Status::EX_TRANSACTION_FAILED, "DEAD_OBJECT: ");
        return ::android::hardware::Void();
    }
    ::android::hardware::Return<void> getHashChain(getHashChain_cb keep) override {
        if (hashByte == -1) return IWifiService::getHashChain(keep);
        ::android::hardware::hidl_array<uint8_t, 32> hash;
        std::fill(hash.data(), hash.data() + hash.size(), hashByte);
        keep({hash});
        return ::android::hardware::Void();
    }
    ::android::hardware::Return<void> getDebugInfo(getDebugInfo_cb keep) override {
        keep({pid, 0, {}});
        return ::android::hardware::Void();
    }
};

class Manager : public ::android::hidl::manager::V1_0::IServiceManager {
  public:
    Transport transport = Transport::HWBINDER;
    bool refuses = false;
    std::function<void()> onCall = [] {};

    ::android::hardware::Return<Transport> getTransport(
            const ::android::hardware::hidl_string& fqName,
            const ::android::hardware::hidl_string& name) override {
        EXPECT_EQ(fqName, "vendor.korvan.bex.wifi@1.0::IWifiService");
        EXPECT_EQ(name, "default");
        onCall();
        using ::android::hardware::Status;
        if (refuses) return Status::fromExceptionCode(Status::EX_SECURITY, "no");
        return transport;
    }
    ::android::hardware::Return<bool> registerForNotifications(
            const ::android::hardware::hidl_string&, const ::android::hardware::hidl_string&,
            const ::android::sp<::android::hidl::manager::V1_0::IServiceNotification>&) override {
        return false;
    }
};

inline constexpr char kEntry[] =
        "<manifest>\n<hal><name> vendor.korvan.bex.wifi\n</name></hal></manifest>";
inline constexpr char kFragment[] = "/vendor/etc/vintf/manifest/wifi.xml";

/** Each test begins with a healthy Broadcom phone, and breaks something. */
class DoctorTest : public ::testing::Test {
  protected:
    DoctorTest() { install("broadcom", "bcm4375"); }

    ~DoctorTest() override {
        for (const std::string& name : mProperties) ::android::base::SetProperty(name, "");
    }

    void set(const std::string& property, const std::string& value) {
        mProperties.push_back(property);
        ::android::base::SetProperty(property, value);
    }

    /** Makes the phone one with another chip. */
    void install(const std::string& vendor, const std::string& chip) {
        std::filesystem::remove_all(mRoot.path);
        set("ro.hardware.wlan.vendor", vendor);
        set("ro.hardware.wlan.chip", chip);
        write(kFragment, kEntry);
        writeTool("/vendor/bin/sh");
        const ChipFamily& family = *findChipFamily(vendor, chip);
        for (const auto* tools : {&family.toolsByPath, &family.toolsByName}) {
            for (const char* tool : *tools) writeTool(std::string("/vendor/bin/") + tool);
        }
        for (const DriverFile& file : family.files) write(file.path, "0");
        if (family.modules == DriverModules::oneOfSeveral) {
            write("/vendor/lib/modules/wlan.ko", "x");
        }
        if (family.modules == DriverModules::allOfAFolder) {
            write("/vendor/lib/modules/qca_cld3_x", "x");
        }
    }

    void write(const std::string& path, const std::string& text) {
        std::filesystem::create_directories(std::filesystem::path(at(path)).parent_path());
        std::ofstream(at(path)) << text;
    }

    void writeTool(const std::string& path) {
        write(path, "");
        std::filesystem::permissions(at(path), std::filesystem::perms(0755));
    }

    void remove(const std::string& path) { std::filesystem::remove_all(at(path)); }

    void mode(const std::string& path, int mode) {
        std::filesystem::permissions(at(path), std::filesystem::perms(mode));
    }

    /** Puts something in the path's place that cannot be looked at, by root neither. */
    void hide(const std::string& path) {
        remove(path);
        std::filesystem::create_symlink(std::filesystem::path(path).filename(), at(path));
    }

    Checks all() {
        return examine([this] { return mTryFind(); }, {[this] { return mManager; }, mRoot.path},
                       mTimeout);
    }

    Check check(const std::string& name) {
        for (const Check& check : all()) {
            if (check.name == name) return check;
        }
        ADD_FAILURE() << "no check " << name;
        return {};
    }

    /** Expects that the check, and no other, is a problem. */
    void expectOnly(const std::string& name, const std::string& found, const std::string& remedy) {
        for (const Check& check : all()) {
            if (check.name == name) {
                expect(check, Verdict::problem, found, remedy);
            } else {
                EXPECT_NE(check.verdict, Verdict::problem) << check.name << ": " << check.found;
            }
        }
        EXPECT_EQ(check(name).name, name);
    }

    static void expect(const Check& check, Verdict verdict, const std::string& found,
                       const std::string& remedy) {
        EXPECT_EQ(check.verdict, verdict) << check.name;
        EXPECT_THAT(check.found, ::testing::HasSubstr(found));
        EXPECT_THAT(check.remedy, ::testing::HasSubstr(remedy));
    }

    void expectOk(const std::string& name, const std::string& found) {
        const Check seen = check(name);
        expect(seen, Verdict::ok, found, "");
        EXPECT_EQ(seen.remedy, "");
    }

    void expectUnknown(const std::string& name, const std::string& found,
                       const std::string& remedy) {
        expect(check(name), Verdict::unknown, found, remedy);
    }

    ::android::sp<Patient> mService = new Patient;
    ::android::sp<Manager> mManager = new Manager;
    FindService mTryFind = [this] { return mService; };
    std::chrono::nanoseconds mTimeout = std::chrono::minutes(1);

    std::string root() const { return mRoot.path; }

  private:
    std::string at(const std::string& path) const { return mRoot.path + path; }

    TemporaryDir mRoot;
    std::vector<std::string> mProperties;
};

} // namespace vendor::korvan::bex::wifi::client
