// The parameter block: the 78 tunable numbers that SetNaviParam stores, and the geometry derived
// from them. Owns all of them; SetNaviParam alone writes them. Every value is stored unchecked.
#ifndef FPNAVI_NAVIPARAM_H
#define FPNAVI_NAVIPARAM_H

#include <cstdint>

#include "FpNavi.h"

namespace fpnavi {

// In the order of the parameter block. docs/parameters.md tells what each does.
extern int32_t s_sensorBackFlag;
extern int32_t s_directionControlFlag;
extern int32_t s_blockWidthHg;
extern int32_t s_blockHeightHg;
extern int32_t s_blockColNumHg;
extern int32_t s_blockRowNumHg;
extern int32_t s_meanThreshold;
extern int32_t s_deformThreshold;
extern int32_t s_singleMoveThreshold;
extern int32_t s_totalMoveThreshold;
extern int32_t s_imageWidthHg;
extern int32_t s_imageHeightHg;
extern int32_t s_moveCntMinThr;
extern int32_t s_moveCntEffThr;
extern int32_t s_modeFlag;
extern int32_t _NAVI_TimeOut_threshold;
extern int32_t _NAVI_blk_selection_mode;
extern int32_t iDCMode;
extern int32_t _NAVI_DC_REF;
extern int32_t _NAVI_TOP_REF;
extern int32_t _NAVI_INPUT_K;
extern int32_t _NAVI_GAIN_REF;
extern _NAVI_struRange _NAVI_range_recommend;
extern _NAVI_struRange _NAVI_range_effective;
extern _NAVI_struRange _NAVI_range_mean;
extern _NAVI_struRange _NAVI_range_mean_recommend;
extern _NAVI_struRange _NAVI_top_mean_interval;
extern int32_t s_sensorWidth;
extern int32_t s_sensorHeight;
extern int32_t s_blockWidthFp;
extern int32_t s_blockHeightFp;
extern int32_t s_blockColNumFp;
extern int32_t s_blockRowNumFp;
extern int32_t s_centerWidth;
extern int32_t s_centerHeight;
extern int32_t s_boundWidth;
extern int32_t s_boundHeight;
extern int32_t s_gapWidth;
extern int32_t s_gapHeight;
extern int32_t s_coverageMinFp;
extern int32_t s_coverageMinEff;
extern int32_t s_smallMoveTolCol;
extern int32_t s_smallMoveTolRow;
extern int32_t s_overlapAreaMinFp;
extern int32_t s_templateWidth;
extern int32_t s_templateHeight;
extern int32_t s_candidateNum;
extern int32_t s_diffThresholdStr;
extern int32_t s_diffThresholdTol;
extern int32_t s_fftResThreshold;
extern int32_t s_meanThresholdFp;
extern int32_t s_coverageMaxCt;
extern int32_t s_downSampleFlag;
extern int32_t s_multiBloclkFlag;
extern int32_t s_dimensionlessFlag;
extern int32_t s_cutOffPercent;
extern int32_t s_overlapAreaMinNoMove;
extern int32_t s_totalMoveThresholdLongpressCt;
extern int32_t s_totalMoveThresholdLongpressFp;
extern int32_t s_open_vkey_none_navi;
extern int32_t s_ct_none_threshold;
extern int32_t s_ct_not_move_threshold;
extern int32_t s_fpImp;
extern int32_t s_ctImp;
extern int32_t s_minDelta;
extern int32_t s_fpMoveThreshold;
extern int32_t s_rangeThreshold;
extern int32_t s_blkMeanDiffThreshold;
extern int32_t s_highSensitiveMode;
extern int32_t s_fftFreqLow;
extern int32_t s_fftFreqHigh;
extern int32_t s_DoubleScanCvrThreshold;
extern int32_t s_logShowFlag;

// Derived by SetNaviParam; all 0 until then.
extern int32_t s_blockWidth;       // pixels
extern int32_t s_blockHeight;      // pixels
extern int32_t s_blockColNum;      // blocks in a row
extern int32_t s_blockRowNum;      // rows of blocks
extern int32_t s_doubleScanFlag;   // 1 once a mode 2 has been set; never cleared
extern int32_t s_imageWidth;       // pixels
extern int32_t s_imageHeight;      // pixels
extern int32_t s_fullImageWidth;   // pixels, gaps included
extern int32_t s_fullImageHeight;  // pixels, gaps included
extern int32_t s_tpltNum;          // templates in use: 4 or 8
extern int32_t s_tpltWidthUD;      // template for up and down: wide and flat
extern int32_t s_tpltHeightUD;
extern int32_t s_tpltWidthLR;  // template for left and right: the other turned by a quarter
extern int32_t s_tpltHeightLR;

}  // namespace fpnavi

#endif  // FPNAVI_NAVIPARAM_H
