// Copyright 2026 The BEX Wi-Fi Authors
// SPDX-License-Identifier: Apache-2.0

// What a client sees of failures, its own and the server's.

#include <hidl/HidlTransportSupport.h>
#include <poll.h>
#include <signal.h>
#include <sys/socket.h>

#include <future>
#include <thread>

#include "tests/host/HostTest.h"

namespace vendor::korvan::bex::wifi::tests {
namespace {

using ::android::hardware::hidl_death_recipient;
using ::android::hidl::base::V1_0::IBase;

const std::string kDead = transportFailure("DEAD_OBJECT");

/** Collects the notices' cookies. */
class Recipient : public hidl_death_recipient {
  public:
    Recipient() {
        int ends[2];
        EXPECT_EQ(pipe2(ends, O_CLOEXEC), 0);
        mRead.reset(ends[0]);
        mWrite.reset(ends[1]);
    }
    void serviceDied(uint64_t cookie, const wp<IBase>& who) override {
        const uint64_t notice = who.promote() == nullptr ? 0 : cookie;
        EXPECT_EQ(write(mWrite.get(), &notice, sizeof(notice)),
                  static_cast<ssize_t>(sizeof(notice)));
    }
    /** The next notice's cookie, 0 when none comes in time. */
    uint64_t notice(int patienceMs = 60'000) {
        pollfd ready = {mRead.get(), POLLIN, 0};
        uint64_t cookie = 0;
        if (poll(&ready, 1, patienceMs) == 1 && read(mRead.get(), &cookie, sizeof(cookie)) < 0) {
            ADD_FAILURE();
        }
        return cookie;
    }

