// Copyright 2026 The BEX Wi-Fi Authors
// SPDX-License-Identifier: Apache-2.0

// What a client learns of the object before it calls a method of ours.

#include <android/hidl/base/1.0/IBase.h>

#include <algorithm>
#include <array>

#include "tests/target/DisruptiveWifiTest.h"
#include "tests/target/Watchdog.h"

namespace vendor::korvan::bex::wifi::target {
namespace {

using ::android::sp;
using ::android::wp;
using ::android::hardware::hidl_array;
using ::android::hardware::hidl_death_recipient;
using ::android::hardware::hidl_vec;
using ::android::hidl::base::V1_0::IBase;

class Recipient : public hidl_death_recipient {
    void serviceDied(uint64_t, const wp<IBase>&) override {}
};

TEST_P(DisruptiveWifiTest, IsTheInterfaceThatItSays) {
    const Watchdog watchdog("the object's description");
    std::string descriptor;
    EXPECT_TRUE(
            wifi->interfaceDescriptor([&](const hidl_string& name) { descriptor = name; }).isOk());
    EXPECT_EQ(descriptor, IWifiService::descriptor);

    std::vector<std::string> chain;
    EXPECT_TRUE(wifi->interfaceChain([&](const hidl_vec<hidl_string>& names) {
                        for (const hidl_string& name : names) chain.push_back(name);
                    }).isOk());
    const std::vector<std::string> expected = {IWifiService::descriptor, IBase::descriptor};
    EXPECT_EQ(chain, expected);
}

// The hash of an interface that was never frozen is all zeros.
TEST_P(DisruptiveWifiTest, ServesAFrozenInterface) {
    const Watchdog watchdog("getHashChain()");
    size_t hashes = 0;
    bool frozen = false;
    EXPECT_TRUE(wifi->getHashChain([&](const hidl_vec<hidl_array<uint8_t, 32>>& chain) {
                        hashes = chain.size();
                        if (hashes == 0) return;
                        const uint8_t* first = chain[0].data();
                        frozen = std::any_of(first, first + 32, [](uint8_t b) { return b != 0; });
                    }).isOk());
    EXPECT_EQ(hashes, 2u); // the interface's own and its base's
    EXPECT_TRUE(frozen);
}

TEST_P(DisruptiveWifiTest, TellsOfItsDeathWhoWantsToKnow) {
    const Watchdog watchdog("linkToDeath()");
    const sp<Recipient> recipient = new Recipient;
    const Return<bool> linked = wifi->linkToDeath(recipient, 1);
    ASSERT_TRUE(linked.isOk()) << linked.description();
    EXPECT_TRUE(linked);
    const Return<bool> unlinked = wifi->unlinkToDeath(recipient);
    ASSERT_TRUE(unlinked.isOk()) << unlinked.description();
    EXPECT_TRUE(unlinked);
}

} // namespace
} // namespace vendor::korvan::bex::wifi::target
