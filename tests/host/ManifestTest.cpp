// Copyright 2026 The BEX Wi-Fi Authors
// SPDX-License-Identifier: Apache-2.0

// Which instances the VINTF manifest declares.

#include <android/hidl/manager/1.0/IServiceManager.h>
#include <hidl/GtestPrinter.h>
#include <hidl/ServiceManagement.h>
#include <sys/stat.h>

#include "host/src/Manifest.h"
#include "tests/host/HostTest.h"

namespace vendor::korvan::bex::wifi::tests {
namespace {

using ::android::hardware::getAllHalInstanceNames;
using ::android::hardware::PrintInstanceNameToString;
using ::android::hardware::host::isDeclaredInManifest;

std::string manifest(const std::string& body, const std::string& attributes = "format=\"hidl\"") {
    return "<manifest version=\"1.0\" type=\"device\"><hal " + attributes +
           "><name>vendor.korvan.bex.wifi</name><transport>hwbinder</transport>" + body +
           "</hal></manifest>";
}

const std::string kInterface =
        "<interface><name>IWifiService</name><instance>default</instance>"
        "<instance>second</instance></interface>";

class ManifestTest : public HostTest {
  protected:
    bool declares(const std::string& text, const std::string& instance = "default") {
        write("vendor/etc/vintf/manifest.xml", text);
        return isDeclaredInManifest(IWifiService::descriptor, instance);
    }
};

TEST_F(ManifestTest, Interface) {
    const std::string text = manifest("<version>1.0</version>" + kInterface);
    EXPECT_TRUE(declares(text));
    EXPECT_TRUE(declares(text, "second"));
    EXPECT_FALSE(declares(text, "third"));
    EXPECT_FALSE(declares(text, ""));
}

TEST_F(ManifestTest, Fqname) {
    const std::string text = manifest("<fqname>@1.0::IWifiService/default</fqname>");
    EXPECT_TRUE(declares(text));
    EXPECT_FALSE(declares(text, "second"));
    EXPECT_FALSE(declares(manifest("<fqname>@1.0::IOther/default</fqname>")));
    EXPECT_FALSE(declares(manifest("<fqname>@2.0::IWifiService/default</fqname>")));
    EXPECT_FALSE(declares(manifest("<fqname>IWifiService/default</fqname>")));
}

TEST_F(ManifestTest, Versions) {
    EXPECT_TRUE(declares(manifest("<version>1.2</version>" + kInterface)));
    EXPECT_TRUE(declares(manifest("<version>1.0-2</version>" + kInterface)));
    EXPECT_TRUE(declares(manifest("<version>3.0</version><version>1.0</version>" + kInterface)));
    EXPECT_FALSE(declares(manifest("<version>2.0</version>" + kInterface)));
    EXPECT_FALSE(declares(manifest("<version>1</version>" + kInterface)));
    EXPECT_FALSE(declares(manifest(kInterface)));
}

TEST_F(ManifestTest, OtherFormatsDoNotCount) {
    const std::string body = "<version>1.0</version>" + kInterface;
    EXPECT_FALSE(declares(manifest(body, "format=\"aidl\"")));
    EXPECT_TRUE(declares(manifest(body, ""))); // hidl is what a manifest means by default
}

TEST_F(ManifestTest, Fragments) {
    EXPECT_FALSE(isDeclaredInManifest(IWifiService::descriptor, "default"));
    write("vendor/etc/vintf/manifest/a.xml", "<manifest/>");
    write("vendor/etc/vintf/manifest/b.txt", manifest("<version>1.0</version>" + kInterface));
    EXPECT_FALSE(isDeclaredInManifest(IWifiService::descriptor, "default"));
    write("vendor/etc/vintf/manifest/c.xml", manifest("<version>1.0</version>" + kInterface));
    EXPECT_TRUE(isDeclaredInManifest(IWifiService::descriptor, "default"));
}

TEST_F(ManifestTest, TheServiceManagerTellsTheTransport) {
    using Transport = ::android::hidl::manager::V1_0::IServiceManager::Transport;
    const auto manager = ::android::hardware::defaultServiceManager();
    ASSERT_NE(manager, nullptr);
    EXPECT_EQ(manager->getTransport(IWifiService::descriptor, "default"), Transport::EMPTY);
    write("vendor/etc/vintf/manifest.xml", manifest("<version>1.0</version>" + kInterface));
    EXPECT_EQ(manager->getTransport(IWifiService::descriptor, "default"), Transport::HWBINDER);
    EXPECT_EQ(manager->getTransport(IWifiService::descriptor, "third"), Transport::EMPTY);
}

TEST_F(ManifestTest, BrokenFilesAreIgnored) {
    write("vendor/etc/vintf/manifest/good.xml", manifest("<version>1.0</version>" + kInterface));
    for (const char* broken : {"", "<manifest>", "text", "<other/>", "<manifest><hal/></manifest>",
                               "<manifest><hal><name/><version/></hal></manifest>"}) {
        EXPECT_TRUE(declares(broken)) << broken;
    }
}

TEST_F(ManifestTest, AllInstancesSortedAndOnce) {
    using Names = std::vector<std::string>;
    EXPECT_EQ(getAllHalInstanceNames(IWifiService::descriptor), Names());
    write("vendor/etc/vintf/manifest.xml", manifest("<version>1.0</version>" + kInterface));
    write("vendor/etc/vintf/manifest/a.xml", manifest("<fqname>@1.0::IWifiService/another</fqname>"
                                                      "<fqname>@1.0::IWifiService/default</fqname>"
                                                      "<fqname>@1.0::IWifiService/</fqname>"
                                                      "<fqname>@1.0::IWifiService</fqname>"
                                                      "<fqname>@1.0::IOther/other</fqname>"
                                                      "<fqname>@2.0::IWifiService/newer</fqname>"));
    EXPECT_EQ(getAllHalInstanceNames(IWifiService::descriptor),
              Names({"another", "default", "second"}));
    EXPECT_EQ(getAllHalInstanceNames("vendor.korvan.bex.wifi@1.0::IOther"), Names({"other"}));
    EXPECT_EQ(getAllHalInstanceNames("IWifiService"), Names());
}

TEST_F(ManifestTest, TestsAreNamedByInstance) {
    EXPECT_EQ(PrintInstanceNameToString({"default", 0}), "0_default");
    EXPECT_EQ(PrintInstanceNameToString({"slot-1/a.b", 12}), "12_slot_1_a_b");
}

} // namespace
} // namespace vendor::korvan::bex::wifi::tests
