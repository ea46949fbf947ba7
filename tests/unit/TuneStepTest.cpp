// The tuning's step: its size, its direction, the limits of the DC. The steps take no arguments,
// so they are driven by frames through _NAVI_Tune, with the call limit off unless a test says so.
#include <gtest/gtest.h>

#include <vector>

#include "TuneTestSupport.h"
#include "tuning/TuneStep.h"

namespace {

using namespace fpnavi;
using namespace fpnavi_test;

class TuneStep : public AfterARun {
  protected:
    void SetUp() override {
        AfterARun::SetUp();
        m_params.Set("_NAVI_TimeOut_threshold", 0).Apply();
        // The first call of a run clears direction and step at its end; this is it.
        Tune(192, 130);
    }
    // A run's call with this DC in the sensor and a frame of this grey all over; layout 1.
    int32_t Tune(uint32_t dc, uint8_t grey) { return TuneFrame(dc, Flat(grey)); }
    int32_t TuneFrame(uint32_t dc, const std::vector<uint8_t>& frame) {
        m_registers.dac = dc;
        return m_registers.Tune(frame);
    }
    // Every mean is out of the effective band, so that every call looks for a step.
    Params& NothingIsEffective() {
        return m_params.Set("_NAVI_range_mean.RANGE_LOW", 300)
            .Set("_NAVI_range_mean.RANGE_HIGH", 400);
    }

