// One call of _NAVI_Tune: arguments, register layouts, measurement and classification. Frames that
// cannot be measured stand in TuneUnusableTest, runs over several calls in TuneRunsTest.
#include <gtest/gtest.h>

#include <limits>
#include <vector>

#include "TuneTestSupport.h"
#include "tuning/Tune.h"

namespace {

using namespace fpnavi;
using namespace fpnavi_test;

class Tune : public AfterARun {};

TEST_F(Tune, NullPointerFailsAndChangesNothing) {
    const std::vector<uint8_t> frame = Flat(230);
    uint32_t dac = 200;
    const uint32_t gain20 = kRefGain20;
    const uint32_t gain2C = kRefGain2C;
    const std::vector<uint32_t> before = TuneState();
    for (const int32_t mode : {0, 1}) {
        Params().Set("s_modeFlag", mode).Apply();
        EXPECT_EQ(_NAVI_Tune(nullptr, 56, 36, &dac, &gain20, &gain2C), -1);
        EXPECT_EQ(_NAVI_Tune(frame.data(), 56, 36, nullptr, &gain20, &gain2C), -1);
        EXPECT_EQ(_NAVI_Tune(frame.data(), 56, 36, &dac, nullptr, &gain2C), -1);
        EXPECT_EQ(_NAVI_Tune(frame.data(), 56, 36, &dac, &gain20, nullptr), -1);
    }
    EXPECT_EQ(dac, 200U);
    EXPECT_EQ(TuneState(), before);
    EXPECT_EQ(s_tuneOkFlag, 1);
}

TEST_F(Tune, HgModeIsDoneAtOnceAndChangesNothing) {
    Params().Set("s_modeFlag", 1).Apply();
    const std::vector<uint32_t> before = TuneState();
    FpNaviClear();
    Registers registers;
    registers.dac = 0x12345650;
    EXPECT_EQ(registers.Tune(Flat(230)), 1);
    EXPECT_EQ(registers.dac, 0x12345650U);
    EXPECT_EQ(_NAVI_TimeOut, 0);
    EXPECT_EQ(TuneState(), before);
    EXPECT_EQ(s_tuneOkFlag, 0);
}

TEST_F(Tune, GivenSizeIsNotUsed) {
    const std::vector<uint8_t> frame = Flat(230);
    const int32_t least = std::numeric_limits<int32_t>::min();
    for (const int32_t size : {0, -1, 7, 100000, least}) {
        uint32_t dac = 200;
        const uint32_t gain20 = kRefGain20;
        const uint32_t gain2C = kRefGain2C;
        _NAVI_Tune(frame.data(), size, size, &dac, &gain20, &gain2C);
        EXPECT_EQ(dac, 187U);
        EXPECT_EQ(sImgSizeInfo.iHeight, 36);
        EXPECT_EQ(sImgSizeInfo.iWidth, 56);
    }
}

TEST_F(Tune, LowByteBelowTheReferenceIsResetAndTheUpperBitsKept) {
    Registers registers;
    registers.dac = 0x12345650;
    EXPECT_EQ(registers.Tune(Flat(180)), 0);
    EXPECT_EQ(registers.dac, 0x123456BFU);  // (128 + 255) / 2 = 191
    EXPECT_EQ(_NAVI_NoMoreProcess, 2U);
    EXPECT_EQ(_NAVI_dc_current, 191U);
    EXPECT_EQ(_NAVI_dc_residual, 0x12345600U);
    EXPECT_EQ(s_tuneOkFlag, 0);
}

TEST_F(Tune, DifferenceBelowTheReferenceIsReset) {
    Params().Set("iDCMode", 0).Apply();
    // Differences of byte 1 and byte 0: 0, 127, and below 0.
    for (const uint32_t start : {0U, 0xFFFFFFFFU, 0xABCD7F00U, 0x12340001U, 0xFFFF00FFU}) {
        Registers registers;
        registers.dac = start;
        EXPECT_EQ(registers.Tune(Flat(180)), 0);
        EXPECT_EQ(registers.dac, 0xFF40FF40U);
        EXPECT_EQ(_NAVI_NoMoreProcess, 2U);
        EXPECT_EQ(_NAVI_dc_current, 191U);
    }
}

TEST_F(Tune, ResetMeasuresNothingAndTestsNoCompletion) {
    Params().Set("_NAVI_TimeOut_threshold", 1).Apply();
    const std::vector<uint32_t> before = TuneState();
    Registers registers;
    registers.dac = 127;
    EXPECT_EQ(registers.Tune(Flat(30)), 0);
    EXPECT_EQ(registers.dac, 191U);
    EXPECT_EQ(_NAVI_TimeOut, 1) << "the call counts";
    EXPECT_EQ(_NAVI_mean, 180U);
    EXPECT_EQ(_NAVI_flag_param_reset, 1) << "history waits for the next measured call";
    EXPECT_EQ(_NAVI_dc_pre, 192U);
    EXPECT_EQ(registers.Tune(Flat(180)), 1);
    EXPECT_EQ(_NAVI_TimeOut, 0);
}

TEST_F(Tune, ReferenceItselfIsMeasured) {
    Registers registers;
    registers.dac = 128;
    EXPECT_EQ(registers.Tune(Flat(180)), 1);
    EXPECT_EQ(registers.dac, 128U);
}

TEST_F(Tune, ResetGoesToTheMiddleOfTheUsableRange) {
    const int32_t references[] = {0, 1, 100, 254, 255, 300};
    // (reference + 255) / 2, truncated; a DC of 0 is not below the reference 0.
    const uint32_t expected[] = {0x100, 0x180, 0x1B1, 0x1FE, 0x1FF, 0x100 + 277};
    for (size_t i = 0; i < 6; ++i) {
        Params().Set("_NAVI_DC_REF", references[i]).Apply();
        Registers registers;
        registers.dac = 0x100;
        registers.Tune(Flat(180));
        EXPECT_EQ(registers.dac, expected[i]) << references[i];
    }
}

TEST_F(Tune, ReferenceAbove255WrapsInTheDifferences) {
    // 277 resets: 0xFF00FFFF - 0x115 + ((255 - 277) << 16) = 0xFF00FEEA + 0xFFEA0000, in 32 bits.
    Params().Set("iDCMode", 0).Set("_NAVI_DC_REF", 300).Apply();
    Registers registers;
    registers.dac = 0;
    EXPECT_EQ(registers.Tune(Flat(180)), 0);
    EXPECT_EQ(registers.dac, 0xFEEAFEEAU);
}

TEST_F(Tune, DifferencesOf128And191) {
    Params().Set("iDCMode", 0).Apply();
    Registers registers;
    registers.dac = 0x12348000;  // byte 1 - byte 0 = 128
    EXPECT_EQ(registers.Tune(Flat(180)), 1);
    EXPECT_EQ(registers.dac, 0xFF7FFF7FU);
    registers.dac = 0x0000FF40;
    EXPECT_EQ(registers.Tune(Flat(180)), 1);
    EXPECT_EQ(registers.dac, 0xFF40FF40U);
    EXPECT_EQ(_NAVI_dc_mode, 0U);
}

TEST_F(Tune, EveryDcIsReadAsItWasWrittenInBothLayouts) {
    for (uint32_t dc = 0; dc < 256; ++dc) {
        Registers registers;
        Params().Set("_NAVI_DC_REF", 0).Apply();
        registers.dac = 0xA5C30000U | dc;
        ASSERT_EQ(registers.Tune(Flat(180)), 1);
        EXPECT_EQ(registers.dac, 0xA5C30000U | dc);
        EXPECT_EQ(_NAVI_dc_current, dc);
        EXPECT_EQ(_NAVI_dc_pre, dc);

        Params().Set("_NAVI_DC_REF", 0).Set("iDCMode", 0).Apply();
        registers.dac = dc << 8;
        ASSERT_EQ(registers.Tune(Flat(180)), 1);
        EXPECT_EQ(registers.dac, DifferenceRegister(dc));
        EXPECT_EQ(_NAVI_dc_current, dc);
        ASSERT_EQ(registers.Tune(Flat(180)), 1);
        EXPECT_EQ(registers.dac, DifferenceRegister(dc));
        EXPECT_EQ(_NAVI_dc_current, dc);
        EXPECT_EQ(_NAVI_dc_pre, dc);
    }
}

TEST_F(Tune, OtherLayoutsLeaveTheRegisterAlone) {
    Registers registers;
    registers.dac = 200;
    registers.Tune(Flat(230));  // remembers 187
    for (const int32_t layout : {2, -1}) {
        Params().Set("iDCMode", layout).Set("_NAVI_TimeOut_threshold", 0).Apply();
        registers.dac = 0x11223344;
        const uint32_t dc = _NAVI_dc_current;
        const uint32_t pre = _NAVI_dc_pre;
        EXPECT_EQ(registers.Tune(Flat(230)), 0);
        EXPECT_EQ(_NAVI_dc_current, dc - 13) << "tunes on the value it remembers";
        EXPECT_EQ(_NAVI_dc_pre, pre);
        EXPECT_EQ(_NAVI_dc_mode, static_cast<uint32_t>(layout));
        EXPECT_EQ(registers.dac, 0x11223344U);
    }
}

TEST_F(Tune, OtherLayoutsKeepThe4095OfAReset) {
    Params().Set("iDCMode", 2).Apply();
    Registers registers;
    EXPECT_EQ(registers.Tune(Flat(180)), 1);
    EXPECT_EQ(_NAVI_dc_pre, 4095U);
}

TEST_F(Tune, OtherLayoutsResetTheRememberedDcOnly) {
    Params().Set("iDCMode", 2).Set("_NAVI_DC_REF", 193).Apply();
    Registers registers;
    registers.dac = 0x11223344;
    EXPECT_EQ(registers.Tune(Flat(180)), 0);  // 192 is remembered
    EXPECT_EQ(_NAVI_dc_current, 224U);
    EXPECT_EQ(registers.dac, 0x11223344U);
}

TEST_F(Tune, BandsIncludeTheirBounds) {
    struct Case {
        uint8_t grey;
        int32_t effective, recommend, top;
    };
    const Case cases[] = {{139, -1, -1, -1}, {140, 0, -1, -1}, {159, 0, -1, -1}, {160, 0, 0, -1},
                          {179, 0, 0, -1},   {180, 0, 0, 0},   {200, 0, 0, 0},   {201, 0, 1, 0},
                          {220, 0, 1, 0},    {221, 1, 1, 1}};
    for (const Case& expected : cases) {
        Registers registers;
        registers.dac = 200;
        registers.Tune(Flat(expected.grey));
        EXPECT_EQ(_NAVI_mean, expected.grey);
        EXPECT_EQ(_NAVI_flag_effective, expected.effective) << +expected.grey;
        EXPECT_EQ(_NAVI_flag_recommend, expected.recommend) << +expected.grey;
        EXPECT_EQ(_NAVI_flag_recommend_top, expected.top) << +expected.grey;
    }
}

TEST_F(Tune, SaturatedIsBelow10AndAbove250InMeanAndTop) {
    const auto saturated = [](const std::vector<uint8_t>& frame) {
        Registers registers;
        registers.dac = 200;
        registers.Tune(frame);
        return _NAVI_flag_non_linear;
    };
    EXPECT_EQ(saturated(Flat(9)), 1);
    EXPECT_EQ(saturated(Flat(10)), 0);
    EXPECT_EQ(saturated(Flat(250)), 0);
    EXPECT_EQ(saturated(Flat(251)), 1);
    // Top 255, mean 20 * 255 / 126 = 40. With 0..1 percent one pixel is the top; 255 / 126 = 2.
    EXPECT_EQ(saturated(FlatWithBright(0, 20)), 0);
    // 18 pixels of 60 in each corner: the top is the 13th to 18th, mean 18 * 60 / 126 = 8.
    TestFrame dark(56, 36, 0);
    for (const int32_t column : {0, 42})
        dark.Paint(0, column, 2, 9, 60).Paint(27, column, 2, 9, 60);
    EXPECT_EQ(saturated(dark.Greys()), 0) << "the top is inside";
    EXPECT_EQ(_NAVI_mean, 8U);
    EXPECT_EQ(_NAVI_top_mean, 60U);
    Params()
        .Set("_NAVI_top_mean_interval.RANGE_LOW", 0)
        .Set("_NAVI_top_mean_interval.RANGE_HIGH", 1)
        .Apply();
    EXPECT_EQ(saturated(FlatWithBright(0, 1)), 1) << "one end each";
    EXPECT_EQ(saturated(FlatWithBright(200, 1)), 0) << "the mean is inside";
}

TEST_F(Tune, FailedTopIsStoredAndCountsAsAboveItsBand) {
    Params().Set("_NAVI_top_mean_interval.RANGE_HIGH", 10).Apply();
    Registers registers;
    registers.dac = 200;
    registers.Tune(Flat(230));
    EXPECT_EQ(_NAVI_top_mean, 0xFFFFFFFFU);
    EXPECT_EQ(_NAVI_flag_recommend_top, 1);
    EXPECT_EQ(_NAVI_flag_non_linear, 0);
    registers.Tune(Flat(5));
    EXPECT_EQ(_NAVI_flag_non_linear, 1) << "a failed top lies outside 10..250 too";
}

TEST_F(Tune, GainRegistersArePackedAndReadOnly) {
    Registers registers;
    registers.dac = 200;
    registers.gain20 = 0xFFF3F4FFU;
    registers.gain2C = 0xFFFFF5F6U;
    registers.Tune(Flat(180));
    EXPECT_EQ(_NAVI_G20C, 0x3456U);
    EXPECT_EQ(_NAVI_K_value, 3665U);  // 374 * 56 * 7 * 6 / 240 = 3665.2
    EXPECT_EQ(registers.gain20, 0xFFF3F4FFU);
    EXPECT_EQ(registers.gain2C, 0xFFFFF5F6U);
}

TEST_F(Tune, ReferenceGainHasTheFactorOfTheParameters) {
    Registers registers;
    registers.dac = 200;
    registers.Tune(Flat(180));
    EXPECT_EQ(_NAVI_G20C, 0x2712U);
    EXPECT_EQ(_NAVI_K_value, 374U);
}

}  // namespace
