// The tuning's gain code and gain factor: grey levels per step of the DC, in hundredths.
#include <gtest/gtest.h>

#include "TuneTestSupport.h"

namespace {

using namespace fpnavi;
using namespace fpnavi_test;

TEST(PackGainCode, FourFieldsFromTheLowestUp) {
    EXPECT_EQ(PackGainCode(0, 0x00000005U), 0x0005U);
    EXPECT_EQ(PackGainCode(0, 0x00000500U), 0x0050U);
    EXPECT_EQ(PackGainCode(0x00000500U, 0), 0x0500U);
    EXPECT_EQ(PackGainCode(0x00050000U, 0), 0x5000U);
    EXPECT_EQ(PackGainCode(kRefGain20, kRefGain2C), 0x2712U);
}

TEST(PackGainCode, AllOtherBitsAreIgnored) {
    EXPECT_EQ(PackGainCode(0xFFF0F0FFU, 0xFFFFF0F0U), 0U);
    EXPECT_EQ(PackGainCode(0xFFFFFFFFU, 0xFFFFFFFFU), 0xFFFFU);
}

class GainFactor : public NaviTest {
  protected:
    void SetUp() override { Params().Apply(); }
    void TearDown() override { Params().Apply(); }
};

TEST_F(GainFactor, ReferenceGainHasTheReferenceFactor) {
    EXPECT_EQ(_NAVI_K_CALC(0x2712), 374);
    Params().Set("_NAVI_INPUT_K", 1000).Apply();
    EXPECT_EQ(_NAVI_K_CALC(0x2712), 1000);
    Params().Set("_NAVI_INPUT_K", 1000).Set("_NAVI_GAIN_REF", 0x7777).Apply();
    EXPECT_EQ(_NAVI_K_CALC(0x7777), 1000);
}

TEST_F(GainFactor, EveryTableEntryCounts) {
    // 374 * ratio * 3 * 2 / 240 = 374 * ratio / 40; 374 * 40 * ratio * ratio / 240.
    const int32_t ratio21[] = {10, 20, 40, 56, 70, 80, 112, 140};
    for (uint32_t field = 0; field < 8; ++field) {
        EXPECT_EQ(_NAVI_K_CALC((field << 12) | 0x012), 374 * ratio21[field] / 40);
        const auto ratio43 = static_cast<int32_t>(field) + 1;
        EXPECT_EQ(_NAVI_K_CALC(0x2010 | field), 374 * 40 * ratio43 * 2 / 240);
        EXPECT_EQ(_NAVI_K_CALC(0x2002 | (field << 4)), 374 * 40 * 3 * ratio43 / 240);
    }
}

TEST_F(GainFactor, LeastAndGreatest) {
    EXPECT_EQ(_NAVI_K_CALC(0x0000), 15);     // 3740 / 240 = 15.58
    EXPECT_EQ(_NAVI_K_CALC(0x7077), 13962);  // 374 * 140 * 64 / 240 = 13962.67
}

TEST_F(GainFactor, Bits8To11TakeNoPart) {
    for (uint32_t field = 0; field < 16; ++field) {
        EXPECT_EQ(_NAVI_K_CALC(0x2012 | (field << 8)), 374);
        EXPECT_TRUE(GainCodesUsable(0x2012 | (field << 8)));
    }
}

TEST_F(GainFactor, FieldsAbove7AreUnusable) {
    for (uint32_t field = 8; field < 16; ++field) {
        EXPECT_FALSE(GainCodesUsable(0x2710 | field));
        EXPECT_FALSE(GainCodesUsable(0x2702 | (field << 4)));
        EXPECT_FALSE(GainCodesUsable(0x0712 | (field << 12)));
    }
    EXPECT_TRUE(GainCodesUsable(0x7F77));
}

TEST_F(GainFactor, ReferenceCodeIsHeldToTheSameRule) {
    for (const int32_t code : {0x2718, 0x2782, 0x8712, -1}) {
        Params().Set("_NAVI_GAIN_REF", code).Apply();
        EXPECT_FALSE(GainCodesUsable(0x2712)) << code;
        EXPECT_FALSE(GainCodesUsable(static_cast<uint32_t>(code))) << "both " << code;
    }
    Params().Set("_NAVI_GAIN_REF", 0x2F12).Apply();
    EXPECT_TRUE(GainCodesUsable(0x2712));
}

}  // namespace
