#include "tuning/TuneStep.h"

#include <algorithm>

#include "base/NaviMath.h"
#include "param/NaviParam.h"
#include "tuning/TuneHistogram.h"

namespace fpnavi {

int32_t _NAVI_flag_effective = 3;
int32_t _NAVI_flag_recommend = 3;
int32_t _NAVI_flag_recommend_pre = 3;
int32_t _NAVI_flag_non_linear = 0;
uint32_t _NAVI_dc_current = 3;
uint32_t _NAVI_delta_dc_val_top = 0;
uint32_t _NAVI_delta_dc_val_mean = 0;
uint32_t _NAVI_delta_dc_val = 0;
int32_t _NAVI_delta_dc_orient = 0;
uint32_t _NAVI_NoMoreProcess = 0;

namespace {

constexpr int32_t kGreyTarget = 180;     // the middle of the recommended bands
constexpr uint32_t kStepSaturated = 16;  // least step while greys are saturated and tell nothing

// Sets step to what brings grey to the target, at least 1; at the target it stays as it was. A gain
// factor of 0 tells nothing about the size: 1.
void UpdateStep(int32_t grey, uint32_t* step) {
    if (grey == kGreyTarget)
        return;
    const int32_t distance =
        grey < kGreyTarget ? WrapSub(kGreyTarget, grey) : WrapSub(grey, kGreyTarget);
    const uint32_t enlarged = static_cast<uint32_t>(WrapMul(_NAVI_ENLARGE_K, distance));
    *step = _NAVI_K_value == 0 ? 1U : std::max(enlarged / _NAVI_K_value, 1U);
}

void _NAVI_UpdateDC() {
    UpdateStep(static_cast<int32_t>(_NAVI_top_mean), &_NAVI_delta_dc_val_top);
}

void _NAVI_UpdateDC_mean() {
    UpdateStep(static_cast<int32_t>(_NAVI_mean), &_NAVI_delta_dc_val_mean);
}

// The DC cannot go further in the wanted direction.
void StopAtLimit() {
    _NAVI_flag_recommend_pre = 3;
    _NAVI_NoMoreProcess = 0;
}

uint32_t Raised() {
    return std::min(WrapAddU(_NAVI_dc_current, _NAVI_delta_dc_val), kDcMax);
}

uint32_t Lowered() {
    const int32_t reachable = WrapAdd(_NAVI_DC_REF, static_cast<int32_t>(_NAVI_delta_dc_val));
    return static_cast<int32_t>(_NAVI_dc_current) > reachable
               ? WrapSubU(_NAVI_dc_current, _NAVI_delta_dc_val)
               : static_cast<uint32_t>(_NAVI_DC_REF);
}

}  // namespace

void _NAVI_GetDelta() {
    _NAVI_UpdateDC();
    _NAVI_UpdateDC_mean();
    if (_NAVI_flag_recommend == 0) {
        _NAVI_delta_dc_orient = 0;
        _NAVI_delta_dc_val = 0;
    } else if (_NAVI_flag_recommend == 1 || _NAVI_flag_recommend == -1) {
        _NAVI_delta_dc_orient = -_NAVI_flag_recommend;
        _NAVI_delta_dc_val = _NAVI_delta_dc_val_mean;
    }
    if (_NAVI_flag_non_linear != 0)
        _NAVI_delta_dc_val = std::max(_NAVI_delta_dc_val, kStepSaturated);
}

void _NAVI_Change0C() {
    if (_NAVI_delta_dc_orient != 1 && _NAVI_delta_dc_orient != -1) {
        _NAVI_NoMoreProcess = 0;
        return;
    }
    const bool raise = _NAVI_delta_dc_orient == 1;
    const uint32_t limit = raise ? kDcMax : static_cast<uint32_t>(_NAVI_DC_REF);
    if (_NAVI_dc_current == limit) {
        StopAtLimit();
        return;
    }
    _NAVI_dc_current = raise ? Raised() : Lowered();
    _NAVI_NoMoreProcess = _NAVI_flag_effective == 0 ? 1 : 2;
}

}  // namespace fpnavi
