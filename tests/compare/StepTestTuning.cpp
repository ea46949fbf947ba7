// The steps of the calibration against the plain model, from any state that the variables can hold.
#include <gtest/gtest.h>

#include "Reference.h"
#include "StepFrames.h"
#include "param/NaviParam.h"
#include "tuning/Tune.h"
#include "tuning/TuneMeasure.h"
#include "tuning/TuneStep.h"

namespace fpnavi_test {
namespace {

using fpnavi::DcState;
using fpnavi::GreyReading;
using host::SimRandom;

// Mostly a grey or a DC, sometimes just beside one, sometimes anything.
uint32_t AnyValue(SimRandom& random) {
    if (random.Chance(80))
        return static_cast<uint32_t>(random.Range(0, 256));
    return random.Chance(50) ? static_cast<uint32_t>(random.Range(-2, 5000))
                             : static_cast<uint32_t>(random.Next());
}

int32_t AnyFlag(SimRandom& random) {
    return random.Range(-1, 3);
}

GreyReading AnyReading(SimRandom& random) {
    GreyReading reading = {};
    reading.mean = random.Chance(10) ? 180 : AnyValue(random);
    reading.top = random.Chance(10) ? 180 : AnyValue(random);
    reading.effective = AnyFlag(random);
    reading.recommend = AnyFlag(random);
    reading.nonLinear = random.Range(0, 1);
    reading.gainFactor = random.Chance(10) ? 0 : AnyValue(random);
    return reading;
}

DcState AnyDc(SimRandom& random, int32_t reference) {
    DcState dc = {};
    dc.current = random.Chance(20) ? static_cast<uint32_t>(reference) : AnyValue(random);
    dc.pre = random.Chance(20) ? dc.current + static_cast<uint32_t>(random.Range(0, 1))
                               : AnyValue(random);
    dc.recommendPre = AnyFlag(random);
    dc.stepTop = AnyValue(random);
    dc.stepMean = AnyValue(random);
    dc.step = AnyValue(random);
    dc.orient = AnyFlag(random);
    dc.noMoreProcess = static_cast<uint32_t>(random.Range(0, 2));
    return dc;
}

void SetPlain(const DcState& dc, const GreyReading& reading, int32_t dcReference) {
    using namespace reference;
    _NAVI_DC_REF = dcReference;
    _NAVI_mean = reading.mean;
    _NAVI_top_mean = reading.top;
    _NAVI_flag_effective = reading.effective;
    _NAVI_flag_recommend = reading.recommend;
    _NAVI_flag_non_linear = reading.nonLinear;
    _NAVI_K_value = reading.gainFactor;
    _NAVI_dc_current = dc.current;
    _NAVI_dc_pre = dc.pre;
    _NAVI_flag_recommend_pre = dc.recommendPre;
    _NAVI_delta_dc_val_top = dc.stepTop;
    _NAVI_delta_dc_val_mean = dc.stepMean;
    _NAVI_delta_dc_val = dc.step;
    _NAVI_delta_dc_orient = dc.orient;
    _NAVI_NoMoreProcess = dc.noMoreProcess;
}

DcState PlainDc() {
    using namespace reference;
    return {_NAVI_dc_current,         _NAVI_dc_pre,
            _NAVI_flag_recommend_pre, _NAVI_delta_dc_val_top,
            _NAVI_delta_dc_val_mean,  _NAVI_delta_dc_val,
            _NAVI_delta_dc_orient,    _NAVI_NoMoreProcess};
}

bool SameAsPlain(const DcState& dc) {
    const DcState plain = PlainDc();
    return dc.current == plain.current && dc.pre == plain.pre &&
           dc.recommendPre == plain.recommendPre && dc.stepTop == plain.stepTop &&
           dc.stepMean == plain.stepMean && dc.step == plain.step && dc.orient == plain.orient &&
           dc.noMoreProcess == plain.noMoreProcess;
}

// Leaves the model's state as it was: other tests keep model and module in step.
class StepTuning : public ::testing::Test {
  protected:
    void SetUp() override {
        using namespace reference;
        m_dc = PlainDc();
        m_reading.mean = _NAVI_mean;
        m_reading.top = _NAVI_top_mean;
        m_reading.effective = _NAVI_flag_effective;
        m_reading.recommend = _NAVI_flag_recommend;
        m_reading.nonLinear = _NAVI_flag_non_linear;
        m_reading.gainFactor = _NAVI_K_value;
        m_reference = _NAVI_DC_REF;
    }
    void TearDown() override { SetPlain(m_dc, m_reading, m_reference); }

  private:
    DcState m_dc = {};
    GreyReading m_reading = {};
    int32_t m_reference = 0;
};

TEST_F(StepTuning, AnyStateAndReadingGiveTheSameDecision) {
    const int64_t cases = StepCases(200000);
    for (int64_t i = 0; i < cases; ++i) {
        SimRandom random = StepRandom(301, i);
        const int32_t dcReference =
            random.Chance(80) ? 128 : static_cast<int32_t>(AnyValue(random));
        const GreyReading reading = AnyReading(random);
        const DcState dc = AnyDc(random, dcReference);
        SetPlain(dc, reading, dcReference);
        reference::_NAVI_Tune_Process();
        ASSERT_TRUE(SameAsPlain(fpnavi::DecideStep(dc, reading, dcReference))) << "case " << i;
        SetPlain(dc, reading, dcReference);
        reference::_NAVI_GetDelta();
        ASSERT_TRUE(SameAsPlain(fpnavi::SizeStep(dc, reading))) << "case " << i;
        SetPlain(dc, reading, dcReference);
        reference::_NAVI_Change0C();
        ASSERT_TRUE(SameAsPlain(fpnavi::ApplyStep(dc, reading.effective, dcReference)))
            << "case " << i;
    }
}

}  // namespace
}  // namespace fpnavi_test
