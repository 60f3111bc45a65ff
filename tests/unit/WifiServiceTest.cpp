// Copyright 2026 The BEX Wi-Fi Authors
// SPDX-License-Identifier: Apache-2.0

#include <android-base/properties.h>

#include <functional>
#include <ostream>
#include <typeinfo>

#include "service/WifiService.h"
#include "suites/BrcmTestSuit.h"
#include "suites/Wcn39xxTestSuit.h"
#include "tests/unit/Expect.h"

namespace vendor::korvan::bex::wifi::V1_0::implementation {
namespace {

using ::android::sp;
using ::android::base::SetProperty;

constexpr const char* kLifeTag = "wifi@1.0-runCmdWithReturn";

/** A phone by its properties; unset again at the end. */
struct Phone {
    Phone(const std::string& vendor, const std::string& chip) {
        SetProperty("ro.hardware.wlan.vendor", vendor);
        SetProperty("ro.hardware.wlan.chip", chip);
    }
    ~Phone() {
        for (const char* name : {"vendor", "chip", "mimo"}) {
            SetProperty(std::string("ro.hardware.wlan.") + name, "");
        }
    }

    RecordedShell shell;
};

TEST(WifiServiceChoiceTest, BroadcomPhonesGetTheBroadcomSuite) {
    for (const char* chip : {"", "bcm4375", "QCA6174"}) {
        const Phone phone("broadcom", chip);
        const sp<WifiService> service = new WifiService();
        ASSERT_NE(nullptr, vendorTestSuit);
        EXPECT_EQ(typeid(BrcmTestSuit), typeid(*vendorTestSuit));
        ASSERT_NE(nullptr, snifferTool);
        EXPECT_EQ(typeid(SnifferTool), typeid(*snifferTool));
        EXPECT_EQ("broadcom", service->getWifiVendor());
        EXPECT_EQ(chip, service->getWifiChip());
    }
}

TEST(WifiServiceChoiceTest, QualcommPhonesGetTheSuiteOfTheirChip) {
    Phone phone("qcom", "wcn6750");
    { const sp<WifiService> service = new WifiService(); }
    EXPECT_EQ(nullptr, vendorTestSuit);
    EXPECT_EQ(nullptr, snifferTool);
    const std::string tag = "wifi@1.0-Wcn6750TestSuit.wcn6750";
    EXPECT_THAT(phone.shell.log(),
                ElementsAre(debug("wifi@1.0-VendorTestSuit", "function at: VendorTestSuit"),
                            error(tag, "cannot find wlan driver : Wcn6750TestSuit"),
                            debug(tag, "function at: Wcn6750TestSuit"),
                            debug("wifi@1.0-SnifferTool", "SnifferTool "),
                            debug(kLifeTag, "function at: WifiService"),
                            debug(tag, "function at: ~Wcn6750TestSuit"),
                            debug("wifi@1.0-VendorTestSuit", "function at: ~VendorTestSuit"),
                            debug("wifi@1.0-SnifferTool", "~SnifferTool "),
                            debug(kLifeTag, "function at: ~WifiService")));
}

TEST(WifiServiceChoiceTest, AQualcommPhoneWithoutChipNameGetsASuiteToo) {
    const Phone phone("qcom", "");
    const sp<WifiService> service = new WifiService();
    ASSERT_NE(nullptr, vendorTestSuit);
    EXPECT_EQ(typeid(Wcn39xxTestSuit), typeid(*vendorTestSuit));
    ASSERT_NE(nullptr, snifferTool);
    EXPECT_EQ(typeid(SnifferTool), typeid(*snifferTool));
}

TEST(WifiServiceChoiceTest, UnknownVendorsGetNothing) {
    for (const char* vendor : {"", "Broadcom", "broadcom ", "qcom ", "Qcom", "other"}) {
        Phone phone(vendor, "bcm4375");
        {
            const sp<WifiService> service = new WifiService();
            EXPECT_EQ(nullptr, vendorTestSuit) << vendor;
            EXPECT_EQ(nullptr, snifferTool) << vendor;
        }
        EXPECT_THAT(phone.shell.log(),
                    ElementsAre(error(kLifeTag, "func : WifiService, vendorTestSuit is nullptr!"),
                                error(kLifeTag, "func : WifiService, snifferTool is nullptr!"),
                                debug(kLifeTag, "function at: WifiService"),
                                debug(kLifeTag, "function at: ~WifiService")))
                << vendor;
    }
}

TEST(WifiServiceChoiceTest, MakesAndDeletesTheSuiteBeforeTheSniffer) {
    Phone phone("broadcom", "");
    { const sp<WifiService> service = new WifiService(); }
    EXPECT_EQ(nullptr, vendorTestSuit);
    EXPECT_EQ(nullptr, snifferTool);
    EXPECT_THAT(phone.shell.log(),
                ElementsAre(debug("wifi@1.0-VendorTestSuit", "function at: VendorTestSuit"),
                            debug("wifi@1.0-BrcmTestSuit-brcm", "function at: BrcmTestSuit"),
                            debug("wifi@1.0-SnifferTool", "SnifferTool "),
                            debug(kLifeTag, "function at: WifiService"),
                            debug("wifi@1.0-BrcmTestSuit-brcm", "function at: ~BrcmTestSuit"),
                            debug("wifi@1.0-VendorTestSuit", "function at: ~VendorTestSuit"),
                            debug("wifi@1.0-SnifferTool", "~SnifferTool "),
                            debug(kLifeTag, "function at: ~WifiService")));
}

/** Writes down what reaches the suite, and answers as told. */
class FakeSuit : public VendorTestSuit {
  public:
    using S = const std::string&;
    int RunTxBGStart(S a, S b, S c, S d) override { return note({"RunTxBGStart", a, b, c, d}); }
    int RunTxNStart(S a, S b, S c, S d, bool vht, S e) override {
        return note({"RunTxNStart", a, b, c, d, vht ? "true" : "false", e});
    }
    int RunTxAxStart(S a, S b, S c, S d, S e, S f) override {
        return note({"RunTxAxStart", a, b, c, d, e, f});
    }
    int RunTxStStart(S a, S b, S c) override { return note({"RunTxStStart", a, b, c}); }
    int RunTxStStop(S a) override { return note({"RunTxStStop", a}); }
    int RunTxStop(S a) override { return note({"RunTxStop", a}); }
    int RunRxApJoinHoc(S a, S b) override { return note({"RunRxApJoinHoc", a, b}); }
    int RunRxBgStart(S a, S b, S c, std::string& out) override {
        out += mOut;
        return note({"RunRxBgStart", a, b, c});
    }
    int RunRxNStart(std::string a, S b, S c, bool vht, S d, std::string& out) override {
        out += mOut;
        return note({"RunRxNStart", a, b, c, vht ? "true" : "false", d});
    }
    int RunRxAxStart(S a, S b, S c, S d, std::string& out) override {
        out += mOut;
        return note({"RunRxAxStart", a, b, c, d});
    }
    int RunRxStop(S a, std::string& out) override {
        out += mOut;
        return note({"RunRxStop", a});
    }

