// Tuning runs over several calls: how they begin, what they remember, when they end.
#include <gtest/gtest.h>
#include <rapidcheck/gtest.h>

#include <algorithm>
#include <array>
#include <vector>

#include "LogCapture.h"
#include "TuneTestSupport.h"

namespace {

using namespace fpnavi;
using namespace fpnavi_test;

TEST_F(FreshTune, StateHoldsItsInitialValues) {
    EXPECT_EQ(_NAVI_dc_mode, 0U);
    EXPECT_EQ(_NAVI_dc_current, 3U);
    EXPECT_EQ(_NAVI_dc_residual, 0U);
    EXPECT_EQ(_NAVI_dc_pre, 3U);
    EXPECT_EQ(_NAVI_mean, 3U);
    EXPECT_EQ(_NAVI_top_mean, 3U);
    EXPECT_EQ(_NAVI_flag_effective, 3);
    EXPECT_EQ(_NAVI_flag_recommend, 3);
    EXPECT_EQ(_NAVI_flag_recommend_top, 3);
    EXPECT_EQ(_NAVI_flag_recommend_pre, 3);
    EXPECT_EQ(_NAVI_flag_non_linear, 0);
    EXPECT_EQ(_NAVI_G20C, 0U);
    EXPECT_EQ(_NAVI_K_value, 0U);
    EXPECT_EQ(_NAVI_delta_dc_val, 0U);
    EXPECT_EQ(_NAVI_delta_dc_val_top, 0U);
    EXPECT_EQ(_NAVI_delta_dc_val_mean, 0U);
    EXPECT_EQ(_NAVI_delta_dc_orient, 0);
    EXPECT_EQ(_NAVI_NoMoreProcess, 0U);
    EXPECT_EQ(_NAVI_TimeOut, 0);
    EXPECT_EQ(_NAVI_flag_param_reset, 0);
    EXPECT_EQ(sImgSizeInfo.iHeight, 0);
    EXPECT_EQ(sImgSizeInfo.iWidth, 0);
    EXPECT_EQ(s_tuneOkFlag, 0);
}

TEST_F(FreshTune, RememberedDcOf3IsReset) {
    Params().Set("iDCMode", 2).Apply();
    Registers registers;
    registers.dac = 0x11223344;
    EXPECT_EQ(registers.Tune(Flat(180)), 0);
    EXPECT_EQ(_NAVI_dc_current, 191U);
    EXPECT_EQ(registers.dac, 0x11223344U);
}

TEST_F(FreshTune, FirstMeasuredCallKeepsItsRecommendation) {
    Params().Apply();
    Registers registers;
    registers.dac = 200;
    EXPECT_EQ(registers.Tune(Flat(230)), 0);
    EXPECT_EQ(_NAVI_flag_recommend_pre, 1) << "nothing has completed, so nothing is reset";
    EXPECT_EQ(_NAVI_dc_pre, 200U);
}

TEST_F(FreshTune, WrongImageSizeOnTheVeryFirstCallCompletesAtOnce) {
    // Flags of 3 are neither effective nor a direction: no step, nothing more to do.
    Params().Set("s_blockWidthFp", 5).Set("s_blockHeightFp", 3).Apply();
    LogCapture log;
    Registers registers;
    registers.dac = 200;
    EXPECT_EQ(registers.Tune(Flat(230)), 1);
    EXPECT_EQ(log.Lines().size(), 1U);
    EXPECT_EQ(registers.dac, 200U);
    EXPECT_EQ(_NAVI_mean, 0U);
    EXPECT_EQ(_NAVI_top_mean, 3U);
    EXPECT_EQ(_NAVI_flag_effective, 3);
    EXPECT_EQ(_NAVI_flag_recommend, 3);
    EXPECT_EQ(_NAVI_delta_dc_orient, 0);
    EXPECT_EQ(_NAVI_delta_dc_val, 0U) << "direction and step stay as they were";
    EXPECT_EQ(_NAVI_NoMoreProcess, 0U);
}

TEST_F(FreshTune, BeforeAnyParametersTheImageIsEmptyAndTheRunCompletesAtOnce) {
    if (s_imageWidth != 0)
        GTEST_SKIP() << "SetNaviParam has run in this process";
    LogCapture log;
    Registers registers;
    registers.dac = 200;
    EXPECT_EQ(registers.Tune(Flat(230)), 1);
    EXPECT_EQ(registers.dac, 200U);
    EXPECT_EQ(_NAVI_mean, 0U);
    EXPECT_TRUE(log.Lines().empty());
}

class TuneRuns : public AfterARun {
  protected:
    void NoLimit() { m_params.Set("_NAVI_TimeOut_threshold", 0).Apply(); }
    int32_t Tune(uint32_t dc, uint8_t grey) {
        m_registers.dac = dc;
        return m_registers.Tune(Flat(grey));
    }

