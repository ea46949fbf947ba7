// The tuning driver: one call of _NAVI_Tune measures a frame, decides a step of the DC value and
// writes it back into the register word. The state between calls is here, with the classification
// of the measured grey levels and the test for completion.

#include <algorithm>
#include <cstring>
#include <initializer_list>

#include "RefInternal.h"
#include "RefMath.h"
#include "Reference.h"

namespace reference {

uint32_t _NAVI_dc_mode = 0;
uint32_t _NAVI_dc_current = 3;
uint32_t _NAVI_dc_residual = 0;
uint32_t _NAVI_dc_pre = 3;
uint32_t _NAVI_mean = 3;
uint32_t _NAVI_top_mean = 3;
int32_t _NAVI_flag_effective = 3;
int32_t _NAVI_flag_recommend = 3;
int32_t _NAVI_flag_recommend_top = 3;
int32_t _NAVI_flag_recommend_pre = 3;
int32_t _NAVI_flag_non_linear = 0;
uint32_t _NAVI_G20C = 0;
uint32_t _NAVI_K_value = 0;
uint32_t _NAVI_delta_dc_val_top = 0;
uint32_t _NAVI_delta_dc_val_mean = 0;
uint32_t _NAVI_delta_dc_val = 0;
int32_t _NAVI_delta_dc_orient = 0;
uint32_t _NAVI_NoMoreProcess = 0;
int32_t _NAVI_TimeOut = 0;
int32_t _NAVI_flag_param_reset = 0;
_NAVI_SIZE sImgSizeInfo = {0, 0};
uint32_t _NAVI_img_histogram[256] = {};

void ResetTuningState() {
    _NAVI_dc_mode = 0;
    _NAVI_dc_current = 3;
    _NAVI_dc_residual = 0;
    _NAVI_dc_pre = 3;
    _NAVI_mean = 3;
    _NAVI_top_mean = 3;
    _NAVI_flag_effective = 3;
    _NAVI_flag_recommend = 3;
    _NAVI_flag_recommend_top = 3;
    _NAVI_flag_recommend_pre = 3;
    _NAVI_flag_non_linear = 0;
    _NAVI_G20C = 0;
    _NAVI_K_value = 0;
    _NAVI_delta_dc_val_top = 0;
    _NAVI_delta_dc_val_mean = 0;
    _NAVI_delta_dc_val = 0;
    _NAVI_delta_dc_orient = 0;
    _NAVI_NoMoreProcess = 0;
    _NAVI_TimeOut = 0;
    _NAVI_flag_param_reset = 0;
    sImgSizeInfo = {0, 0};
    std::memset(_NAVI_img_histogram, 0, sizeof _NAVI_img_histogram);
}

namespace {

uint32_t LowByte(uint32_t value) {
    return value & 0xFFU;
}

// Mode 0 carries the DC value as the difference of bytes 1 and 0.
uint32_t ByteDifference(uint32_t reg) {
    return WrapSubU32(LowByte(reg >> 8), LowByte(reg));
}

void DecodeRegister(uint32_t reg) {
    if (_NAVI_dc_mode == 1) {
        _NAVI_dc_current = LowByte(reg);
        _NAVI_dc_residual = reg & 0xFFFFFF00U;
    } else if (_NAVI_dc_mode == 0) {
        _NAVI_dc_current = ByteDifference(reg);
    }
}

// For a DC value of 0..255 the mode 0 bytes are, from the lowest, 255 - DC, 255, 255 - DC, 255.
void EncodeRegister(uint32_t* iTuneDAC) {
    if (_NAVI_dc_mode == 1) {
        *iTuneDAC = WrapAddU32(_NAVI_dc_current, _NAVI_dc_residual);
    } else if (_NAVI_dc_mode == 0) {
        const uint32_t high = WrapMulU32(WrapSubU32(255U, _NAVI_dc_current), 0x10000U);
        *iTuneDAC = WrapAddU32(WrapSubU32(0xFF00FFFFU, _NAVI_dc_current), high);
    }
}

int32_t Classify(uint32_t value, const _NAVI_struRange& range) {
    if (value < range.RANGE_LOW)
        return -1;
    return value > range.RANGE_HIGH ? 1 : 0;
}

// Below 10 or above 250.
bool IsSaturated(uint32_t value) {
    return WrapSubU32(value, 10U) > 240U;
}

uint32_t PackGain(uint32_t iGain20, uint32_t iGain2C) {
    return (iGain2C & 0xFU) | (((iGain2C >> 8) & 0xFU) << 4) | (((iGain20 >> 8) & 0xFU) << 8) |
           (((iGain20 >> 16) & 0xFU) << 12);
}

void ClassifyMeasurement() {
    _NAVI_flag_recommend_top = Classify(_NAVI_top_mean, _NAVI_range_recommend);
    _NAVI_flag_recommend = Classify(_NAVI_mean, _NAVI_range_mean_recommend);
    _NAVI_flag_effective = Classify(_NAVI_mean, _NAVI_range_mean);
    _NAVI_flag_non_linear = IsSaturated(_NAVI_mean) && IsSaturated(_NAVI_top_mean) ? 1 : 0;
}

// Sides are products: with two negative factors one is positive and no buffer has it.
bool HasNegativeOrNoBlocks() {
    return std::min({s_blockWidth, s_blockHeight, s_blockColNum, s_blockRowNum}) < 1;
}

// A frame of the wrong size fails with its log line before anything else matters. Any other frame
// without blocks, or whose gain codes point outside the tables, is dropped unmeasured and without
// a line.
bool MeasureFrame(const uint8_t* img, uint32_t gainCode) {
    const bool wrongSize = !IsTuneSizeDivisible(sImgSizeInfo.iHeight, sImgSizeInfo.iWidth);
    if (!wrongSize && (HasNegativeOrNoBlocks() || !AreGainsUsable(gainCode))) {
        _NAVI_mean = 0;
        return false;
    }
    return _NAVI_ImgHistogram(img, sImgSizeInfo.iHeight, sImgSizeInfo.iWidth) == 0;
}

}  // namespace

int32_t _NAVI_Tune_Init(const uint8_t* img, uint32_t* iTuneDAC, const uint32_t* iGain20,
                        const uint32_t* iGain2C) {
    _NAVI_dc_mode = static_cast<uint32_t>(iDCMode);
    DecodeRegister(*iTuneDAC);
    if (static_cast<int32_t>(_NAVI_dc_current) < _NAVI_DC_REF) {
        _NAVI_dc_current = static_cast<uint32_t>(WrapAdd32(_NAVI_DC_REF, 255) / 2);
        EncodeRegister(iTuneDAC);
        _NAVI_NoMoreProcess = 2;
        s_tuneOkFlag = 0;
        return 0;
    }
    const uint32_t gainCode = PackGain(*iGain20, *iGain2C);
    if (!MeasureFrame(img, gainCode)) {
        return 1;  // goes on with the flags of the last measured frame
    }
    _NAVI_top_mean = static_cast<uint32_t>(_NAVI_CalcTop(_NAVI_top_mean_interval.RANGE_LOW,
                                                         _NAVI_top_mean_interval.RANGE_HIGH,
                                                         _NAVI_img_histogram));
    ClassifyMeasurement();
    _NAVI_G20C = gainCode;
    _NAVI_K_value = static_cast<uint32_t>(_NAVI_K_CALC(_NAVI_G20C));
    return 1;
}

// A saturated image whose recommendation has flipped since the previous call: the last step
// overshot, so the DC value goes half-way back. _NAVI_NoMoreProcess keeps its value then.
void _NAVI_Tune_Operation() {
    const uint32_t current = LowByte(_NAVI_dc_current);
    const uint32_t previous = LowByte(_NAVI_dc_pre);
    if (_NAVI_flag_recommend_pre == 3 || _NAVI_flag_recommend_pre == 0 ||
        _NAVI_flag_non_linear == 0 || current == previous ||
        _NAVI_flag_recommend_pre == _NAVI_flag_recommend) {
        _NAVI_GetDelta();
        _NAVI_Change0C();
        return;
    }
    if (current == previous + 1 || previous == current + 1)
        _NAVI_dc_current = _NAVI_dc_pre;
    else
        _NAVI_dc_current = WrapAddU32(_NAVI_dc_pre, _NAVI_dc_current) >> 1;
}

void _NAVI_Tune_Process() {
    if (_NAVI_flag_effective == 0) {
        _NAVI_NoMoreProcess = 0;
        _NAVI_delta_dc_orient = 0;
        _NAVI_delta_dc_val = 0;
        return;
    }
    _NAVI_Tune_Operation();
}

void _NAVI_Tune_Param_Reset() {
    _NAVI_flag_recommend_pre = 3;
    _NAVI_dc_pre = 4095;
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
    // The value that was in the sensor for this frame, before the register is rewritten.
    if (_NAVI_dc_mode == 1)
        _NAVI_dc_pre = LowByte(*iTuneDAC);
    else if (_NAVI_dc_mode == 0)
        _NAVI_dc_pre = ByteDifference(*iTuneDAC);
    EncodeRegister(iTuneDAC);
}

namespace {

bool IsTuningComplete() {
    if (_NAVI_NoMoreProcess <= 1 && _NAVI_TimeOut > 0)
        return true;
    return _NAVI_TimeOut_threshold > 0 && _NAVI_TimeOut >= _NAVI_TimeOut_threshold;
}

}  // namespace

// img_width and img_height are accepted and not used: the geometry is the parameter block's.
int32_t _NAVI_Tune(const uint8_t* img, int32_t /*img_width*/, int32_t /*img_height*/,
                   uint32_t* iTuneDAC, const uint32_t* iGain20, const uint32_t* iGain2C) {
    if (img == nullptr || iTuneDAC == nullptr || iGain20 == nullptr || iGain2C == nullptr)
        return -1;
    if (s_modeFlag == 1)
        return 1;
    _NAVI_TimeOut = WrapAdd32(_NAVI_TimeOut, 1);
    sImgSizeInfo = {s_imageHeight, s_imageWidth};
    if (_NAVI_Tune_Init(img, iTuneDAC, iGain20, iGain2C) == 0)
        return 0;
    _NAVI_Tune_Process();
    _NAVI_Tune_Finalize(iTuneDAC);
    if (IsTuningComplete()) {
        s_tuneOkFlag = 1;
        _NAVI_TimeOut = 0;
        _NAVI_flag_param_reset = 1;
    } else {
        s_tuneOkFlag = 0;
    }
    return s_tuneOkFlag;
}

}  // namespace reference