  private:
    android::base::unique_fd mRead;
    android::base::unique_fd mWrite;
};

class ClientTest : public ServedTest {
  protected:
    void killServer() {
        server->signal(SIGKILL);
        server->end();
    }
};
using ClientDeathTest = ClientTest;

TEST_F(ClientTest, NullCallback) {
    auto result = service->RunRxStop("wait", nullptr);
    EXPECT_FALSE(result.isOk());
    EXPECT_FALSE(result.isDeadObject());
    EXPECT_EQ(result.description(),
              "Status(EX_ILLEGAL_ARGUMENT): 'Null synchronous callback passed.'");
    EXPECT_EQ(call(service, "count"), "0");
}

TEST_F(ClientTest, SuccessHasADescription) {
    auto result = service->getWlanMode();
    EXPECT_TRUE(result.isOk());
    EXPECT_EQ(result.description(), "No error");
    result.assertOk();
    EXPECT_EQ(result.withDefault(-1), 5);
}

TEST_F(ClientDeathTest, FailureDroppedUnchecked) {
    killServer();
    EXPECT_DEATH(service->snifferStop(), "");
    EXPECT_DEATH(service->RunRxStop("x", [](const auto&) {}), "");
}

TEST_F(ClientDeathTest, FailureConverted) {
    killServer();
    EXPECT_DEATH((void)static_cast<int32_t>(service->snifferStop()), "");
    EXPECT_DEATH((void)static_cast<bool>(service->isSnifferMode()), "");
    EXPECT_DEATH(service->snifferStop().assertOk(), "");
}

TEST_F(ClientTest, FailureWithDefault) {
    killServer();
    EXPECT_EQ(service->snifferStop().withDefault(-7), -7);
    EXPECT_TRUE(service->isSnifferMode().withDefault(true));
}

TEST_F(ClientTest, FailureMovedIsCheckedOnce) {
    killServer();
    auto result = service->snifferStop();
    auto moved = std::move(result);
    EXPECT_TRUE(moved.isDeadObject());
}

TEST_F(ClientTest, ClientKilledInACall) {
    {
        ServerProcess client({"call", "wait"});
        EXPECT_EQ(server->report(), "entered");
        client.signal(SIGKILL);
        client.end();
    }
    server->openGate();
    EXPECT_EQ(server->report(), "leaving");
    EXPECT_EQ(call(service, "count"), "1");
}

TEST_F(ClientTest, ServerKilledBeforeACall) {
    killServer();
    EXPECT_EQ(call(service, "x"), kDead);
    EXPECT_FALSE(service->ping().isOk());
}

TEST_F(ClientTest, ServerKilledInACall) {
    auto result = std::async(std::launch::async, [&] { return call(service, "wait"); });
    ASSERT_EQ(server->report(), "entered");
    auto queued = std::async(std::launch::async, [&] { return call(service, "wait"); });
    ASSERT_EQ(server->report(), "entered");
    killServer();
    EXPECT_EQ(result.get(), kDead);
    EXPECT_EQ(queued.get(), kDead);
}

TEST_F(ClientTest, DeathIsNotified) {
    sp<Recipient> recipient = new Recipient;
    EXPECT_TRUE(service->linkToDeath(recipient, 7).withDefault(false));
    killServer();
    EXPECT_EQ(recipient->notice(), 7u);
    EXPECT_EQ(recipient->notice(0), 0u);
}

TEST_F(ClientTest, LinkedTwiceIsNotifiedTwice) {
    sp<Recipient> recipient = new Recipient;
    EXPECT_TRUE(service->linkToDeath(recipient, 7).withDefault(false));
    EXPECT_TRUE(service->linkToDeath(recipient, 8).withDefault(false));
    killServer();
    EXPECT_EQ(recipient->notice() + recipient->notice(), 15u);
}

TEST_F(ClientTest, DeathInACallIsNotifiedToo) {
    sp<Recipient> recipient = new Recipient;
    EXPECT_TRUE(service->linkToDeath(recipient, 7).withDefault(false));
    EXPECT_EQ(call(service, "never"), kDead);
    EXPECT_EQ(recipient->notice(), 7u);
}

TEST_F(ClientTest, UnlinkedIsNotNotified) {
    sp<Recipient> recipient = new Recipient;
    sp<Recipient> other = new Recipient;
    EXPECT_TRUE(service->linkToDeath(recipient, 7).withDefault(false));
    EXPECT_TRUE(service->linkToDeath(other, 8).withDefault(false));
    EXPECT_TRUE(service->unlinkToDeath(recipient).withDefault(false));
    EXPECT_FALSE(service->unlinkToDeath(recipient).withDefault(true));
    killServer();
    EXPECT_EQ(other->notice(), 8u);
    EXPECT_EQ(recipient->notice(0), 0u);
}

TEST_F(ClientTest, LinkAfterDeath) {
    sp<Recipient> recipient = new Recipient;
    killServer();
    EXPECT_TRUE(service->linkToDeath(recipient, 7).withDefault(false));
    EXPECT_EQ(recipient->notice(), 7u);
    EXPECT_FALSE(service->unlinkToDeath(recipient).withDefault(true));
}

TEST_F(ClientTest, LinkAfterACallFoundTheDeath) {
    sp<Recipient> recipient = new Recipient;
    killServer();
    EXPECT_EQ(call(service, "echo"), kDead);
    EXPECT_TRUE(service->linkToDeath(recipient, 7).withDefault(false));
    EXPECT_EQ(recipient->notice(), 7u);
}

TEST_F(ClientTest, LinkOfNull) {
    EXPECT_TRUE(service->linkToDeath(nullptr, 7).withDefault(false));
    sp<Recipient> recipient = new Recipient;
    EXPECT_TRUE(service->linkToDeath(recipient, 8).withDefault(false));
    killServer();
    EXPECT_EQ(recipient->notice(), 8u);
}

TEST_F(ClientTest, RecipientMayDropTheProxy) {
    struct Dropper : hidl_death_recipient {
        sp<IWifiService> proxy;
        std::promise<void> dropped;
        void serviceDied(uint64_t, const wp<IBase>&) override {
            proxy.clear();
            dropped.set_value();
        }
    };
    sp<Dropper> dropper = new Dropper;
    dropper->proxy = service;
    EXPECT_TRUE(service->linkToDeath(dropper, 0).withDefault(false));
    service.clear();
    killServer();
    EXPECT_EQ(dropper->dropped.get_future().wait_for(std::chrono::seconds(60)),
              std::future_status::ready);
}

TEST_F(ClientTest, DeadForEver) {
    killServer();
    ServerProcess next(kUsualServer, 6);
    ASSERT_EQ(next.report(), "0");
    EXPECT_EQ(call(service, "x"), kDead);
    EXPECT_EQ(call(service, "x"), kDead);
    sp<IWifiService> anew = IWifiService::tryGetService();
    ASSERT_NE(anew, nullptr);
    EXPECT_EQ(anew->getWlanMode().withDefault(-1), 6);
}

TEST_F(ClientTest, OldProxyKeepsItsServer) {
    ServerProcess next(kUsualServer, 6);
    ASSERT_EQ(next.report(), "0");
    EXPECT_EQ(service->getWlanMode().withDefault(-1), 5);
    // More threads than connections: none may go to the other server.
    std::vector<std::future<int32_t>> answers;
    for (int i = 0; i < 8; ++i) {
        answers.push_back(std::async(std::launch::async,
                                     [&] { return service->getWlanMode().withDefault(-1); }));
    }
    for (auto& answer : answers) EXPECT_EQ(answer.get(), 5);
    EXPECT_EQ(IWifiService::tryGetService()->getWlanMode().withDefault(-1), 6);
}

TEST_F(ClientTest, CastFromAsksTheServer) {
    sp<IBase> base = service;
    sp<IWifiService> cast = IWifiService::castFrom(base);
    ASSERT_NE(cast, nullptr);
    EXPECT_TRUE(cast->isRemote());
    EXPECT_EQ(cast->getWlanMode().withDefault(-1), 5);
    killServer();
    auto quiet = IWifiService::castFrom(base);
    EXPECT_TRUE(quiet.isOk());
    EXPECT_EQ(sp<IWifiService>(quiet), nullptr);
    auto loud = IWifiService::castFrom(base, true);
    EXPECT_EQ(loud.description(), kDead);
    EXPECT_FALSE(loud.isOk());
}

TEST_F(ClientTest, CastFromNull) {
    sp<IBase> nothing;
    EXPECT_EQ(sp<IWifiService>(IWifiService::castFrom(nothing)), nullptr);
}

} // namespace
} // namespace vendor::korvan::bex::wifi::tests
