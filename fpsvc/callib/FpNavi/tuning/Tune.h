// Tuning, the state behind _NAVI_Tune. Owns the values below; Tune.cpp alone writes them, and
// s_tuneOkFlag. Each call measures the frame (TuneMeasure), decides the step (TuneStep) and assigns
// the outcome here.
#ifndef FPNAVI_TUNE_H
#define FPNAVI_TUNE_H

#include <cstdint>

#include "FpNavi.h"

namespace fpnavi {

// Of the last frame that could be measured; _NAVI_mean is 0 after one that could not. Flags: -1
// below a band, 0 inside, 1 above, 3 not computed yet.
extern uint32_t _NAVI_img_histogram[256];  // of the measured block, by grey level
extern uint32_t _NAVI_mean;                // grey of the measured block; 3 before the first call
extern uint32_t _NAVI_top_mean;            // grey of its brightest pixels; 3 before the first call
extern int32_t _NAVI_flag_effective;       // _NAVI_mean against _NAVI_range_mean
extern int32_t _NAVI_flag_recommend;       // _NAVI_mean against _NAVI_range_mean_recommend
extern int32_t _NAVI_flag_recommend_top;  // _NAVI_top_mean against _NAVI_range_recommend; kept only
extern int32_t _NAVI_flag_non_linear;     // 1: mean and top both lie outside 10..250
extern uint32_t _NAVI_G20C;               // packed gain code: four fields of 4 bits
extern uint32_t _NAVI_K_value;            // grey levels per DC step, in hundredths

// The DC and its steps.
extern uint32_t _NAVI_dc_mode;            // iDCMode at the last call
extern uint32_t _NAVI_dc_residual;        // DC mode 1: the register's bits above the DC byte
extern uint32_t _NAVI_dc_current;         // the DC that is being tuned
extern uint32_t _NAVI_dc_pre;             // DC that was in the sensor at the last call
extern int32_t _NAVI_flag_recommend_pre;  // _NAVI_flag_recommend of the call before; 3 without one
extern uint32_t _NAVI_delta_dc_val_top;   // step that would bring the top grey to 180; kept only
extern uint32_t _NAVI_delta_dc_val_mean;  // step that would bring the mean to 180
extern uint32_t _NAVI_delta_dc_val;       // step to apply
extern int32_t _NAVI_delta_dc_orient;     // 1 raise, -1 lower, 0 neither

// 0 no further step needed, 1 stepped though the mean is effective, 2 stepped, look again.
extern uint32_t _NAVI_NoMoreProcess;

// The run.
extern int32_t _NAVI_TimeOut;           // calls since the last completed tuning
extern int32_t _NAVI_flag_param_reset;  // 1: the last call completed, the next starts afresh
extern _NAVI_SIZE sImgSizeInfo;         // image size at the last call

// Single steps on the state above.

// Measures the corner block of the image (height rows of width bytes, the caller's; both positive)
// whose mean has the rank _NAVI_blk_selection_mode: _NAVI_mean and _NAVI_img_histogram. Returns 0;
// -1, with a mean of 0, the old histogram and a log line, when the image cannot be divided by 16.
int32_t _NAVI_ImgHistogram(const uint8_t* img, int32_t height, int32_t width);

// SizeStep: direction and size of the next step from the measured greys.
void _NAVI_GetDelta();

// ApplyStep: the step applied to _NAVI_dc_current, within _NAVI_DC_REF..kDcMax.
void _NAVI_Change0C();

}  // namespace fpnavi

#endif  // FPNAVI_TUNE_H