    Params m_params;
    Registers m_registers;
};

TEST_F(TuneStep, Mean230GoesDownBy13) {
    EXPECT_EQ(Tune(200, 230), 0);
    EXPECT_EQ(_NAVI_K_value, 374U);
    EXPECT_EQ(_NAVI_delta_dc_val, 13U);  // 100 * (230 - 180) / 374 = 13.4
    EXPECT_EQ(_NAVI_delta_dc_orient, -1);
    EXPECT_EQ(m_registers.dac, 187U);
    EXPECT_EQ(_NAVI_NoMoreProcess, 2U);
}

TEST_F(TuneStep, Mean130GoesUpBy13) {
    EXPECT_EQ(Tune(200, 130), 0);
    EXPECT_EQ(_NAVI_delta_dc_val, 13U);
    EXPECT_EQ(_NAVI_delta_dc_orient, 1);
    EXPECT_EQ(m_registers.dac, 213U);
    EXPECT_EQ(_NAVI_NoMoreProcess, 2U);
}

TEST_F(TuneStep, MeanOfExactly180KeepsTheFormerMeanStep) {
    Tune(200, 230);
    ASSERT_EQ(_NAVI_delta_dc_val_mean, 13U);
    NothingIsEffective().Apply();
    Tune(200, 180);
    EXPECT_EQ(_NAVI_delta_dc_val_mean, 13U);
    EXPECT_EQ(_NAVI_delta_dc_val_top, 13U) << "the top grey is 180 too";
}

TEST_F(TuneStep, Mean181RaisesItsStepOf0To1) {
    NothingIsEffective().Apply();
    Tune(200, 181);
    EXPECT_EQ(_NAVI_delta_dc_val_mean, 1U);  // 100 / 374 = 0
    EXPECT_EQ(_NAVI_delta_dc_val_top, 1U);
    Tune(200, 179);
    EXPECT_EQ(_NAVI_delta_dc_val_mean, 1U);
    EXPECT_EQ(_NAVI_delta_dc_val_top, 1U);
    Tune(200, 184);  // 400 / 374
    EXPECT_EQ(_NAVI_delta_dc_val_mean, 1U);
    Tune(200, 188);  // 800 / 374
    EXPECT_EQ(_NAVI_delta_dc_val_mean, 2U);
}

TEST_F(TuneStep, GainFactorDividesTheStep) {
    m_registers.gain20 = 0x00070000U;
    m_registers.gain2C = 0x00000707U;  // factor 13962
    Tune(200, 230);
    EXPECT_EQ(m_registers.dac, 199U);  // 5000 / 13962 = 0, raised to 1
    m_registers.gain20 = 0;
    m_registers.gain2C = 0x00000101U;  // 374 * 10 * 2 * 2 / 240 = 62
    Tune(255, 230);
    EXPECT_EQ(_NAVI_K_value, 62U);
    EXPECT_EQ(m_registers.dac, 175U);  // 5000 / 62 = 80
}

TEST_F(TuneStep, GainFactor0StepsBy1InTheWantedDirection) {
    m_params.Set("_NAVI_INPUT_K", 0).Apply();
    Tune(200, 230);
    EXPECT_EQ(_NAVI_K_value, 0U);
    EXPECT_EQ(_NAVI_delta_dc_val_mean, 1U);
    EXPECT_EQ(_NAVI_delta_dc_val_top, 1U);
    EXPECT_EQ(m_registers.dac, 199U);
    Tune(200, 130);
    EXPECT_EQ(m_registers.dac, 201U);
}

TEST_F(TuneStep, GainRatiosTooSmallForTheReferenceGiveAFactorOf0) {
    // 20 * 10 * 1 * 1 / 240 = 0.
    m_params.Set("_NAVI_INPUT_K", 20).Apply();
    m_registers.gain20 = m_registers.gain2C = 0;
    Tune(200, 230);
    EXPECT_EQ(_NAVI_K_value, 0U);
    EXPECT_EQ(m_registers.dac, 199U);
}

TEST_F(TuneStep, GainFactor0AtExactly180KeepsTheFormerStep) {
    Tune(200, 230);
    NothingIsEffective().Set("_NAVI_INPUT_K", 0).Apply();
    Tune(200, 180);
    EXPECT_EQ(_NAVI_delta_dc_val_mean, 13U);
}

TEST_F(TuneStep, TopStepIsKeptButMovesNothing) {
    // 126 pixels: 20 of 255, so that ranks 13 to 18 are 255; (20 * 255 + 106 * 206) / 126 = 213.
    // Out of the band only by a narrower one: 140..210.
    m_params.Set("_NAVI_range_mean.RANGE_HIGH", 210).Apply();
    TuneFrame(200, FlatWithBright(206, 20));
    EXPECT_EQ(_NAVI_mean, 213U);  // 5100 + 21836 = 26936; / 126 = 213.8
    EXPECT_EQ(_NAVI_top_mean, 255U);
    EXPECT_EQ(_NAVI_delta_dc_val_top, 20U);  // 7500 / 374
    EXPECT_EQ(_NAVI_delta_dc_val_mean, 8U);  // 3300 / 374
    EXPECT_EQ(m_registers.dac, 192U);
}

TEST_F(TuneStep, FailedTopCountsAsFarBelow180) {
    m_params.Set("_NAVI_top_mean_interval.RANGE_LOW", 15).Apply();
    Tune(200, 230);
    EXPECT_EQ(_NAVI_top_mean, 0xFFFFFFFFU);
    EXPECT_EQ(_NAVI_delta_dc_val_top, 48U);  // 100 * (180 + 1) / 374
    EXPECT_EQ(m_registers.dac, 187U) << "the mean decides";
}

TEST_F(TuneStep, RecommendedMeanOutOfTheEffectiveBandMovesNothingAndEnds) {
    NothingIsEffective().Apply();
    EXPECT_EQ(Tune(200, 190), 1);
    EXPECT_EQ(_NAVI_flag_recommend, 0);
    EXPECT_EQ(_NAVI_delta_dc_orient, 0);
    EXPECT_EQ(_NAVI_delta_dc_val, 0U);
    EXPECT_EQ(_NAVI_delta_dc_val_mean, 2U) << "1000 / 374, computed nevertheless";
    EXPECT_EQ(_NAVI_NoMoreProcess, 0U);
    EXPECT_EQ(m_registers.dac, 200U);
}

TEST_F(TuneStep, SaturatedImageWithDirection0ForcesTheStepTo16ButDoesNotMove) {
    m_params.Set("_NAVI_range_mean_recommend.RANGE_LOW", 0).Apply();
    EXPECT_EQ(Tune(200, 5), 1);
    EXPECT_EQ(_NAVI_flag_non_linear, 1);
    EXPECT_EQ(_NAVI_delta_dc_orient, 0);
    EXPECT_EQ(_NAVI_delta_dc_val, 16U);
    EXPECT_EQ(m_registers.dac, 200U);
    EXPECT_EQ(_NAVI_NoMoreProcess, 0U);
}

TEST_F(TuneStep, SaturatedImageStepsByAtLeast16) {
    m_params.Set("_NAVI_INPUT_K", 1000).Apply();
    Tune(200, 252);
    EXPECT_EQ(_NAVI_delta_dc_val_mean, 7U);  // 7200 / 1000
    EXPECT_EQ(_NAVI_delta_dc_val, 16U);
    EXPECT_EQ(m_registers.dac, 184U);
    Tune(200, 250);  // not saturated: 7000 / 1000
    EXPECT_EQ(m_registers.dac, 193U);
}

TEST_F(TuneStep, SaturatedImageKeepsALargerStep) {
    Tune(150, 5);
    EXPECT_EQ(_NAVI_flag_non_linear, 1);
    EXPECT_EQ(_NAVI_delta_dc_val, 46U);  // 17500 / 374
    EXPECT_EQ(m_registers.dac, 196U);
}

TEST_F(TuneStep, RaisingFrom250By13IsCappedAndTheNextRaiseEnds) {
    EXPECT_EQ(Tune(250, 130), 0);
    EXPECT_EQ(m_registers.dac, 255U);
    EXPECT_EQ(_NAVI_NoMoreProcess, 2U);
    EXPECT_EQ(Tune(255, 130), 1);
    EXPECT_EQ(m_registers.dac, 255U);
    EXPECT_EQ(_NAVI_NoMoreProcess, 0U);
}

TEST_F(TuneStep, RaisingTo255ExactlyAsksForAnotherFrame) {
    EXPECT_EQ(Tune(242, 130), 0);
    EXPECT_EQ(m_registers.dac, 255U);
    EXPECT_EQ(_NAVI_NoMoreProcess, 2U);
}

TEST_F(TuneStep, LoweringFrom135By13StopsAtTheReference) {
    EXPECT_EQ(Tune(135, 230), 0);  // 135 is not above 128 + 13
    EXPECT_EQ(m_registers.dac, 128U);
    EXPECT_EQ(_NAVI_NoMoreProcess, 2U);
    EXPECT_EQ(Tune(128, 230), 1);
    EXPECT_EQ(m_registers.dac, 128U);
    EXPECT_EQ(_NAVI_NoMoreProcess, 0U);
}

TEST_F(TuneStep, LoweringStartsToSubtractRightAboveReferenceAndStep) {
    Tune(141, 230);
    EXPECT_EQ(m_registers.dac, 128U);
    Tune(142, 230);
    EXPECT_EQ(m_registers.dac, 129U);
}

TEST_F(TuneStep, ReferenceMovesTheLowerLimit) {
    m_params.Set("_NAVI_DC_REF", 40).Apply();
    Tune(60, 230);
    EXPECT_EQ(m_registers.dac, 47U);
    Tune(50, 230);
    EXPECT_EQ(m_registers.dac, 40U);
}

TEST_F(TuneStep, EffectiveMeanClearsDirectionAndStep) {
    Tune(200, 230);
    EXPECT_EQ(Tune(187, 200), 1);
    EXPECT_EQ(_NAVI_delta_dc_orient, 0);
    EXPECT_EQ(_NAVI_delta_dc_val, 0U);
    EXPECT_EQ(_NAVI_NoMoreProcess, 0U);
    EXPECT_EQ(m_registers.dac, 187U);
}

TEST_F(TuneStep, The3OfALimitIsOverwrittenInTheSameCall) {
    EXPECT_EQ(Tune(255, 130), 1) << "finds the limit";
    EXPECT_EQ(_NAVI_flag_recommend_pre, -1);
    Tune(200, 230);
    Tune(128, 230);
    EXPECT_EQ(_NAVI_flag_recommend_pre, 1);
}

// No call of _NAVI_Tune has a saturated image and an unknown recommendation at once: both come
// from the same measurement. So this test alone sets the steps' inputs itself.
TEST_F(TuneStep, UnknownRecommendationKeepsDirectionAndStepButForTheMinimum) {
    Tune(200, 130);
    ASSERT_EQ(_NAVI_delta_dc_val, 13U);
    _NAVI_flag_recommend = 3;
    _NAVI_GetDelta();
    EXPECT_EQ(_NAVI_delta_dc_orient, 1);
    EXPECT_EQ(_NAVI_delta_dc_val, 13U);
    _NAVI_flag_non_linear = 1;
    _NAVI_GetDelta();
    EXPECT_EQ(_NAVI_delta_dc_orient, 1);
    EXPECT_EQ(_NAVI_delta_dc_val, 16U);
}

// Likewise: the driver asks for a step only while the mean is not effective.
TEST_F(TuneStep, StepWhileTheMeanIsEffectiveSays1) {
    Tune(200, 130);
    _NAVI_flag_effective = 0;
    for (const int32_t orient : {1, -1}) {
        _NAVI_delta_dc_orient = orient;
        _NAVI_Change0C();
        EXPECT_EQ(_NAVI_NoMoreProcess, 1U);
    }
}

}  // namespace
