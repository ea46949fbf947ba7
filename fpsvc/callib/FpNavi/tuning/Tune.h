// Tuning, the state behind _NAVI_Tune. Owns the values below; Tune.cpp alone writes them, and
// s_tuneOkFlag. Each call measures the frame (TuneMeasure), decides the step (TuneStep) and assigns
// the outcome here.
#ifndef FPNAVI_TUNE_H
#define FPNAVI_TUNE_H

#include <cstdint>

#include "FpNavi.h"
#include "tuning/TuneMeasure.h"
#include "tuning/TuneStep.h"

namespace fpnavi {

// Of the last frame that could be measured, but for a mean of 0 after one that could not.
inline GreyReading s_reading = {{3, {}}, 3, 3, 3, 3, 0, 0, 0};
inline DcState s_dc = {3, 3, 3, 0, 0, 0, 0, 0};

// Their members by names of their own.
inline constexpr uint32_t (&_NAVI_img_histogram)[kGreyLevels] = s_reading.histogram;
inline constexpr uint32_t& _NAVI_mean = s_reading.mean;
inline constexpr uint32_t& _NAVI_top_mean = s_reading.top;
inline constexpr int32_t& _NAVI_flag_effective = s_reading.effective;
inline constexpr int32_t& _NAVI_flag_recommend = s_reading.recommend;
inline constexpr int32_t& _NAVI_flag_recommend_top = s_reading.recommendTop;
inline constexpr int32_t& _NAVI_flag_non_linear = s_reading.nonLinear;
inline constexpr uint32_t& _NAVI_G20C = s_reading.gainCode;
inline constexpr uint32_t& _NAVI_K_value = s_reading.gainFactor;
inline constexpr uint32_t& _NAVI_dc_current = s_dc.current;
inline constexpr uint32_t& _NAVI_dc_pre = s_dc.pre;
inline constexpr int32_t& _NAVI_flag_recommend_pre = s_dc.recommendPre;
inline constexpr uint32_t& _NAVI_delta_dc_val_top = s_dc.stepTop;
inline constexpr uint32_t& _NAVI_delta_dc_val_mean = s_dc.stepMean;
inline constexpr uint32_t& _NAVI_delta_dc_val = s_dc.step;
inline constexpr int32_t& _NAVI_delta_dc_orient = s_dc.orient;
inline constexpr uint32_t& _NAVI_NoMoreProcess = s_dc.noMoreProcess;

// The run.
inline uint32_t _NAVI_dc_mode = 0;          // iDCMode at the last call
inline uint32_t _NAVI_dc_residual = 0;      // DC mode 1: the register's bits above the DC byte
inline int32_t _NAVI_TimeOut = 0;           // calls since the last completed tuning
inline int32_t _NAVI_flag_param_reset = 0;  // 1: the last call completed, the next starts afresh
inline _NAVI_SIZE sImgSizeInfo = {0, 0};    // image size at the last call

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
