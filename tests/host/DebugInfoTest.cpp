// Copyright 2026 The BEX Wi-Fi Authors
// SPDX-License-Identifier: Apache-2.0

// What an object tells of itself.

#include <hidl/HidlTransportSupport.h>

#include "tests/host/HostTest.h"

namespace vendor::korvan::bex::wifi::tests {
namespace {

using ::android::hidl::base::V1_0::DebugInfo;

class DebugInfoTest : public ServedTest {};

TEST_F(DebugInfoTest, NothingPrivate) {
    DebugInfo seen = {};
    ASSERT_TRUE(service->getDebugInfo([&](const DebugInfo& info) { seen = info; }).isOk());
    EXPECT_EQ(seen.pid, -1);
    EXPECT_EQ(seen.ptr, 0u);
    EXPECT_EQ(seen.arch, DebugInfo::Architecture::IS_64BIT);
    EXPECT_EQ(static_cast<int32_t>(seen.arch), 1);
}

TEST_F(DebugInfoTest, Chain) {
    std::vector<std::string> names;
    ASSERT_TRUE(service->interfaceChain([&](const auto& chain) {
                           for (const auto& name : chain) names.push_back(name);
                       })
                        .isOk());
    EXPECT_EQ(names, (std::vector<std::string>{"vendor.korvan.bex.wifi@1.0::IWifiService",
                                               "android.hidl.base@1.0::IBase"}));
    std::string descriptor;
    ASSERT_TRUE(service->interfaceDescriptor([&](const auto& name) { descriptor = name; }).isOk());
    EXPECT_EQ(descriptor, IWifiService::descriptor);
}

// The interface is frozen in current.txt, so its hash is there.
TEST_F(DebugInfoTest, Hashes) {
    std::vector<std::array<uint8_t, 32>> hashes;
    ASSERT_TRUE(service->getHashChain([&](const auto& chain) {
                           for (const auto& hash : chain) {
                               hashes.emplace_back();
                               std::copy(hash.data(), hash.data() + 32, hashes.back().begin());
                           }
                       })
                        .isOk());
    ASSERT_EQ(hashes.size(), 2u);
    EXPECT_NE(hashes[0], (std::array<uint8_t, 32>{}));
    EXPECT_NE(hashes[1], (std::array<uint8_t, 32>{}));
    EXPECT_NE(hashes[0], hashes[1]);
}

TEST_F(DebugInfoTest, TheOtherBaseMethods) {
    EXPECT_TRUE(service->notifySyspropsChanged().isOk());
    EXPECT_TRUE(service->debug(nullptr, {"--help", "x"}).isOk());
    native_handle_t* handle = native_handle_create(0, 1);
    auto refused = service->debug(handle, {});
    EXPECT_EQ(refused.description(), transportFailure("FDS_NOT_ALLOWED"));
    EXPECT_FALSE(refused.isOk());
    native_handle_delete(handle);
}

} // namespace
} // namespace vendor::korvan::bex::wifi::tests
