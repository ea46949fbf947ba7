// Tuning, the driver behind _NAVI_Tune: a state machine over the host's calls. Owns the values
// below and, besides, writes those of TuneHistogram and TuneStep, and s_tuneOkFlag.
#ifndef FPNAVI_TUNE_H
#define FPNAVI_TUNE_H

#include <cstdint>

#include "FpNavi.h"

namespace fpnavi {

extern uint32_t _NAVI_dc_mode;            // iDCMode at the last call
extern uint32_t _NAVI_dc_residual;        // DC mode 1: the register's bits above the DC byte
extern uint32_t _NAVI_dc_pre;             // DC that was in the sensor at the last call
extern int32_t _NAVI_flag_recommend_top;  // _NAVI_top_mean against _NAVI_range_recommend; kept only
extern int32_t _NAVI_TimeOut;             // calls since the last completed tuning
extern int32_t _NAVI_flag_param_reset;    // 1: the last call completed, the next starts afresh
extern _NAVI_SIZE sImgSizeInfo;           // image size at the last call

}  // namespace fpnavi

#endif  // FPNAVI_TUNE_H
