#include "tuning/Tune.h"

#include <limits>

#include "base/NaviMath.h"
#include "gesture/Gesture.h"
#include "param/NaviLimits.h"
#include "param/NaviParam.h"
#include "tuning/TuneHistogram.h"
#include "tuning/TuneStep.h"

namespace fpnavi {

uint32_t _NAVI_dc_mode = 0;
uint32_t _NAVI_dc_residual = 0;
uint32_t _NAVI_dc_pre = 3;
int32_t _NAVI_flag_recommend_top = 3;
int32_t _NAVI_TimeOut = 0;
int32_t _NAVI_flag_param_reset = 0;
_NAVI_SIZE sImgSizeInfo = {0, 0};

namespace {

constexpr uint32_t kByteMask = 0xFF;
constexpr uint32_t kDcPreReset = 4095;  // no DC value

// The two layouts of the DC register: the DC as the low byte, or as the difference of the bytes of
// each half. Any other mode leaves the register alone.
bool DcInLowByte() {
    return _NAVI_dc_mode == 1;
}
bool DcAsDifference() {
    return _NAVI_dc_mode == 0;
}

uint32_t DecodeDifference(uint32_t value) {
    return WrapSubU(value >> 8 & kByteMask, value & kByteMask);
}

void DecodeDc(uint32_t value) {
    if (DcInLowByte()) {
        _NAVI_dc_current = value & kByteMask;
        _NAVI_dc_residual = value & ~kByteMask;
    } else if (DcAsDifference()) {
        _NAVI_dc_current = DecodeDifference(value);
    }
}

void EncodeDc(uint32_t* value) {
    if (DcInLowByte()) {
        *value = WrapAddU(_NAVI_dc_current, _NAVI_dc_residual);
    } else if (DcAsDifference()) {
        // Bytes 0 and 2 become 255 - DC, bytes 1 and 3 255.
        const uint32_t upper = WrapMulU(WrapSubU(kDcMax, _NAVI_dc_current), 1U << 16);
        *value = WrapAddU(WrapSubU(0xFF00FFFFU, _NAVI_dc_current), upper);
    }
}

int32_t Classify(uint32_t value, const _NAVI_struRange& band) {
    if (value < band.RANGE_LOW)
        return -1;
    return value > band.RANGE_HIGH ? 1 : 0;
}

// Below 10 or above 250: the difference wraps for the former.
bool Saturated(uint32_t grey) {
    return WrapSubU(grey, 10) > 240;
}

// The frame can be measured: it has blocks of pixels whose number fits 32 bits, and every table is
// indexed inside.
bool FrameUsable(uint32_t gainCode) {
    return BlockFactorsPositive() && sImgSizeInfo.iWidth >= 1 && sImgSizeInfo.iHeight >= 1 &&
           sImgSizeInfo.iWidth <= std::numeric_limits<int32_t>::max() / sImgSizeInfo.iHeight &&
           _NAVI_blk_selection_mode >= 0 && _NAVI_blk_selection_mode <= 3 &&
           GainCodesUsable(gainCode);
}

// Measures and classifies the frame. One that cannot be measured gets a mean of 0, and all else
// stays as the frame before left it.
void Measure(const uint8_t* img, uint32_t gainCode) {
    // An image of the wrong size reads no table, and is reported as such.
    if (ImageDividable(sImgSizeInfo.iHeight, sImgSizeInfo.iWidth) && !FrameUsable(gainCode)) {
        _NAVI_mean = 0;
        return;
    }
    if (_NAVI_ImgHistogram(img, sImgSizeInfo.iHeight, sImgSizeInfo.iWidth) != 0)
        return;
    _NAVI_top_mean = static_cast<uint32_t>(_NAVI_CalcTop(_NAVI_top_mean_interval.RANGE_LOW,
                                                         _NAVI_top_mean_interval.RANGE_HIGH,
                                                         _NAVI_img_histogram));
    _NAVI_flag_recommend_top = Classify(_NAVI_top_mean, _NAVI_range_recommend);
    _NAVI_flag_recommend = Classify(_NAVI_mean, _NAVI_range_mean_recommend);
    _NAVI_flag_effective = Classify(_NAVI_mean, _NAVI_range_mean);
    _NAVI_flag_non_linear = Saturated(_NAVI_mean) && Saturated(_NAVI_top_mean) ? 1 : 0;
    _NAVI_G20C = gainCode;
    _NAVI_K_value = static_cast<uint32_t>(_NAVI_K_CALC(gainCode));
}

// Returns false when the DC was below its range: it is set to the middle, and nothing is measured.
bool _NAVI_Tune_Init(const uint8_t* img, uint32_t* iTuneDAC, uint32_t gainCode) {
    _NAVI_dc_mode = static_cast<uint32_t>(iDCMode);
    DecodeDc(*iTuneDAC);
    if (static_cast<int32_t>(_NAVI_dc_current) < _NAVI_DC_REF) {
        _NAVI_dc_current =
            static_cast<uint32_t>(WrapAdd(_NAVI_DC_REF, static_cast<int32_t>(kDcMax)) / 2);
        EncodeDc(iTuneDAC);
        _NAVI_NoMoreProcess = 2;
        return false;
    }
    Measure(img, gainCode);
    return true;
}

// Halfway back to the DC before, which the last step left too far behind.
void Bisect() {
    const uint32_t d = WrapSubU(_NAVI_dc_current & kByteMask, _NAVI_dc_pre & kByteMask);
    if (d == 1 || d == WrapSubU(0, 1))
        _NAVI_dc_current = _NAVI_dc_pre;
    else
        _NAVI_dc_current = WrapAddU(_NAVI_dc_pre, _NAVI_dc_current) >> 1;
}

void _NAVI_Tune_Operation() {
    // A saturated frame whose recommendation flipped since the last call: the step overshot.
    const bool known = _NAVI_flag_recommend_pre != 3 && _NAVI_flag_recommend_pre != 0;
    const bool dcMoved = (_NAVI_dc_current & kByteMask) != (_NAVI_dc_pre & kByteMask);
    const bool flipped = _NAVI_flag_recommend_pre != _NAVI_flag_recommend;
    if (known && _NAVI_flag_non_linear != 0 && dcMoved && flipped) {
        Bisect();
    } else {
        _NAVI_GetDelta();
        _NAVI_Change0C();
    }
}

void _NAVI_Tune_Process() {
    if (_NAVI_flag_effective != 0) {
        _NAVI_Tune_Operation();
        return;
    }
    _NAVI_NoMoreProcess = 0;
    _NAVI_delta_dc_orient = 0;
    _NAVI_delta_dc_val = 0;
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
    if (DcInLowByte())
        _NAVI_dc_pre = *iTuneDAC & kByteMask;
    else if (DcAsDifference())
        _NAVI_dc_pre = DecodeDifference(*iTuneDAC);
    EncodeDc(iTuneDAC);
}

bool IsComplete() {
    return (_NAVI_NoMoreProcess <= 1 && _NAVI_TimeOut > 0) ||
           (_NAVI_TimeOut_threshold > 0 && _NAVI_TimeOut >= _NAVI_TimeOut_threshold);
}

}  // namespace
}  // namespace fpnavi

int32_t _NAVI_Tune(const uint8_t* img, int32_t /*img_width*/, int32_t /*img_height*/,
                   uint32_t* iTuneDAC, const uint32_t* iGain20, const uint32_t* iGain2C) {
    using namespace fpnavi;
    if (img == nullptr || iTuneDAC == nullptr || iGain20 == nullptr || iGain2C == nullptr)
        return -1;
    if (s_modeFlag == 1)
        return 1;
    _NAVI_TimeOut = WrapAdd(_NAVI_TimeOut, 1);
    sImgSizeInfo = {s_imageHeight, s_imageWidth};
    s_tuneOkFlag = 0;
    if (!_NAVI_Tune_Init(img, iTuneDAC, PackGainCode(*iGain20, *iGain2C)))
        return s_tuneOkFlag;
    _NAVI_Tune_Process();
    _NAVI_Tune_Finalize(iTuneDAC);
    if (IsComplete()) {
        s_tuneOkFlag = 1;
        _NAVI_TimeOut = 0;
        _NAVI_flag_param_reset = 1;
    }
    return s_tuneOkFlag;
}
