// Copyright 2026 The BEX Wi-Fi Authors
// SPDX-License-Identifier: Apache-2.0

#include "DoctorTest.h"
#include "Gate.h"

namespace vendor::korvan::bex::wifi::client {
namespace {

using namespace std::chrono_literals;
namespace fs = std::filesystem;
using Transport = ::android::hidl::manager::V1_0::IServiceManager::Transport;

class ServiceChecksTest : public DoctorTest {};

TEST_F(ServiceChecksTest, Declared) {
    expectOk("declared", "vendor.korvan.bex.wifi@1.0::IWifiService/default");
    mManager->transport = Transport::PASSTHROUGH;
    expectOnly("declared", "passthrough", "<transport>hwbinder</transport>");
    mManager->transport = Transport::EMPTY;
    expectOnly("declared", "does not give it to this user",
               "in /vendor/etc/vintf/manifest/wifi.xml");
    remove(kFragment);
    expect(check("declared"), Verdict::problem, "the service may not register",
           "install /vendor/etc/vintf/");
    mManager->refuses = true;
    expect(check("declared"), Verdict::problem, "cannot be asked", "as root");
    mManager = nullptr;
    expect(check("declared"), Verdict::problem, "there is none", "as root");
    expectUnknown("registered", "service manager", "\"declared\"");
}

TEST_F(ServiceChecksTest, ManifestEntriesAreCounted) {
    expectOk("manifest", kFragment);
    write("/vendor/etc/vintf/manifest/others.xml",
          "<!-- <name>vendor.korvan.bex.wifi</name> -->"
          "<name>vendor.korvan.bex.wifi2</name><name>a.vendor.korvan.bex.wifi</name>"
          "<fqname>@1.0::vendor.korvan.bex.wifi/x</fqname><name>vendor.korvan.bex.wifi");
    write("/vendor/etc/vintf/manifest/backup.xml.orig", kEntry);
    expectOk("manifest", kFragment);
    write("/vendor/etc/vintf/manifest.xml", kEntry);
    expectOnly("manifest", "/vendor/etc/vintf/manifest.xml, /vendor/etc/vintf/manifest/wifi.xml",
               "remove all but one");
    remove("/vendor/etc/vintf/manifest.xml");
    write(kFragment, std::string(kEntry) + kEntry);
    expectOnly("manifest", "manifest/wifi.xml, /vendor/etc/vintf/manifest/wifi.xml", "all but one");
}

TEST_F(ServiceChecksTest, ManifestsThatCannotBeSeen) {
    hide(kFragment);
    expectUnknown("manifest", kFragment, "as root");
    remove(kFragment);
    expectUnknown("manifest", "not in the usual files", "lshal");
    mManager->transport = Transport::EMPTY;
    expect(check("manifest"), Verdict::problem, "no file names", "install /vendor/etc/vintf/");
}

TEST_F(ServiceChecksTest, Matrix) {
    expectUnknown("matrix", "is here", "checkvintf");
    write("/system/etc/vintf/compatibility_matrix.5.xml", "<compatibility-matrix/>");
    write("/system/etc/vintf/manifest.xml", kEntry);
    expectOnly("matrix", "names vendor.korvan.bex.wifi",
               "DEVICE_FRAMEWORK_COMPATIBILITY_MATRIX_FILE");
    write("/system/etc/vintf/compatibility_matrix.device.xml", kEntry);
    expectOk("matrix", "/system/etc/vintf/compatibility_matrix.device.xml");
    hide("/system/etc/vintf/compatibility_matrix.device.xml");
    expectUnknown("matrix", "compatibility_matrix.device.xml cannot be read", "as root");
}

TEST_F(ServiceChecksTest, Init) {
    expectUnknown("init", "init.svc.vendor.bex_wifi is not set", "/vendor/etc/init");
    set("init.svc.vendor.bex_wifi", "running");
    expectOk("init", "running");
    for (const char* state : {"stopped", "stopping", "restarting"}) {
        set("init.svc.vendor.bex_wifi", state);
        expectOnly("init", state, "start vendor.bex_wifi");
    }
}

TEST_F(ServiceChecksTest, NotRegistered) {
    expectOk("registered", "found");
    mService = nullptr;
    expectOnly("registered", "getService waits until there is one", "look again");
    expectUnknown("answering", "nobody", "\"registered\"");
    expectUnknown("hash", "does not answer", "\"answering\"");
    mManager->transport = Transport::EMPTY;
    expectUnknown("registered", "not declared", "\"declared\"");
}

TEST_F(ServiceChecksTest, AServiceThatDied) {
    mService->dead = true;
    expectOnly("answering", "DEAD_OBJECT", "logcat -b crash (a simulated phone: ./dev log)");
}

TEST_F(ServiceChecksTest, Hash) {
    expectOk("hash", "14fe6273");
    mService->hashByte = 0;
    expectOnly("hash", "not frozen", "current.txt");
    mService->hashByte = 0xAB;
    expectOnly("hash", "abababab", "same IWifiService.hal");
}

TEST_F(ServiceChecksTest, Program) {
    expectUnknown("program", "does not tell", "/proc/");
    mService->pid = 4711;
    expectUnknown("program", "/proc/4711/exe cannot be read", "as root");
    write("/proc/4711/maps", "");
    const fs::path link = root() + "/proc/4711/exe";
    fs::create_symlink("/vendor/bin/hw/service", link);
    expectOk("program", "/vendor/bin/hw/service");
    fs::remove(link);
    fs::create_symlink("/data/local/tmp/service", link);
    expectOnly("program", "\"/data/local/tmp/service\" is not below /vendor/",
               "/vendor/bin/hw/vendor.korvan.bex.wifi@1.0-service");
}

TEST_F(ServiceChecksTest, AServiceManagerThatDoesNotAnswer) {
    Gate gate;
    mTimeout = 1s;
    mManager->onCall = [&gate] { gate.wait(); };
    const Checks checks = all();
    expect(checks[3], Verdict::problem, "has not answered in 1 s", "hwservicemanager");
    EXPECT_EQ(countProblems(checks), 1U);
}

TEST_F(ServiceChecksTest, ASearchThatDoesNotEnd) {
    Gate gate;
    mTimeout = 1s;
    mTryFind = [this, &gate] {
        gate.wait();
        return mService;
    };
    const Checks checks = all();
    expect(checks[7], Verdict::unknown, "the search has not ended", "\"answering\"");
    expect(checks[8], Verdict::problem, "has not answered in 1 s", "--timeout");
    expect(checks[8], Verdict::problem, "has not answered",
           "a tool that left a process behind with its output open");
    EXPECT_EQ(countProblems(checks), 1U);
}

TEST_F(ServiceChecksTest, AServiceThatHangs) {
    Gate gate;
    mTimeout = 1s;
    mService->onPing = [&gate] { gate.wait(); };
    const Checks checks = all();
    expect(checks[8], Verdict::problem, "has not answered in 1 s",
           "stop vendor.bex_wifi; start vendor.bex_wifi");
    EXPECT_EQ(countProblems(checks), 1U);
}

} // namespace
} // namespace vendor::korvan::bex::wifi::client