    Params m_params;
    Registers m_registers;
};

TEST_F(TuneRuns, EffectiveMeanOnTheFirstCallCompletes) {
    EXPECT_EQ(Tune(200, 150), 1);
    EXPECT_EQ(_NAVI_NoMoreProcess, 0U);
    EXPECT_EQ(_NAVI_TimeOut, 0);
    EXPECT_EQ(_NAVI_flag_param_reset, 1) << "the next call resets the history";
    EXPECT_EQ(s_tuneOkFlag, 1);
}

TEST_F(TuneRuns, MeanOutsideOnTwoCallsCompletesAtTheSecondByTheLimit) {
    EXPECT_EQ(Tune(200, 230), 0);
    EXPECT_EQ(_NAVI_TimeOut, 1);
    EXPECT_EQ(s_tuneOkFlag, 0);
    EXPECT_EQ(Tune(187, 230), 1);
    EXPECT_EQ(m_registers.dac, 174U) << "the last step is written too";
    EXPECT_EQ(_NAVI_NoMoreProcess, 2U);
    EXPECT_EQ(_NAVI_TimeOut, 0);
    EXPECT_EQ(Tune(174, 230), 0) << "a run of its own";
}

TEST_F(TuneRuns, WithoutLimitOnlyTheMeanOrTheEndOfTheRangeCompletes) {
    for (const int32_t threshold : {0, -1, -5}) {
        m_params.Set("_NAVI_TimeOut_threshold", threshold).Apply();
        for (int32_t call = 1; call <= 20; ++call) {
            EXPECT_EQ(Tune(200, 230), 0);
            EXPECT_EQ(_NAVI_TimeOut, call);
        }
        EXPECT_EQ(Tune(200, 220), 1);
        EXPECT_EQ(_NAVI_TimeOut, 0);
    }
}

TEST_F(TuneRuns, ResetCallCountsTowardsTheLimit) {
    EXPECT_EQ(Tune(10, 230), 0);
    EXPECT_EQ(_NAVI_TimeOut, 1);
    EXPECT_EQ(Tune(191, 230), 1);
}

TEST_F(TuneRuns, ResetCallsAloneNeverComplete) {
    // A host that ignores the register it is given.
    for (int32_t call = 1; call <= 10; ++call) {
        EXPECT_EQ(Tune(10, 180), 0);
        EXPECT_EQ(_NAVI_TimeOut, call);
    }
}

TEST_F(TuneRuns, FirstCallAfterCompletionForgetsAtItsEnd) {
    NoLimit();
    EXPECT_EQ(Tune(200, 230), 0);
    EXPECT_EQ(_NAVI_flag_recommend, 1);
    EXPECT_EQ(_NAVI_flag_recommend_pre, 3);
    EXPECT_EQ(_NAVI_delta_dc_val, 0U);
    EXPECT_EQ(_NAVI_delta_dc_orient, 0);
    EXPECT_EQ(m_registers.dac, 187U) << "the step was taken before";
    EXPECT_EQ(_NAVI_dc_pre, 200U) << "written after the reset";
    EXPECT_EQ(_NAVI_flag_param_reset, 0);
    EXPECT_EQ(Tune(187, 230), 0);
    EXPECT_EQ(_NAVI_flag_recommend_pre, 1);
    EXPECT_EQ(_NAVI_delta_dc_val, 13U);
    EXPECT_EQ(_NAVI_delta_dc_orient, -1);
}

TEST_F(TuneRuns, SaturatedFlipBisects) {
    NoLimit();
    Tune(150, 0);                  // uses up the reset
    Tune(198, 0);                  // remembers -1 at 198
    EXPECT_EQ(Tune(246, 255), 0);  // too bright now: not 20 down, but (198 + 246) / 2
    EXPECT_EQ(m_registers.dac, 222U);
    EXPECT_EQ(_NAVI_NoMoreProcess, 2U);
    EXPECT_EQ(Tune(222, 0), 0);
    EXPECT_EQ(m_registers.dac, 234U);
    EXPECT_EQ(Tune(234, 255), 0);
    EXPECT_EQ(m_registers.dac, 228U);
    EXPECT_EQ(Tune(229, 0), 0);  // (234 + 229) / 2 = 231.5
    EXPECT_EQ(m_registers.dac, 231U);
}

TEST_F(TuneRuns, BisectionOfNeighboursGoesBack) {
    NoLimit();
    Tune(150, 0);
    Tune(198, 0);
    Tune(199, 255);  // d = 1
    EXPECT_EQ(m_registers.dac, 198U);
    Tune(198, 0);  // d = -1
    EXPECT_EQ(m_registers.dac, 199U);
}

TEST_F(TuneRuns, NoBisectionOfTheSameDc) {
    NoLimit();
    Tune(150, 0);
    Tune(198, 0);
    Tune(198, 255);
    EXPECT_EQ(m_registers.dac, 178U);  // 7500 / 374 = 20 down
}

TEST_F(TuneRuns, NoBisectionOfAnUnsaturatedImage) {
    NoLimit();
    Tune(150, 0);
    Tune(198, 0);
    Tune(246, 230);
    EXPECT_EQ(m_registers.dac, 233U);  // 13 down
}

TEST_F(TuneRuns, NoBisectionWhileTheRecommendationStays) {
    NoLimit();
    Tune(150, 0);
    Tune(160, 0);
    Tune(170, 0);
    EXPECT_EQ(m_registers.dac, 218U);  // 18000 / 374 = 48 up
}

TEST_F(TuneRuns, NoBisectionAfterARecommendedMean) {
    NoLimit();
    m_params.Set("_NAVI_range_mean_recommend.RANGE_HIGH", 250).Apply();
    Tune(150, 230);  // recommended, not effective: completes
    Tune(150, 130);  // a run of its own; uses up the reset
    Tune(160, 230);  // remembers 0
    EXPECT_EQ(_NAVI_flag_recommend_pre, 0);
    Tune(170, 255);
    EXPECT_EQ(m_registers.dac, 150U);  // 20 down
}

TEST_F(TuneRuns, FirstCallAfterCompletionStillUsesTheOldHistory) {
    NoLimit();
    Tune(250, 0);
    EXPECT_EQ(Tune(255, 0), 1) << "ends at the limit and remembers -1";
    // Saturated and flipped: bisects, and since that leaves the 0 of the limit, ends at once.
    EXPECT_EQ(Tune(201, 255), 1);
    EXPECT_EQ(m_registers.dac, 228U);  // (255 + 201) / 2
    EXPECT_EQ(_NAVI_NoMoreProcess, 0U);
    EXPECT_EQ(_NAVI_flag_recommend_pre, 3) << "forgotten at its end";
    EXPECT_EQ(Tune(201, 0), 0);
    EXPECT_EQ(m_registers.dac, 249U) << "a plain step";
}

TEST_F(TuneRuns, ClearChangesOnlyTheOkFlag) {
    NoLimit();
    Tune(200, 230);
    Tune(187, 215);
    ASSERT_EQ(s_tuneOkFlag, 1);
    const std::vector<uint32_t> before = TuneState();
    FpNaviClear();
    EXPECT_EQ(TuneState(), before);
    EXPECT_EQ(s_tuneOkFlag, 0);
}

TEST_F(TuneRuns, GestureBetweenTwoCallsDisturbsNothingButTheOkFlag) {
    EXPECT_EQ(Tune(200, 230), 0);
    const std::vector<uint32_t> before = TuneState();
    FpNaviClear();
    std::vector<uint8_t> image(56 * 36);
    for (const int32_t column : {0, 3, 6, 9}) {
        const std::vector<uint8_t> patch = NoisePatch(0, column, 36, 56);
        GetNaviBlock(patch.data(), 56, 36, image.data());
        vmk_fp_navigation_detect_finger_status(image.data());
        OrientationCalc(image.data(), image.data(), 0);
    }
    Voting(1);
    EXPECT_EQ(TuneState(), before);
    EXPECT_EQ(s_tuneOkFlag, 0);
    EXPECT_EQ(Tune(187, 230), 1) << "the second call of the run";
    EXPECT_EQ(m_registers.dac, 174U);
}

}  // namespace
