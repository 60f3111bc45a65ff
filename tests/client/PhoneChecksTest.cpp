// Copyright 2026 The BEX Wi-Fi Authors
// SPDX-License-Identifier: Apache-2.0

#include "DoctorTest.h"

namespace vendor::korvan::bex::wifi::client {
namespace {

class PhoneChecksTest : public DoctorTest {};

TEST_F(PhoneChecksTest, Properties) {
    expectOk("mimo", "ro.hardware.wlan.mimo is not set: isMimoSupport answers false");
    set("ro.hardware.wlan.mimo", "1");
    expectOk("mimo", "answers true");
    set("ro.hardware.wlan.chip", "");
    expectOnly("chip", "not set: taken for the family broadcom", "vendor/build.prop");
    set("ro.hardware.wlan.vendor", "");
    expect(check("vendor"), Verdict::problem, "not set: the first call ends", "broadcom or qcom");
    set("ro.hardware.wlan.chip", "a\nb");
    set("ro.hardware.wlan.vendor", "Qcom\n");
    expectOnly("vendor", "is \"Qcom\\n\": the first call ends the service", "broadcom or qcom");
    expectUnknown("chip", "\"a\\nb\": of no known vendor", "\"vendor\"");
    expectUnknown("tools", "depends on the chip", "\"vendor\"");
    expectUnknown("driver", "depend on the chip", "\"vendor\"");
}

TEST_F(PhoneChecksTest, Shell) {
    mode("/vendor/bin/sh", 0644);
    expectOnly("shell", "not an executable file", "chmod 755 /vendor/bin/sh");
    hide("/vendor/bin/sh");
    expectUnknown("shell", "/vendor/bin/sh: ", "as root");
    remove("/vendor/bin/sh");
    expectOnly("shell", "no command can run", "sh_vendor");
}

TEST_F(PhoneChecksTest, AToolThatIsCalledByItsPath) {
    const std::string iw = "/vendor/bin/iw";
    mode(iw, 0644);
    expectOnly("tool /vendor/bin/iw", "not an executable file", "chmod 755 /vendor/bin/iw");
    hide(iw);
    expectUnknown("tool /vendor/bin/iw", "/vendor/bin/iw: ", "as root");
    remove(iw);
    writeTool("/system/bin/iw");
    expectOnly("tool /vendor/bin/iw", "not there", "install it in /vendor/bin");
}

TEST_F(PhoneChecksTest, AToolThatTheShellLooksUp) {
    remove("/vendor/bin/wl");
    expectOnly("tool wl", "not there", "install it in /vendor/bin");
    write("/vendor/xbin/wl", "");
    expectOnly("tool wl", "/vendor/xbin/wl is not an executable", "chmod 755 /vendor/xbin/wl");
    write("/system/bin/wl", "");
    expectOnly("tool wl", "/vendor/xbin/wl is not an executable", "chmod 755 /vendor/xbin/wl");
    writeTool("/system/bin/wl");
    expectUnknown("tool wl", "only as /system/bin/wl",
                  "logcat | grep avc (a simulated phone: ./dev log)");
    writeTool("/odm/bin/wl");
    expectOk("tool wl", "/odm/bin/wl");
    remove("/vendor/xbin");
    remove("/odm");
    hide("/system/bin/wl");
    expectUnknown("tool wl", "/system/bin/wl: ", "as root");
}

TEST_F(PhoneChecksTest, TheOneModuleFile) {
    install("qcom", "QCA6174");
    expectOk("module", "/vendor/lib/modules/wlan.ko");
    mode("/vendor/lib/modules/wlan.ko", 0);
    expectOnly("module", "none can be read", "restart the service");
    hide("/vendor/lib/modules/wlan.ko");
    expectUnknown("module", "/vendor/lib/modules/wlan.ko: ", "as root");
    write("/vendor/lib/modules/qca_cld3/qca_cld3_wlan.ko", "");
    expectOk("module", "/vendor/lib/modules/qca_cld3/qca_cld3_wlan.ko");
}

TEST_F(PhoneChecksTest, TheFolderOfModules) {
    install("qcom", "wcn6750");
    write("/vendor/lib/modules/qca_cld3_y.ko", "");
    write("/vendor/lib/modules/rmnet.ko", "");
    expectOk("module", "/vendor/lib/modules: qca_cld3_x, qca_cld3_y.ko");
    remove("/vendor/lib/modules/qca_cld3_x");
    remove("/vendor/lib/modules/qca_cld3_y.ko");
    expectOnly("module", "no qca_cld3_* in /vendor/lib/modules", "restart the service");
    hide("/vendor/lib/modules");
    expectUnknown("module", "/vendor/lib/modules: ", "as root");
}

TEST_F(PhoneChecksTest, AParameterThatComesWithTheDriver) {
    const std::string path = "/sys/module/wlan/parameters/con_mode";
    mode(path, 0444);
    expectOnly("file " + path, "nobody may write it", "writable");
    hide(path);
    expectUnknown("file " + path, path + ": ", "as root");
    remove(path);
    expectOnly("file " + path, "is loaded and lacks it", "with this parameter");
    remove("/sys/module/wlan");
    expectUnknown("file " + path, "not loaded", "module_load");
}

TEST_F(PhoneChecksTest, AParameterOfADriverThatNoCallLoads) {
    remove("/sys/module/bcmdhd");
    expectOnly("file /sys/module/bcmdhd/parameters/firmware_path", "bcmdhd is not loaded",
               "load it");
}

TEST_F(PhoneChecksTest, AFirmwareImage) {
    const std::string image = "/etc/firmware/fw_bcmdhd_mfg.bin";
    write(image, "");
    expectOnly("file " + image, "empty", "install the chip's firmware");
    hide(image);
    expectUnknown("file " + image, image + ": ", "as root");
    remove(image);
    expectOnly("file " + image, "not there", "install the chip's firmware");
}

TEST_F(PhoneChecksTest, CommandLog) {
    const std::string suit = "log.tag.wifi@1.0-VendorTestSuit";
    const std::string sniffer = "log.tag.wifi@1.0-SnifferTool";
    expectOk("command-log", "logcat");
    for (const char* level : {"I", "warn", "E", "S"}) {
        set("log.tag", level);
        expectOnly("command-log", "log.tag is \"" + std::string(level) + "\": ",
                   "setprop " + suit + " D; setprop " + sniffer + " D");
    }
    set(suit, "V");
    expectOnly("command-log", "log.tag is \"S\": ", "setprop " + sniffer + " D");
    set(sniffer, "debug");
    expectOk("command-log", "logcat");
    set("persist." + sniffer, "W");
    expectOnly("command-log",
               "persist." + sniffer + " is \"W\": ", "setprop persist." + sniffer + " D");
}

} // namespace
} // namespace vendor::korvan::bex::wifi::client
