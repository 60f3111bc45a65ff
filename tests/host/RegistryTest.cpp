// Copyright 2026 The BEX Wi-Fi Authors
// SPDX-License-Identifier: Apache-2.0

// Names: who has them, who is found under them.

#include <hidl/HidlTransportSupport.h>
#include <signal.h>
#include <sys/stat.h>
#include <unistd.h>
#include <vendor/korvan/bex/wifi/1.0/BpHwWifiService.h>

#include <atomic>
#include <chrono>
#include <filesystem>
#include <future>
#include <thread>

#include "host/src/RegistrationWatch.h"
#include "host/src/RemoteBinder.h"
#include "host/src/Session.h"
#include "host/src/SocketFile.h"
#include "tests/host/HostTest.h"
#include "tests/host/ScriptedService.h"

namespace vendor::korvan::bex::wifi::tests {
namespace {

using ::android::BAD_VALUE;
using ::android::OK;
using ::android::hardware::host::RemoteBinder;
using ::android::hardware::host::Session;

constexpr const char* kManifest = R"(<manifest version="1.0" type="device">
    <hal format="hidl">
        <name>vendor.korvan.bex.wifi</name>
        <transport>hwbinder</transport>
        <version>1.0</version>
        <interface><name>IWifiService</name><instance>default</instance></interface>
    </hal>
</manifest>)";

int32_t tagOf(const sp<IWifiService>& service) {
    return service == nullptr ? -1 : static_cast<int32_t>(service->getWlanMode().withDefault(-2));
}

class RegistryTest : public HostTest {
  protected:
    void SetUp() override {
        HostTest::SetUp();
        // Never joined: what this process registers is not served, but found by itself.
        android::hardware::configureRpcThreadpool(1, true);
    }
};

TEST_F(RegistryTest, NamesOfOneProcess) {
    ServerProcess server({"pool", "2", "register", "default", "register", "default", "register", "",
                          "register", "second", "register-new", "third", "register-new", "second",
                          "ready", "join"});
    for (int i = 0; i < 6; ++i) EXPECT_EQ(server.report(), "0") << i;
    ASSERT_EQ(server.report(), "ready");
    EXPECT_EQ(tagOf(IWifiService::tryGetService()), 5);
    EXPECT_EQ(tagOf(IWifiService::tryGetService("")), 5);
    EXPECT_EQ(tagOf(IWifiService::tryGetService("third")), 6);
    EXPECT_EQ(tagOf(IWifiService::tryGetService("second")), 7);
    EXPECT_EQ(IWifiService::tryGetService("fourth"), nullptr);
}

TEST_F(RegistryTest, OldProxyKeepsItsObject) {
    ServerProcess server(
            {"register", "default", "ready", "gate", "register-new", "default", "ready", "gate"});
    ASSERT_EQ(server.report(), "0");
    ASSERT_EQ(server.report(), "ready");
    sp<IWifiService> old = IWifiService::tryGetService();
    EXPECT_EQ(tagOf(old), 5);
    server.openGate();
    ASSERT_EQ(server.report(), "0");
    ASSERT_EQ(server.report(), "ready");
    EXPECT_EQ(tagOf(old), 5);
    EXPECT_EQ(tagOf(IWifiService::tryGetService()), 6);
}

// A client that nobody has yet accepted when its object is replaced.
TEST_F(RegistryTest, OldProxyKeepsItsObjectUnaccepted) {
    ServerProcess server({"pool", "2", "register", "default", "ready", "gate", "register-new",
                          "default", "ready", "join"});
    ASSERT_EQ(server.report(), "0");
    ASSERT_EQ(server.report(), "ready");
    // As a search does, but without asking the server, which does not serve yet.
    auto session =
            Session::open(android::hardware::host::socketPath(IWifiService::descriptor, "default"));
    ASSERT_NE(session, nullptr);
    sp<IWifiService> old = new V1_0::BpHwWifiService(new RemoteBinder(std::move(session)));
    server.openGate();
    ASSERT_EQ(server.report(), "0");
    EXPECT_EQ(tagOf(old), 5);
    EXPECT_EQ(tagOf(IWifiService::tryGetService()), 6);
}

TEST_F(RegistryTest, LastProcessWinsAndDiesWithTheName) {
    ServerProcess first(kUsualServer, 5);
    ASSERT_EQ(first.report(), "0");
    ServerProcess second(kUsualServer, 6);
    ASSERT_EQ(second.report(), "0");
    ASSERT_EQ(second.report(), "ready");
    EXPECT_EQ(tagOf(IWifiService::tryGetService()), 6);
    second.signal(SIGKILL);
    second.end();
    EXPECT_EQ(IWifiService::tryGetService(), nullptr);
    EXPECT_EQ(IWifiService::getService(), nullptr);
}

TEST_F(RegistryTest, SocketLeftByAKilledServerIsReplaced) {
    {
        ServerProcess killed(kUsualServer);
        ASSERT_EQ(killed.report(), "0");
    }
    EXPECT_EQ(IWifiService::tryGetService(), nullptr);
    ServerProcess server(kUsualServer, 6);
    ASSERT_EQ(server.report(), "0");
    ASSERT_EQ(server.report(), "ready");
    EXPECT_EQ(tagOf(IWifiService::tryGetService()), 6);
}

TEST_F(RegistryTest, TryGetServiceWithNothingThere) {
    EXPECT_EQ(IWifiService::tryGetService(), nullptr);
    write("vendor/etc/vintf/manifest.xml", kManifest);
    EXPECT_EQ(IWifiService::tryGetService(), nullptr);
}

TEST_F(RegistryTest, GetServiceOfAnUndeclaredName) {
    EXPECT_EQ(IWifiService::getService(), nullptr);
    write("vendor/etc/vintf/manifest.xml", kManifest);
    EXPECT_EQ(IWifiService::getService("other"), nullptr);
}

TEST_F(RegistryTest, GetServiceOfAnUndeclaredButRegisteredName) {
    ServerProcess server(kUsualServer);
    ASSERT_EQ(server.report(), "0");
    EXPECT_EQ(tagOf(IWifiService::getService()), 5);
}

// The client's log on a pipe: its line says that it waits, and only then is there a server.
TEST_F(RegistryTest, GetServiceWaitsForADeclaredName) {
    write("vendor/etc/vintf/manifest/fragment.xml", kManifest);
    const std::string log = root() + "/log";
    ASSERT_EQ(mkfifo(log.c_str(), 0600), 0);
    std::string command = "exec";
    for (const std::string& word : kServerCommand) command += " '" + word + "'";
    command += " 1 0 0 call found 2>" + log;
    FILE* client = popen(command.c_str(), "re");
    ASSERT_NE(client, nullptr);
    FILE* lines = fopen(log.c_str(), "re");
    ASSERT_NE(lines, nullptr);
    char line[512];
    for (int i = 0; i < 2; ++i) {
        ASSERT_NE(fgets(line, sizeof(line), lines), nullptr);
        EXPECT_NE(strstr(line,
                         "Waited one second for "
                         "vendor.korvan.bex.wifi@1.0::IWifiService/default"),
                  nullptr)
                << line;
    }
    ServerProcess server(kUsualServer);
    ASSERT_NE(fgets(line, sizeof(line), client), nullptr);
    EXPECT_STREQ(line, "found\n");
    fclose(lines);
    EXPECT_EQ(pclose(client), 0);
}

// Waiters wake for the registration, not by their clock: ten in a row take less than a second each,
// counted from it.
TEST_F(RegistryTest, WaiterWakesAtOnce) {
    write("vendor/etc/vintf/manifest.xml", kManifest);
    std::chrono::steady_clock::duration waited{0};
    for (int i = 0; i < 10; ++i) {
        std::filesystem::remove_all(socketFolder());
        auto found = std::async(std::launch::async, [] { return IWifiService::getService(); });
        ServerProcess server(kUsualServer);
        EXPECT_EQ(server.report(), "0");
        const auto registered = std::chrono::steady_clock::now();
        EXPECT_EQ(tagOf(found.get()), 5);
        waited += std::chrono::steady_clock::now() - registered;
    }
    EXPECT_LT(waited, std::chrono::seconds(8));
}

// Or a waiter would look again and again without a pause.
TEST_F(RegistryTest, AWatchKnowsNothingOfAnEarlierOnesNews) {
    using std::chrono::milliseconds;
    {
        ::android::hardware::host::RegistrationWatch watch;
        write("dev/socket/news", "");
        EXPECT_TRUE(watch.wait(milliseconds(60'000)));
    }
    ::android::hardware::host::RegistrationWatch watch;
    EXPECT_FALSE(watch.wait(milliseconds(0)));
    write("dev/socket/more", "");
    EXPECT_TRUE(watch.wait(milliseconds(60'000)));
}

TEST_F(RegistryTest, OwnProcessGetsTheObjectItself) {
    sp<ScriptedService> object = new ScriptedService(-1, -1, 5);
    ASSERT_EQ(object->registerAsService(), OK);
    // Nobody serves, so this would hang if it asked the socket.
    sp<IWifiService> found = IWifiService::getService();
    EXPECT_EQ(found.get(), object.get());
    EXPECT_FALSE(found->isRemote());
    EXPECT_EQ(IWifiService::tryGetService().get(), object.get());
    EXPECT_EQ(tagOf(found), 5);

    ServerProcess server(kUsualServer, 6);
    ASSERT_EQ(server.report(), "0");
    ASSERT_EQ(server.report(), "ready");
    found = IWifiService::getService();
    EXPECT_TRUE(found->isRemote());
    EXPECT_EQ(tagOf(found), 6);
}

TEST_F(RegistryTest, StubIsAsked) {
    sp<ScriptedService> object = new ScriptedService(-1, -1, 5);
    ASSERT_EQ(object->registerAsService(), OK);
    EXPECT_EQ(IWifiService::tryGetService(true /* getStub */), nullptr);
    EXPECT_FALSE(IWifiService::registerForNotifications("default", nullptr));
}

TEST_F(RegistryTest, SocketIsTheOwnersAlone) {
    sp<ScriptedService> object = new ScriptedService(-1, -1, 5);
    ASSERT_EQ(object->registerAsService("a/b %c"), OK);
    struct stat file;
    const std::string name = "vendor.korvan.bex.wifi@1.0::IWifiService~a%2Fb%20%25c";
    ASSERT_EQ(stat((socketFolder() + name).c_str(), &file), 0);
    EXPECT_TRUE(S_ISSOCK(file.st_mode));
    EXPECT_EQ(file.st_mode & 07777, 0600u);
    EXPECT_EQ(IWifiService::tryGetService("a/b %c").get(), object.get());
    // Nothing of the registration itself stays behind.
    auto files = std::filesystem::directory_iterator(socketFolder());
    EXPECT_EQ(std::distance(begin(files), end(files)), 1);
}

TEST_F(RegistryTest, NameTooLongForASocket) {
    sp<ScriptedService> object = new ScriptedService(-1, -1, 5);
    EXPECT_EQ(object->registerAsService(std::string(100, 'x')), BAD_VALUE);
    EXPECT_EQ(IWifiService::tryGetService(std::string(100, 'x')), nullptr);
}

TEST_F(RegistryTest, NoFolderForSockets) {
    std::filesystem::remove_all(root() + "/dev/socket");
    sp<ScriptedService> object = new ScriptedService(-1, -1, 5);
    EXPECT_EQ(object->registerAsService(), -ENOENT);
    EXPECT_EQ(IWifiService::tryGetService(), nullptr);
}

// Registering in a row replaces atomically: a client finds the one or the other, never none.
TEST_F(RegistryTest, NeverGoneWhileReplaced) {
    std::vector<std::string> steps = {"pool", "2", "register", "default", "ready"};
    for (int i = 0; i < 300; ++i) steps.insert(steps.end(), {"register", "default"});
    steps.emplace_back("join");
    ServerProcess server(steps);
    ASSERT_EQ(server.report(), "0");
    ASSERT_EQ(server.report(), "ready");
    std::atomic<bool> done{false};
    auto alwaysFound = std::async(std::launch::async, [&done] {
        while (!done) {
            if (IWifiService::tryGetService() == nullptr) return false;
        }
        return true;
    });
    for (int i = 0; i < 300; ++i) EXPECT_EQ(server.report(), "0");
    done = true;
    EXPECT_TRUE(alwaysFound.get());
    EXPECT_EQ(tagOf(IWifiService::tryGetService()), 5);
}

} // namespace
} // namespace vendor::korvan::bex::wifi::tests
