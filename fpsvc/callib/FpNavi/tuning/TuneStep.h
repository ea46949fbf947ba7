// Tuning, the step: in which direction and how far the DC goes, within its limits. Owns the values
// below; Tune writes them too, it classifies, resets and bisects.
#ifndef FPNAVI_TUNESTEP_H
#define FPNAVI_TUNESTEP_H

#include <cstdint>

namespace fpnavi {

inline constexpr uint32_t kDcMax = 255;  // the DC field has 8 bits

// Flags: -1 below a band, 0 inside, 1 above, 3 not computed yet.
extern int32_t _NAVI_flag_effective;      // _NAVI_mean against _NAVI_range_mean
extern int32_t _NAVI_flag_recommend;      // _NAVI_mean against _NAVI_range_mean_recommend
extern int32_t _NAVI_flag_recommend_pre;  // the same of the call before; 3 without one
extern int32_t _NAVI_flag_non_linear;     // 1: mean and top both lie outside 10..250

extern uint32_t _NAVI_dc_current;         // the DC that is being tuned
extern uint32_t _NAVI_delta_dc_val_top;   // step that would bring the top grey to 180; kept only
extern uint32_t _NAVI_delta_dc_val_mean;  // step that would bring the mean to 180
extern uint32_t _NAVI_delta_dc_val;       // step to apply
extern int32_t _NAVI_delta_dc_orient;     // 1 raise, -1 lower, 0 neither

// 0 no further step needed, 1 stepped though the mean is effective, 2 stepped, look again.
extern uint32_t _NAVI_NoMoreProcess;

// Sets direction and size of the next step from the measured greys.
void _NAVI_GetDelta();

// Applies the step to _NAVI_dc_current, within _NAVI_DC_REF..kDcMax.
void _NAVI_Change0C();

}  // namespace fpnavi

#endif  // FPNAVI_TUNESTEP_H
