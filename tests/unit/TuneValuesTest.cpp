// The calibration in values: measuring and deciding change no state and read none but what they
// are given, and the register layouts.
#include <gtest/gtest.h>

#include <vector>

#include "TuneTestSupport.h"
#include "tuning/TuneMeasure.h"
#include "tuning/TuneStep.h"

namespace {

using namespace fpnavi;
using namespace fpnavi_test;

constexpr _NAVI_SIZE kSize = {36, 56};
constexpr uint32_t kRefGainCode = 0x2712;
constexpr int32_t kReference = 128;

bool operator==(const DcState& a, const DcState& b) {
    return a.current == b.current && a.pre == b.pre && a.recommendPre == b.recommendPre &&
           a.stepTop == b.stepTop && a.stepMean == b.stepMean && a.step == b.step &&
           a.orient == b.orient && a.noMoreProcess == b.noMoreProcess;
}

class TuneValues : public AfterARun {};

TEST_F(TuneValues, MeasuringReturnsWhatTheFrameShowsAndChangesNoState) {
    const std::vector<uint32_t> before = TuneState();
    const auto measured = MeasureFrame(Flat(230).data(), kSize, kRefGainCode);
    ASSERT_TRUE(measured);
    EXPECT_EQ(measured->mean, 230U);
    EXPECT_EQ(measured->top, 230U);
    EXPECT_EQ(measured->effective, 1);
    EXPECT_EQ(measured->recommend, 1);
    EXPECT_EQ(measured->recommendTop, 1);
    EXPECT_EQ(measured->nonLinear, 0);
    EXPECT_EQ(measured->gainCode, kRefGainCode);
    EXPECT_EQ(measured->gainFactor, 374U);
    EXPECT_EQ(measured->histogram[230], 126U);
    EXPECT_EQ(TuneState(), before);
}

TEST_F(TuneValues, MeasuringGivesNothingForAFrameThatCannotBeMeasured) {
    const std::vector<uint32_t> before = TuneState();
    EXPECT_FALSE(MeasureFrame(Flat(230).data(), {0, 0}, kRefGainCode));
    EXPECT_FALSE(MeasureFrame(Flat(230).data(), kSize, 0x8712));
    EXPECT_EQ(TuneState(), before);
}

// A reading of this mean, too bright, at a gain factor of 374.
GreyReading TooBright(uint32_t mean, int32_t nonLinear = 0) {
    GreyReading reading = {};
    reading.mean = mean;
    reading.top = mean;
    reading.effective = 1;
    reading.recommend = 1;
    reading.nonLinear = nonLinear;
    reading.gainFactor = 374;
    return reading;
}

TEST_F(TuneValues, DecidingChangesNoState) {
    const std::vector<uint32_t> before = TuneState();
    const DcState dc = {200, 190, 1, 0, 0, 0, 0, 0};
    const DcState after = DecideStep(dc, TooBright(230), kReference);
    // 5000 / 374 = 13 down.
    EXPECT_TRUE((after == DcState{187, 190, 1, 13, 13, 13, -1, 2}));
    EXPECT_EQ(TuneState(), before);
}

TEST_F(TuneValues, DecidingReadsNothingButItsArguments) {
    const DcState dc = {140, 190, 1, 0, 0, 0, 0, 0};
    const DcState expected = DecideStep(dc, TooBright(230), kReference);
    EXPECT_EQ(expected.current, 128U) << "the limit that was given";
    // Another state and other parameters behind it.
    Params().Set("_NAVI_DC_REF", 20).Set("_NAVI_TimeOut_threshold", 0).Apply();
    Registers registers;
    registers.dac = 60;
    registers.Tune(Flat(0));
    EXPECT_TRUE(DecideStep(dc, TooBright(230), kReference) == expected);
}

TEST_F(TuneValues, DecisionOnAnEffectiveMeanKeepsTheDc) {
    GreyReading reading = TooBright(200, 1);
    reading.effective = 0;
    const DcState dc = {200, 190, -1, 5, 6, 7, 1, 2};
    EXPECT_TRUE((DecideStep(dc, reading, kReference) == DcState{200, 190, -1, 5, 6, 0, 0, 0}));
}

TEST_F(TuneValues, DecisionAfterAStepThatOvershotBisectsAndKeepsAllElse) {
    const DcState dc = {246, 198, -1, 5, 6, 7, 1, 2};
    EXPECT_TRUE(
        (DecideStep(dc, TooBright(255, 1), kReference) == DcState{222, 198, -1, 5, 6, 7, 1, 2}));
}

TEST_F(TuneValues, LimitInTheWantedDirectionForgetsTheRecommendation) {
    const DcState atTop = ApplyStep({255, 200, -1, 0, 0, 13, 1, 2}, -1, kReference);
    EXPECT_TRUE((atTop == DcState{255, 200, 3, 0, 0, 13, 1, 0}));
    const DcState atBottom = ApplyStep({128, 200, 1, 0, 0, 13, -1, 2}, 1, kReference);
    EXPECT_TRUE((atBottom == DcState{128, 200, 3, 0, 0, 13, -1, 0}));
}

TEST_F(TuneValues, SingleStepsAreAssignedToTheState) {
    Registers registers;
    registers.dac = 200;
    registers.Tune(Flat(230));
    _NAVI_dc_current = 255;
    _NAVI_flag_recommend = -1;
    _NAVI_GetDelta();
    EXPECT_EQ(_NAVI_delta_dc_orient, 1);
    EXPECT_EQ(_NAVI_delta_dc_val, 13U);
    EXPECT_EQ(_NAVI_flag_recommend_pre, 3) << "the end of a run's first call";
    _NAVI_flag_recommend_pre = -1;
    _NAVI_Change0C();
    EXPECT_EQ(_NAVI_flag_recommend_pre, 3) << "255 is the limit";
    EXPECT_EQ(_NAVI_NoMoreProcess, 0U);
    EXPECT_EQ(_NAVI_dc_current, 255U);
}

TEST(DcRegister, LowByteIsTheDcAndTheRestTheResidual) {
    EXPECT_EQ(DecodeDc(1, 0x123456C0U, 7), 0xC0U);
    EXPECT_EQ(DecodeResidual(1, 0x123456C0U, 7), 0x12345600U);
    EXPECT_EQ(EncodeDc(1, 0xBF, 0x12345600U, 0), 0x123456BFU);
}

TEST(DcRegister, DifferenceOfTheBytesHasNoResidual) {
    EXPECT_EQ(DecodeDc(0, 0xABCDE020U, 7), 0xC0U);
    EXPECT_EQ(DecodeDc(0, 0xABCD20E0U, 7), 0xFFFFFF40U) << "wraps below 0";
    EXPECT_EQ(DecodeResidual(0, 0xABCDE020U, 7), 7U);
    EXPECT_EQ(EncodeDc(0, 128, 0x12345600U, 0), 0xFF7FFF7FU);
    EXPECT_EQ(EncodeDc(0, 191, 0x12345600U, 0), 0xFF40FF40U);
}

TEST(DcRegister, OtherModesHoldNoDc) {
    for (const uint32_t mode : {2U, 0xFFFFFFFFU}) {
        EXPECT_EQ(DecodeDc(mode, 0x123456C0U, 7), 7U);
        EXPECT_EQ(DecodeResidual(mode, 0x123456C0U, 7), 7U);
        EXPECT_EQ(EncodeDc(mode, 191, 0x12345600U, 0x11223344U), 0x11223344U);
    }
}

}  // namespace
