// Copyright 2026 The BEX Wi-Fi Authors
// SPDX-License-Identifier: Apache-2.0

#pragma once

#include <android-base/unique_fd.h>
#include <gtest/gtest.h>
#include <hwbinder/Parcel.h>
#include <sys/types.h>
#include <vendor/korvan/bex/wifi/1.0/IWifiService.h>

#include <string>
#include <vector>

namespace vendor::korvan::bex::wifi::tests {

using ::android::sp;
using ::android::status_t;
using ::android::wp;
using V1_0::IWifiService;

/** Whether an emulator runs the tests and their servers, with threads and memory of its own. */
constexpr bool kEmulated = HIDL_TEST_EMULATED;

/** What Return::description() tells of a transport's failure: transportFailure("DEAD_OBJECT"). */
std::string transportFailure(const std::string& error);

/** RunRxStop(script): its text, or the description of its failure. */
std::string call(const sp<IWifiService>& service, const std::string& script);

/** Writes a request for RunRxStop(text), which must outlive the parcel. */
void fillCall(android::hardware::Parcel* parcel, const android::hardware::hidl_string& text);

/** The words that start hidl-test-server; its own arguments follow. */
const std::vector<std::string> kServerCommand = {HIDL_TEST_SERVER};

/** A process of hidl-test-server, whose steps it runs. Killed when the object goes. */
class ServerProcess {
  public:
    explicit ServerProcess(const std::vector<std::string>& steps, int tag = 5);
    ~ServerProcess();

    pid_t pid() const { return mPid; }
    /** The next line that it reports. Empty, and the test fails, when none comes. */
    std::string report();
    /** Lets one waiting method go on. */
    void openGate();
    void signal(int number);
    /** Waits for its end and returns the signal that ended it, 0 for none. */
    int end();
    /** The lines of one of its files in /proc. */
    std::vector<std::string> proc(const std::string& file) const;

  private:
    pid_t mPid = -1;
    bool mEnded = false;
    android::base::unique_fd mEvents;
    android::base::unique_fd mGate;
};

/** The steps of a server with a pool of two threads that registers "default", like the service. */
const std::vector<std::string> kUsualServer = {"pool", "2", "register", "default", "ready", "join"};

/** Each test runs in a file tree of its own, which stands for the phone's. */
class HostTest : public ::testing::Test {
  protected:
    void SetUp() override;
    void TearDown() override;

    const std::string& root() const { return mRoot; }
    std::string socketFolder() const { return mRoot + "/dev/socket/hidl/"; }
    /** Writes a file below the root, and its folders. */
    void write(const std::string& path, const std::string& text) const;

  private:
    std::string mRoot;
};

/** A test with the usual server and a proxy to it. */
class ServedTest : public HostTest {
  protected:
    void SetUp() override;
    /** Starts a server, in place of the one before if there is one, and finds it. */
    void serve(const std::vector<std::string>& steps);

    std::unique_ptr<ServerProcess> server;
    sp<IWifiService> service;
};

} // namespace vendor::korvan::bex::wifi::tests
