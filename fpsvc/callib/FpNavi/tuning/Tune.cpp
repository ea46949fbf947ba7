#include "tuning/Tune.h"

#include <algorithm>
#include <iterator>
#include <optional>

#include "base/NaviMath.h"
#include "gesture/Gesture.h"
#include "param/NaviParam.h"
#include "tuning/TuneMeasure.h"
#include "tuning/TuneRegisters.h"
#include "tuning/TuneStep.h"

namespace fpnavi {

uint32_t _NAVI_img_histogram[256];
uint32_t _NAVI_mean = 3;
uint32_t _NAVI_top_mean = 3;
int32_t _NAVI_flag_effective = 3;
int32_t _NAVI_flag_recommend = 3;
int32_t _NAVI_flag_recommend_top = 3;
int32_t _NAVI_flag_non_linear = 0;
uint32_t _NAVI_G20C = 0;
uint32_t _NAVI_K_value = 0;

uint32_t _NAVI_dc_mode = 0;
uint32_t _NAVI_dc_residual = 0;
uint32_t _NAVI_dc_current = 3;
uint32_t _NAVI_dc_pre = 3;
int32_t _NAVI_flag_recommend_pre = 3;
uint32_t _NAVI_delta_dc_val_top = 0;
uint32_t _NAVI_delta_dc_val_mean = 0;
uint32_t _NAVI_delta_dc_val = 0;
int32_t _NAVI_delta_dc_orient = 0;
uint32_t _NAVI_NoMoreProcess = 0;

int32_t _NAVI_TimeOut = 0;
int32_t _NAVI_flag_param_reset = 0;
_NAVI_SIZE sImgSizeInfo = {0, 0};

namespace {

constexpr uint32_t kDcPreReset = 4095;  // no DC value

GreyReading FetchReading() {
    return {_NAVI_mean,
            _NAVI_top_mean,
            _NAVI_flag_effective,
            _NAVI_flag_recommend,
            _NAVI_flag_recommend_top,
            _NAVI_flag_non_linear,
            _NAVI_G20C,
            _NAVI_K_value};
}

void Assign(const GreyReading& reading) {
    _NAVI_mean = reading.mean;
    _NAVI_top_mean = reading.top;
    _NAVI_flag_effective = reading.effective;
    _NAVI_flag_recommend = reading.recommend;
    _NAVI_flag_recommend_top = reading.recommendTop;
    _NAVI_flag_non_linear = reading.nonLinear;
    _NAVI_G20C = reading.gainCode;
    _NAVI_K_value = reading.gainFactor;
}

void AssignHistogram(const CornerGreys& corner) {
    std::copy(std::begin(corner.histogram), std::end(corner.histogram), _NAVI_img_histogram);
}

DcState FetchDc() {
    return {_NAVI_dc_current,         _NAVI_dc_pre,
            _NAVI_flag_recommend_pre, _NAVI_delta_dc_val_top,
            _NAVI_delta_dc_val_mean,  _NAVI_delta_dc_val,
            _NAVI_delta_dc_orient,    _NAVI_NoMoreProcess};
}

void Assign(const DcState& dc) {
    _NAVI_dc_current = dc.current;
    _NAVI_dc_pre = dc.pre;
    _NAVI_flag_recommend_pre = dc.recommendPre;
    _NAVI_delta_dc_val_top = dc.stepTop;
    _NAVI_delta_dc_val_mean = dc.stepMean;
    _NAVI_delta_dc_val = dc.step;
    _NAVI_delta_dc_orient = dc.orient;
    _NAVI_NoMoreProcess = dc.noMoreProcess;
}

uint32_t RegisterNow(uint32_t value) {
    return EncodeDc(_NAVI_dc_mode, _NAVI_dc_current, _NAVI_dc_residual, value);
}

// A frame that cannot be measured gets a mean of 0; all other values stay those of the frame
// before.
void Measure(const uint8_t* img, uint32_t gainCode) {
    const std::optional<FrameMeasure> measured = MeasureFrame(img, sImgSizeInfo, gainCode);
    if (!measured) {
        _NAVI_mean = 0;
        return;
    }
    Assign(measured->reading);
    AssignHistogram(measured->corner);
}

// Returns false when the DC was below its range: it is set to the middle, and nothing is measured.
bool _NAVI_Tune_Init(const uint8_t* img, uint32_t* iTuneDAC, uint32_t gainCode) {
    _NAVI_dc_mode = static_cast<uint32_t>(iDCMode);
    _NAVI_dc_current = DecodeDc(_NAVI_dc_mode, *iTuneDAC, _NAVI_dc_current);
    _NAVI_dc_residual = DecodeResidual(_NAVI_dc_mode, *iTuneDAC, _NAVI_dc_residual);
    if (static_cast<int32_t>(_NAVI_dc_current) < _NAVI_DC_REF) {
        _NAVI_dc_current =
            static_cast<uint32_t>(WrapAdd(_NAVI_DC_REF, static_cast<int32_t>(kDcMax)) / 2);
        *iTuneDAC = RegisterNow(*iTuneDAC);
        _NAVI_NoMoreProcess = 2;
        return false;
    }
    Measure(img, gainCode);
    return true;
}

void _NAVI_Tune_Process() {
    Assign(DecideStep(FetchDc(), FetchReading(), _NAVI_DC_REF));
}

void _NAVI_Tune_Param_Reset() {
    _NAVI_flag_recommend_pre = 3;
    _NAVI_dc_pre = kDcPreReset;
    _NAVI_delta_dc_val = 0;
    _NAVI_delta_dc_orient = 0;
}

void _NAVI_Tune_Finalize(uint32_t* iTuneDAC) {
    if (_NAVI_flag_param_reset != 0) {
        _NAVI_Tune_Param_Reset();
        _NAVI_flag_param_reset = 0;
    } else {
        _NAVI_flag_recommend_pre = _NAVI_flag_recommend;
    }
    _NAVI_dc_pre = DecodeDc(_NAVI_dc_mode, *iTuneDAC, _NAVI_dc_pre);
    *iTuneDAC = RegisterNow(*iTuneDAC);
}

bool IsComplete() {
    return (_NAVI_NoMoreProcess <= 1 && _NAVI_TimeOut > 0) ||
           (_NAVI_TimeOut_threshold > 0 && _NAVI_TimeOut >= _NAVI_TimeOut_threshold);
}

}  // namespace

int32_t _NAVI_ImgHistogram(const uint8_t* img, int32_t height, int32_t width) {
    const std::optional<CornerGreys> corner =
        MeasureCorner(img, height, width, _NAVI_blk_selection_mode);
    _NAVI_mean = corner ? static_cast<uint32_t>(corner->mean) : 0U;
    if (!corner)
        return -1;
    AssignHistogram(*corner);
    return 0;
}

void _NAVI_GetDelta() {
    Assign(SizeStep(FetchDc(), FetchReading()));
}

void _NAVI_Change0C() {
    Assign(ApplyStep(FetchDc(), _NAVI_flag_effective, _NAVI_DC_REF));
}

}  // namespace fpnavi

int32_t _NAVI_Tune(const uint8_t* img, int32_t /*img_width*/, int32_t /*img_height*/,
                   uint32_t* iTuneDAC, const uint32_t* iGain20, const uint32_t* iGain2C) {
    using namespace fpnavi;
    if (img == nullptr || iTuneDAC == nullptr || iGain20 == nullptr || iGain2C == nullptr)
        return -1;
    if (IsHg())
        return 1;
    _NAVI_TimeOut = WrapAdd(_NAVI_TimeOut, 1);
    sImgSizeInfo = {s_imageHeight, s_imageWidth};
    s_tuneOkFlag = 0;
    if (!_NAVI_Tune_Init(img, iTuneDAC, PackGainCode(*iGain20, *iGain2C)))
        return 0;
    _NAVI_Tune_Process();
    _NAVI_Tune_Finalize(iTuneDAC);
    if (IsComplete()) {
        s_tuneOkFlag = 1;
        _NAVI_TimeOut = 0;
        _NAVI_flag_param_reset = 1;
    }
    return s_tuneOkFlag;
}
