// Copyright 2026 The BEX Wi-Fi Authors
// SPDX-License-Identifier: Apache-2.0

// What the suites have in common whose driver is every module file of the family: how they come
// into being, and how they list those files.

#include "suites/Qca639xTestSuit.h"
#include "suites/Wcn6750TestSuit.h"
#include "tests/unit/Expect.h"

namespace vendor::korvan::bex::wifi::V1_0::implementation {
namespace {

constexpr const char* kBase = "wifi@1.0-VendorTestSuit";

struct Qca639x {
    using Suit = Qca639xTestSuit;
    static constexpr const char* kName = "Qca639xTestSuit";
    static constexpr const char* kTag = "wifi@1.0-Qca639xTestSuit.qca639x";
};

struct Wcn6750 {
    using Suit = Wcn6750TestSuit;
    static constexpr const char* kName = "Wcn6750TestSuit";
    static constexpr const char* kTag = "wifi@1.0-Wcn6750TestSuit.wcn6750";
};

template <typename Chip>
class DriverPathSuitsTest : public ::testing::Test {
  protected:
    const std::string mName = Chip::kName;
    const std::string mTag = Chip::kTag;
    RecordedShell mShell;
};

using Chips = ::testing::Types<Qca639x, Wcn6750>;
TYPED_TEST_SUITE(DriverPathSuitsTest, Chips);

TYPED_TEST(DriverPathSuitsTest, ListsItsDriver) {
    this->mShell.directory("/vendor/lib/modules", {".", "qca_cld3_b.ko", "x.ko", "qca_cld3_"});
    auto* suit = new typename TypeParam::Suit();
    EXPECT_THAT(suit->driverPaths,
                ElementsAre("/vendor/lib/modules/qca_cld3_b.ko", "/vendor/lib/modules/qca_cld3_"));
    delete static_cast<VendorTestSuit*>(suit);
    EXPECT_THAT(this->mShell.log(), ElementsAre(debug(kBase, "function at: VendorTestSuit"),
                                                error(this->mTag, "getDriverPaths: qca_cld3_b.ko"),
                                                error(this->mTag, "getDriverPaths: qca_cld3_"),
                                                debug(this->mTag, "function at: " + this->mName),
                                                debug(this->mTag, "function at: ~" + this->mName),
                                                debug(kBase, "function at: ~VendorTestSuit")));
}

TYPED_TEST(DriverPathSuitsTest, ComesIntoBeingWithoutADriver) {
    for (const bool exists : {false, true}) {
        if (exists) this->mShell.directory("/vendor/lib/modules", {"wlan.ko", "qca_cld3"});
        this->mShell.clear();
        const typename TypeParam::Suit suit;
        EXPECT_THAT(suit.driverPaths, IsEmpty());
        EXPECT_THAT(this->mShell.log(),
                    ElementsAre(debug(kBase, "function at: VendorTestSuit"),
                                error(this->mTag, "cannot find wlan driver : " + this->mName),
                                debug(this->mTag, "function at: " + this->mName)));
    }
}

TYPED_TEST(DriverPathSuitsTest, AnotherListingAddsItsFiles) {
    typename TypeParam::Suit suit;
    EXPECT_EQ(-1, suit.getDriverPaths());
    this->mShell.directory("/vendor/lib/modules", {"qca_cld3_b.ko"});
    EXPECT_EQ(0, suit.getDriverPaths());
    EXPECT_EQ(0, suit.getDriverPaths());
    EXPECT_EQ(2u, suit.driverPaths.size());
    // Every suite lists for itself.
    EXPECT_EQ(1u, typename TypeParam::Suit().driverPaths.size());
}

} // namespace
} // namespace vendor::korvan::bex::wifi::V1_0::implementation
