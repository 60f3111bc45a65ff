// Copyright 2026 The BEX Wi-Fi Authors
// SPDX-License-Identifier: Apache-2.0

#include "tests/host/HostTest.h"

#include <fcntl.h>
#include <hidl/HidlBinderSupport.h>
#include <poll.h>
#include <signal.h>
#include <stdlib.h>
#include <sys/wait.h>
#include <unistd.h>

#include <filesystem>
#include <fstream>

namespace vendor::korvan::bex::wifi::tests {
namespace {

constexpr int kPatienceMs = 60'000;
// The exit code of tests/sanitizers.
constexpr int kSanitizerReport = 66;

void makePipe(android::base::unique_fd* readEnd, android::base::unique_fd* writeEnd) {
    int ends[2];
    ASSERT_EQ(pipe2(ends, O_CLOEXEC), 0);
    readEnd->reset(ends[0]);
    writeEnd->reset(ends[1]);
}

} // namespace

std::string transportFailure(const std::string& error) {
    return "Status(EX_TRANSACTION_FAILED): '" + error + ": '";
}

std::string call(const sp<IWifiService>& service, const std::string& script) {
    std::string result;
    auto called = service->RunRxStop(script, [&](const auto& out) { result = out; });
    return called.isOk() ? result : called.description();
}

void fillCall(android::hardware::Parcel* parcel, const android::hardware::hidl_string& text) {
    size_t parent;
    ASSERT_EQ(parcel->writeInterfaceToken(IWifiService::descriptor), android::OK);
    ASSERT_EQ(parcel->writeBuffer(&text, sizeof(text), &parent), android::OK);
    ASSERT_EQ(writeEmbeddedToParcel(text, parcel, parent, 0), android::OK);
}

ServerProcess::ServerProcess(const std::vector<std::string>& steps, int tag) {
    android::base::unique_fd events;
    android::base::unique_fd gate;
    makePipe(&mEvents, &events);
    makePipe(&gate, &mGate);
    std::vector<std::string> words = kServerCommand;
    words.insert(words.end(), {"3", "4", std::to_string(tag)});
    words.insert(words.end(), steps.begin(), steps.end());
    std::vector<char*> arguments;
    for (std::string& word : words) arguments.push_back(word.data());
    arguments.push_back(nullptr);

    mPid = fork();
    EXPECT_GE(mPid, 0);
    if (mPid == 0) {
        // First out of each other's way, as either may be 3 or 4 already.
        const int eventsHigh = fcntl(events.get(), F_DUPFD_CLOEXEC, 100);
        const int gateHigh = fcntl(gate.get(), F_DUPFD_CLOEXEC, 100);
        dup2(eventsHigh, 3);
        dup2(gateHigh, 4);
        // Whatever this process was itself born with.
        close_range(5, ~0u, 0);
        execvp(arguments[0], arguments.data());
        _exit(127);
    }
}

ServerProcess::~ServerProcess() {
    if (mEnded) return;
    signal(SIGKILL);
    end();
}

std::string ServerProcess::report() {
    std::string line;
    for (char byte = 0;; line += byte) {
        pollfd ready = {mEvents.get(), POLLIN, 0};
        if (poll(&ready, 1, kPatienceMs) != 1 || read(mEvents.get(), &byte, 1) != 1) {
            ADD_FAILURE() << "The server reports nothing, after '" << line << "'";
            return "";
        }
        if (byte == '\n') return line;
    }
}

void ServerProcess::openGate() {
    ASSERT_EQ(::write(mGate.get(), "x", 1), 1);
}

void ServerProcess::signal(int number) {
    ASSERT_EQ(kill(mPid, number), 0);
}

int ServerProcess::end() {
    int status = 0;
    EXPECT_EQ(waitpid(mPid, &status, 0), mPid);
    mEnded = true;
    EXPECT_FALSE(WIFEXITED(status) && WEXITSTATUS(status) == kSanitizerReport);
    return WIFSIGNALED(status) ? WTERMSIG(status) : 0;
}

std::vector<std::string> ServerProcess::proc(const std::string& file) const {
    std::ifstream in("/proc/" + std::to_string(mPid) + "/" + file);
    std::vector<std::string> lines;
    for (std::string line; std::getline(in, line);) lines.push_back(line);
    return lines;
}

void HostTest::SetUp() {
    char root[] = "/tmp/hidl-XXXXXX";
    ASSERT_NE(mkdtemp(root), nullptr);
    mRoot = root;
    std::filesystem::create_directories(mRoot + "/dev/socket");
    setenv("HIDL_HOST_ROOT", root, 1);
}

void HostTest::TearDown() {
    unsetenv("HIDL_HOST_ROOT");
    std::filesystem::remove_all(mRoot);
}

void HostTest::write(const std::string& path, const std::string& text) const {
    const std::filesystem::path file = mRoot + "/" + path;
    std::filesystem::create_directories(file.parent_path());
    std::ofstream(file) << text;
}

void ServedTest::SetUp() {
    HostTest::SetUp();
    serve(kUsualServer);
}

void ServedTest::serve(const std::vector<std::string>& steps) {
    server = std::make_unique<ServerProcess>(steps);
    ASSERT_EQ(server->report(), "0");
    ASSERT_EQ(server->report(), "ready");
    service = IWifiService::tryGetService();
    ASSERT_NE(service, nullptr);
}

} // namespace vendor::korvan::bex::wifi::tests
