// Copyright 2026 The BEX Wi-Fi Authors
// SPDX-License-Identifier: Apache-2.0

// What the suites have in common whose driver is one module file: how they come into being, and how
// they look for that file.

#include "suites/QcaTestSuit.h"
#include "suites/Wcn39xxTestSuit.h"
#include "suites/WcnTestSuit.h"
#include "tests/unit/Expect.h"

namespace vendor::korvan::bex::wifi::V1_0::implementation {
namespace {

struct Qca {
    using Suit = QcaTestSuit;
    static constexpr const char* kName = "QcaTestSuit";
    static constexpr const char* kTag = "wifi@1.0-QcaTestSuit-qca";
};

struct Wcn {
    using Suit = WcnTestSuit;
    static constexpr const char* kName = "WcnTestSuit";
    static constexpr const char* kTag = "wifi@1.0-WcnTestSuit.wcn";
};

struct Wcn39xx {
    using Suit = Wcn39xxTestSuit;
    static constexpr const char* kName = "Wcn39xxTestSuit";
    static constexpr const char* kTag = "wifi@1.0-Wcn39xxTestSuit.wcn39xx";
};

template <typename Chip>
class FirmwarePathSuitsDeathTest : public ::testing::Test {
  protected:
    using Suit = typename Chip::Suit;

    /** The line of an operation that loads the driver. */
    static std::string load(RecordedShell& shell, VendorTestSuit& suit) {
        shell.clear();
        suit.RunTxAxStart("", "", "", "", "", "");
        return shell.lines().at(2);
    }
};

using Chips = ::testing::Types<Qca, Wcn, Wcn39xx>;
TYPED_TEST_SUITE(FirmwarePathSuitsDeathTest, Chips);

TYPED_TEST(FirmwarePathSuitsDeathTest, LogsItsLife) {
    inFreshProcess([] {
        RecordedShell shell;
        shell.readable("/vendor/lib/modules/wlan.ko");
        delete static_cast<VendorTestSuit*>(new typename TypeParam::Suit());
        const std::string base = "wifi@1.0-VendorTestSuit";
        const std::string name = TypeParam::kName;
        EXPECT_THAT(shell.log(), ElementsAre(debug(base, "function at: VendorTestSuit"),
                                             debug(TypeParam::kTag, "function at: " + name),
                                             debug(TypeParam::kTag, "function at: ~" + name),
                                             debug(base, "function at: ~VendorTestSuit")));
    });
}

TYPED_TEST(FirmwarePathSuitsDeathTest, WorksWithoutADriver) {
    inFreshProcess([] {
        RecordedShell shell;
        typename TypeParam::Suit suit;
        const std::string name = TypeParam::kName;
        EXPECT_THAT(shell.log(),
                    ElementsAre(debug("wifi@1.0-VendorTestSuit", "function at: VendorTestSuit"),
                                error(TypeParam::kTag, "getFwPath cannot find out FwPath"),
                                error(TypeParam::kTag, "cannot find wlan driver : " + name),
                                debug(TypeParam::kTag, "function at: " + name)));

        // The missing path ends the line, so the parameter after it is lost too.
        const std::string insmod = name == "Wcn39xxTestSuit" ? "/vendor/bin/insmod " : "insmod ";
        EXPECT_EQ(insmod, TestFixture::load(shell, suit));
    });
}

TYPED_TEST(FirmwarePathSuitsDeathTest, FindsTheDriverOnceForAllSuits) {
    inFreshProcess([] {
        RecordedShell shell;
        {
            // Nothing to find yet: the next one looks again.
            const typename TypeParam::Suit suit;
        }
        EXPECT_EQ(5u, shell.probed().size());
        shell.clear();
        shell.readable("/system/lib/modules/wlan.ko");
        shell.readable("/vendor/lib/modules/qca_cld3_wlan.ko");
        { const typename TypeParam::Suit suit; }
        EXPECT_THAT(shell.probed(), ElementsAre("/system/lib/modules/wlan.ko"));
        shell.clear();
        shell.unreadable("/system/lib/modules/wlan.ko");
        typename TypeParam::Suit suit;
        EXPECT_THAT(shell.probed(), IsEmpty());
        EXPECT_NE(std::string::npos,
                  TestFixture::load(shell, suit).find("insmod /system/lib/modules/wlan.ko "));
    });
}

TYPED_TEST(FirmwarePathSuitsDeathTest, AnotherSearchMayFindAnotherDriver) {
    inFreshProcess([] {
        RecordedShell shell;
        shell.readable("/system/lib/modules/wlan.ko");
        typename TypeParam::Suit suit;
        shell.unreadable("/system/lib/modules/wlan.ko");
        EXPECT_EQ(-1, suit.getFwPath());
        EXPECT_NE(std::string::npos,
                  TestFixture::load(shell, suit).find("insmod /system/lib/modules/wlan.ko "));
        shell.readable("/vendor/lib/modules/qca_cld3/qca_cld3_wlan.ko");
        EXPECT_EQ(0, suit.getFwPath());
        EXPECT_NE(std::string::npos,
                  TestFixture::load(shell, suit)
                          .find("insmod /vendor/lib/modules/qca_cld3/qca_cld3_wlan.ko "));
    });
}

TYPED_TEST(FirmwarePathSuitsDeathTest, EachClassFindsItsOwnDriver) {
    inFreshProcess([] {
        RecordedShell shell;
        shell.readable("/system/lib/modules/wlan.ko");
        const typename TypeParam::Suit suit;
        shell.clear();
        const QcaTestSuit qca;
        const WcnTestSuit wcn;
        const Wcn39xxTestSuit wcn39xx;
        EXPECT_THAT(shell.probed(),
                    ElementsAre("/system/lib/modules/wlan.ko", "/system/lib/modules/wlan.ko"));
    });
}

} // namespace
} // namespace vendor::korvan::bex::wifi::V1_0::implementation