    std::vector<std::string> mCall;
    int mStatus = 0;
    std::string mOut;

  private:
    int note(std::vector<std::string> call) {
        mCall = std::move(call);
        return mStatus;
    }
};

class WifiServiceTest : public ::testing::Test {
  protected:
    WifiServiceTest() : mPhone("broadcom", ""), mService(new WifiService()) {
        delete vendorTestSuit;
        vendorTestSuit = mSuit = new FakeSuit();
        mPhone.shell.clear();
    }

    Phone mPhone;
    sp<IWifiService> mService;
    FakeSuit* mSuit;
};

// clang-format off

TEST_F(WifiServiceTest, HandsTransmissionsToTheSuite) {
    mSuit->mStatus = -1;
    EXPECT_EQ(-1, static_cast<int32_t>(mService->RunTxBGStart("1", "2", "3", "4")));
    EXPECT_THAT(mSuit->mCall, ElementsAre("RunTxBGStart", "1", "2", "3", "4"));
    EXPECT_EQ(-1, static_cast<int32_t>(mService->RunTxNStart("1", "2", "3", "4", true, "5")));
    EXPECT_THAT(mSuit->mCall, ElementsAre("RunTxNStart", "1", "2", "3", "4", "true", "5"));
    EXPECT_EQ(-1, static_cast<int32_t>(mService->RunTxAxStart("1", "2", "3", "4", "5", "6")));
    EXPECT_THAT(mSuit->mCall, ElementsAre("RunTxAxStart", "1", "2", "3", "4", "5", "6"));
    EXPECT_EQ(-1, static_cast<int32_t>(mService->RunTxStop("1")));
    EXPECT_THAT(mSuit->mCall, ElementsAre("RunTxStop", "1"));
    mSuit->mStatus = 0;
    EXPECT_EQ(0, static_cast<int32_t>(mService->RunTxStStart("1", "2", "3")));
    EXPECT_THAT(mSuit->mCall, ElementsAre("RunTxStStart", "1", "2", "3"));
    EXPECT_EQ(0, static_cast<int32_t>(mService->RunTxStStop("1")));
    EXPECT_THAT(mSuit->mCall, ElementsAre("RunTxStStop", "1"));
    EXPECT_EQ(0, static_cast<int32_t>(mService->RunRxApJoinHoc("1", "2")));
    EXPECT_THAT(mSuit->mCall, ElementsAre("RunRxApJoinHoc", "1", "2"));
    EXPECT_THAT(mPhone.shell.log(), IsEmpty());
}

// clang-format on

/** One reception method: its name, the call and what reaches the suite. */
struct Reception {
    const char* name;
    std::function<void(IWifiService&, std::function<void(const hidl_string&)>)> call;
    std::vector<std::string> arrives;
};

/** Names the method where GoogleTest shows the parameter. */
void PrintTo(const Reception& reception, std::ostream* stream) {
    *stream << reception.name;
}

class WifiServiceReceptionTest : public WifiServiceTest,
                                 public ::testing::WithParamInterface<Reception> {
  protected:
    /** Makes the call and returns each text that came back. */
    std::vector<std::string> receive() {
        std::vector<std::string> texts;
        GetParam().call(*mService, [&](const hidl_string& text) { texts.push_back(text); });
        return texts;
    }
};

TEST_P(WifiServiceReceptionTest, HandsTheTextBackOnce) {
    mSuit->mOut = "12";
    EXPECT_THAT(receive(), ElementsAre("12"));
    EXPECT_EQ(GetParam().arrives, mSuit->mCall);
    EXPECT_THAT(mPhone.shell.log(), IsEmpty());
}

TEST_P(WifiServiceReceptionTest, LogsAFailureAndAnswersAllTheSame) {
    mSuit->mStatus = -1;
    EXPECT_THAT(receive(), ElementsAre(""));
    EXPECT_THAT(mPhone.shell.log(),
                ElementsAre(
                        error("wifi@1.0-impl", std::string("function at: ") + GetParam().name)));
}

TEST_P(WifiServiceReceptionTest, KeepsEveryByteOfTheText) {
    mSuit->mOut = std::string("a\0\xff\n", 4);
    EXPECT_THAT(receive(), ElementsAre(mSuit->mOut));
}

TEST_P(WifiServiceReceptionTest, ThrowsOnAnEmptyCallback) {
    EXPECT_THROW(GetParam().call(*mService, nullptr), std::bad_function_call);
}

INSTANTIATE_TEST_SUITE_P(
        All, WifiServiceReceptionTest,
        ::testing::Values(
                Reception{"RunRxBgStart",
                          [](auto& s, auto cb) { (void)s.RunRxBgStart("1", "2", "3", cb); },
                          {"RunRxBgStart", "1", "2", "3"}},
                Reception{"RunRxNStart",
                          [](auto& s, auto cb) {
                              (void)s.RunRxNStart("1", "2", "3", true, "4", cb);
                          },
                          {"RunRxNStart", "1", "2", "3", "true", "4"}},
                Reception{"RunRxAxStart",
                          [](auto& s, auto cb) { (void)s.RunRxAxStart("1", "2", "3", "4", cb); },
                          {"RunRxAxStart", "1", "2", "3", "4"}},
                Reception{"RunRxStop",
                          [](auto& s, auto cb) { (void)s.RunRxStop("1", cb); },
                          {"RunRxStop", "1"}}),
        [](const auto& reception) { return std::string(reception.param.name); });

TEST_F(WifiServiceTest, ArgumentsArriveByteForByte) {
    const std::string odd("a b\"$(x)\0\xff\n", 11);
    EXPECT_EQ(0, static_cast<int32_t>(mService->RunRxApJoinHoc(odd, "")));
    EXPECT_THAT(mSuit->mCall, ElementsAre("RunRxApJoinHoc", odd, ""));
}

TEST_F(WifiServiceTest, HandsTheSnifferCallsToTheSniffer) {
    RecordedShell& shell = mPhone.shell;
    EXPECT_EQ(0, static_cast<int32_t>(mService->snifferStart("36", "40")));
    EXPECT_EQ("/vendor/bin/iw wlan0 set channel 36 HT40+ ", shell.lines().at(3));
    shell.clear();
    shell.answer("ifconfig", failing());
    EXPECT_EQ(-1, static_cast<int32_t>(mService->snifferStop()));
    EXPECT_EQ("setprop vendor.hardware.wlan.runsniffer stop ", shell.lines().at(0));
    shell.answer("con_mode", {"5\n"});
    EXPECT_EQ(5, static_cast<int32_t>(mService->getWlanMode()));
    EXPECT_FALSE(static_cast<bool>(mService->isSnifferMode()));
    shell.answer("con_mode", {"4\n"});
    EXPECT_TRUE(static_cast<bool>(mService->isSnifferMode()));
}

TEST_F(WifiServiceTest, DeclaresMimoWhenThePropertyReadsOne) {
    for (const char* value : {"", "0", "2", "01", "1 ", " 1", "true", "11"}) {
        SetProperty("ro.hardware.wlan.mimo", value);
        EXPECT_FALSE(static_cast<bool>(mService->isMimoSupport())) << value;
    }
    SetProperty("ro.hardware.wlan.mimo", "1");
    EXPECT_TRUE(static_cast<bool>(mService->isMimoSupport()));
    EXPECT_THAT(mPhone.shell.lines(), IsEmpty());
}

} // namespace
} // namespace vendor::korvan::bex::wifi::V1_0::implementation
