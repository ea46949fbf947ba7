// The DC step: _NAVI_GetDelta decides direction and size from the measured grey levels,
// _NAVI_Change0C applies the step between _NAVI_DC_REF and 255 and says whether more frames are
// needed.

#include "RefInternal.h"
#include "RefMath.h"
#include "Reference.h"

namespace reference {

namespace {

constexpr int32_t kMiddle = 180;         // target of both grey levels
constexpr uint32_t kSaturatedStep = 16;  // least step while the image is saturated
constexpr uint32_t kDcMax = 255;

// The step that moves `grey` to the target, at least 1; without a gain factor exactly 1. A grey
// level on the target leaves the step as it was.
void UpdateStep(int32_t grey, uint32_t* step) {
    if (grey == kMiddle)
        return;
    const uint32_t target = static_cast<uint32_t>(kMiddle);
    const uint32_t level = static_cast<uint32_t>(grey);
    const uint32_t distance =
        grey < kMiddle ? WrapSubU32(target, level) : WrapSubU32(level, target);
    uint32_t size = 1;
    if (_NAVI_K_value != 0)
        size = WrapMulU32(_NAVI_ENLARGE_K, distance) / _NAVI_K_value;
    *step = size == 0 ? 1 : size;
}

void StopAtLimit() {
    _NAVI_flag_recommend_pre = 3;
    _NAVI_NoMoreProcess = 0;
}

uint32_t AfterStep() {
    return _NAVI_flag_effective == 0 ? 1 : 2;
}

}  // namespace

void _NAVI_UpdateDC() {
    UpdateStep(static_cast<int32_t>(_NAVI_top_mean), &_NAVI_delta_dc_val_top);
}

void _NAVI_UpdateDC_mean() {
    UpdateStep(static_cast<int32_t>(_NAVI_mean), &_NAVI_delta_dc_val_mean);
}

void _NAVI_GetDelta() {
    _NAVI_UpdateDC();
    _NAVI_UpdateDC_mean();
    if (_NAVI_flag_recommend == 0) {
        _NAVI_delta_dc_orient = 0;
        _NAVI_delta_dc_val = 0;
    } else if (_NAVI_flag_recommend == 1) {
        _NAVI_delta_dc_orient = -1;
        _NAVI_delta_dc_val = _NAVI_delta_dc_val_mean;
    } else if (_NAVI_flag_recommend == -1) {
        _NAVI_delta_dc_orient = 1;
        _NAVI_delta_dc_val = _NAVI_delta_dc_val_mean;
    }
    if (_NAVI_flag_non_linear != 0 && _NAVI_delta_dc_val < kSaturatedStep)
        _NAVI_delta_dc_val = kSaturatedStep;
}

namespace {

void RaiseDc() {
    if (_NAVI_dc_current == kDcMax) {
        StopAtLimit();
        return;
    }
    const uint32_t raised = WrapAddU32(_NAVI_dc_current, _NAVI_delta_dc_val);
    _NAVI_dc_current = raised > kDcMax ? kDcMax : raised;
    _NAVI_NoMoreProcess = AfterStep();
}

void LowerDc() {
    const uint32_t lowest = static_cast<uint32_t>(_NAVI_DC_REF);
    if (_NAVI_dc_current == lowest) {
        StopAtLimit();
        return;
    }
    const int32_t leastForStep = static_cast<int32_t>(WrapAddU32(lowest, _NAVI_delta_dc_val));
    if (static_cast<int32_t>(_NAVI_dc_current) > leastForStep)
        _NAVI_dc_current = WrapSubU32(_NAVI_dc_current, _NAVI_delta_dc_val);
    else
        _NAVI_dc_current = lowest;
    _NAVI_NoMoreProcess = AfterStep();
}

}  // namespace

void _NAVI_Change0C() {
    if (_NAVI_delta_dc_orient == 1)
        RaiseDc();
    else if (_NAVI_delta_dc_orient == -1)
        LowerDc();
    else
        _NAVI_NoMoreProcess = 0;
}

}  // namespace reference
