// The plain model of the finger-navigation library: every function and every variable under its
// own name, written for a reader and for step-by-step comparison. Nothing here is fast. The model
// shares no code, type or header with the library it is compared with; all of it lives in the
// namespace `reference` over file-level state, for one thread.

#ifndef REFERENCE_REFERENCE_H
#define REFERENCE_REFERENCE_H

#include <cstdint>
#include <string>
#include <vector>

namespace reference {

// ---- Types and key values ----------------------------------------------------------------------

constexpr int32_t VKEY_NONE = 0;
constexpr int32_t VKEY_UP = 1;
constexpr int32_t VKEY_DOWN = 2;
constexpr int32_t VKEY_RIGHT = 3;
constexpr int32_t VKEY_LEFT = 4;
constexpr int32_t VKEY_NO_MOVE = 5;

constexpr int32_t kVoteCapacity = 100;  // entries per array of the vote record
constexpr int32_t kMaxPairs = 99;       // pair n writes entry n + 1 as well

// One frame. The frame owns both buffers (width * height bytes each, row by row, from malloc).
struct NaviFrame_t {
    int32_t width;   // columns
    int32_t height;  // rows
    uint8_t* pData;  // grey values
    uint8_t* pType;  // 1 finger, 0 background, 255 gap of a full image
    int32_t cvr;     // coverage, percent
    uint8_t range;   // distance of the two grey class means
    int32_t xc;      // centroid in percent from the centre, growing to the right
    int32_t yc;      // centroid in percent from the centre, growing upwards
};

// The record of a gesture. Pair n fills entry n; the per-frame arrays also get entry n + 1.
struct NaviVoteInfo_t {
    int32_t calc_cnt;
    int32_t xc[kVoteCapacity];
    int32_t yc[kVoteCapacity];
    int32_t cvr[kVoteCapacity];
    int32_t dx_ct[kVoteCapacity];
    int32_t dy_ct[kVoteCapacity];
    int32_t dx_fp[kVoteCapacity];
    int32_t dy_fp[kVoteCapacity];
    int32_t diff[kVoteCapacity];
    int32_t vkey_fp[kVoteCapacity];
    int32_t vkey_ct[kVoteCapacity];
    int32_t dx_sum;
    int32_t dy_sum;
    int32_t xc_ds[kVoteCapacity];
    int32_t yc_ds[kVoteCapacity];
    int32_t cvr_ds[kVoteCapacity];
    int32_t dx_ds[kVoteCapacity];
    int32_t dy_ds[kVoteCapacity];
};

struct _NAVI_SIZE {
    int32_t iHeight;
    int32_t iWidth;
};

// A band, both bounds inclusive.
struct _NAVI_struRange {
    uint32_t RANGE_LOW;
    uint32_t RANGE_HIGH;
};

// A rectangle: starts inclusive, ends exclusive.
struct _NAVI_BlkNode {
    int32_t StartWidth;
    int32_t StartHeight;
    int32_t EndWidth;
    int32_t EndHeight;
};

// Outcomes of FingerNoMove.
enum : int32_t {
    kFingerFailed = -1,
    kFingerNoMove = 0,
    kFingerUndetermined = 1,
    kFingerMoved = 2,
};

// ---- Parameters --------------------------------------------------------------------------------

constexpr int32_t kParamNum = 78;

// Load-time values in the order of the parameter array.
constexpr int32_t kDefaultParams[kParamNum] = {
    0,   3,     8,   4,   5,   12,  180, 3,   2,   8,    // 0
    40,  48,    2,   1,   0,   2,   0,   1,   128, 128,  // 10
    374, 10002, 180, 220, 160, 240, 140, 220, 160, 200,  // 20
    10,  15,    80,  200, 8,   2,   7,   18,  40,  20,   // 30
    8,   8,     32,  16,  50,  15,  2,   2,   200, 10,   // 40
    6,   100,   30,  30,  7,   40,  90,  0,   1,   0,    // 50
    3,   100,   -1,  -1,  1,   3,   10,  80,  20,  4,    // 60
    9,   80,    50,  1,   5,   12,  10,  0               // 70
};

// Parameters 0 and up: direction filters of the vote.
extern int32_t s_sensorBackFlag;        // 1 exchanges left and right
extern int32_t s_directionControlFlag;  // 0 no key, 1 vertical keys, 2 horizontal keys, else all

// Parameters 2 and up: hg block geometry, in pixels and blocks.
extern int32_t s_blockWidthHg;
extern int32_t s_blockHeightHg;
extern int32_t s_blockColNumHg;
extern int32_t s_blockRowNumHg;

// Parameters 6 and up: hg finger test, centroid and hg vote thresholds.
extern int32_t s_meanThreshold;        // grey level
extern int32_t s_deformThreshold;      // coverage change per unit of travel
extern int32_t s_singleMoveThreshold;  // least travel of a pair
extern int32_t s_totalMoveThreshold;   // least travel of a gesture
extern int32_t s_imageWidthHg;         // size of the hg finger test
extern int32_t s_imageHeightHg;
extern int32_t s_moveCntMinThr;  // count of moving verdicts
extern int32_t s_moveCntEffThr;  // count of moving verdicts

// Parameters 14 and up: operating mode: 1 hg, 2 fp with double scan, anything else fp.
extern int32_t s_modeFlag;

// Parameters 15 and up: tuning.
extern int32_t _NAVI_TimeOut_threshold;             // calls, 0 or less: no limit
extern int32_t _NAVI_blk_selection_mode;            // rank 0..3 of the measured corner
extern int32_t iDCMode;                             // register encoding, 1 or 0
extern int32_t _NAVI_DC_REF;                        // lowest DC value
extern int32_t _NAVI_TOP_REF;                       // stored only
extern int32_t _NAVI_INPUT_K;                       // factor at the reference gain
extern int32_t _NAVI_GAIN_REF;                      // packed like _NAVI_G20C
extern _NAVI_struRange _NAVI_range_recommend;       // top grey, inclusive
extern _NAVI_struRange _NAVI_range_effective;       // stored only
extern _NAVI_struRange _NAVI_range_mean;            // mean grey, inclusive
extern _NAVI_struRange _NAVI_range_mean_recommend;  // mean grey, inclusive
extern _NAVI_struRange _NAVI_top_mean_interval;     // percent from the brightest

// Parameters 32 and up: size of the whole sensor, in pixels.
extern int32_t s_sensorWidth;
extern int32_t s_sensorHeight;

// Parameters 34 and up: fp block geometry, in pixels and blocks.
extern int32_t s_blockWidthFp;
extern int32_t s_blockHeightFp;
extern int32_t s_blockColNumFp;
extern int32_t s_blockRowNumFp;

// Parameters 38 and up: tiles of the full image, in pixels.
extern int32_t s_centerWidth;
extern int32_t s_centerHeight;
extern int32_t s_boundWidth;
extern int32_t s_boundHeight;
extern int32_t s_gapWidth;
extern int32_t s_gapHeight;

// Parameters 44 and up: coverage gates in percent, small-move tolerances in pixels.
extern int32_t s_coverageMinFp;   // gate of template matching
extern int32_t s_coverageMinEff;  // gate of a pair
extern int32_t s_smallMoveTolCol;
extern int32_t s_smallMoveTolRow;

// Parameters 48 and up: template matching.
extern int32_t s_overlapAreaMinFp;  // pixels
extern int32_t s_templateWidth;
extern int32_t s_templateHeight;
extern int32_t s_candidateNum;      // candidates kept
extern int32_t s_diffThresholdStr;  // grey levels
extern int32_t s_diffThresholdTol;  // grey levels

// Parameters 54 and up: fp finger test: texture response, mean grey.
extern int32_t s_fftResThreshold;
extern int32_t s_meanThresholdFp;

// Parameters 56 and up: centroid gate, layout switches and histogram cut.
extern int32_t s_coverageMaxCt;         // percent
extern int32_t s_downSampleFlag;        // 1 halves two other parameters
extern int32_t s_multiBloclkFlag;       // 1: nine tiles with gaps
extern int32_t s_dimensionlessFlag;     // 1: travel in percent
extern int32_t s_cutOffPercent;         // percent of the histogram at each end
extern int32_t s_overlapAreaMinNoMove;  // pixels

// Parameters 62 and up: fp vote.
extern int32_t s_totalMoveThresholdLongpressCt;  // -1: off
extern int32_t s_totalMoveThresholdLongpressFp;  // -1: off
extern int32_t s_open_vkey_none_navi;            // 1 allows VKEY_NONE
extern int32_t s_ct_none_threshold;
extern int32_t s_ct_not_move_threshold;
extern int32_t s_fpImp;  // percent
extern int32_t s_ctImp;  // percent
extern int32_t s_minDelta;
extern int32_t s_fpMoveThreshold;

// Parameters 71 and up: finger tests and logging.
extern int32_t s_rangeThreshold;          // grey levels
extern int32_t s_blkMeanDiffThreshold;    // grey levels
extern int32_t s_highSensitiveMode;       // 1 adds the quadrant test
extern int32_t s_fftFreqLow;              // stored only
extern int32_t s_fftFreqHigh;             // stored only
extern int32_t s_DoubleScanCvrThreshold;  // percent
extern int32_t s_logShowFlag;             // 1 writes the log lines

// Derived by SetNaviParam, 0 before it.
extern int32_t s_blockWidth;
extern int32_t s_blockHeight;
extern int32_t s_blockColNum;
extern int32_t s_blockRowNum;
extern int32_t s_doubleScanFlag;  // sticky: never put back to 0 by SetNaviParam
extern int32_t s_imageHeight;
extern int32_t s_imageWidth;
extern int32_t s_fullImageHeight;
extern int32_t s_fullImageWidth;
extern int32_t s_tpltNum;
extern int32_t s_tpltHeightUD;
extern int32_t s_tpltWidthUD;
extern int32_t s_tpltHeightLR;
extern int32_t s_tpltWidthLR;

// ---- Gesture state -----------------------------------------------------------------------------

extern NaviFrame_t s_imageCurr;
extern NaviFrame_t s_imagePrev;
extern NaviFrame_t s_fullImageCurr;
extern NaviFrame_t s_fullImagePrev;
extern NaviVoteInfo_t s_voteInfo;
extern int32_t s_frameNum;
extern int32_t s_lastFrameFlag;
extern int32_t s_tuneOkFlag;
extern uint8_t DoubleScanZonePrev[64];
extern uint8_t DoubleScanZoneCurr[64];

// ---- Tuning state ------------------------------------------------------------------------------

extern uint32_t _NAVI_dc_mode;
extern uint32_t _NAVI_dc_current;
extern uint32_t _NAVI_dc_residual;
extern uint32_t _NAVI_dc_pre;
extern uint32_t _NAVI_mean;
extern uint32_t _NAVI_top_mean;
extern int32_t _NAVI_flag_effective;  // the flags: -1 below, 0 within, 1 above, 3 not computed
extern int32_t _NAVI_flag_recommend;
extern int32_t _NAVI_flag_recommend_top;
extern int32_t _NAVI_flag_recommend_pre;
extern int32_t _NAVI_flag_non_linear;
extern uint32_t _NAVI_G20C;
extern uint32_t _NAVI_K_value;
extern uint32_t _NAVI_delta_dc_val_top;
extern uint32_t _NAVI_delta_dc_val_mean;
extern uint32_t _NAVI_delta_dc_val;
extern int32_t _NAVI_delta_dc_orient;
extern uint32_t _NAVI_NoMoreProcess;
extern int32_t _NAVI_TimeOut;
extern int32_t _NAVI_flag_param_reset;
extern _NAVI_SIZE sImgSizeInfo;
extern uint32_t _NAVI_img_histogram[256];

constexpr int32_t _NAVI_ENLARGE_K = 100;  // scale of the step division
constexpr int32_t _NAVI_gain_ratio_21[8] = {10, 20, 40, 56, 70, 80, 112, 140};
constexpr int32_t _NAVI_gain_ratio_43[8] = {1, 2, 3, 4, 5, 6, 7, 8};

// ---- For tests ---------------------------------------------------------------------------------

// The texture test of the finger-detect module: fills ten results, five responses and five means.
// At load time it leaves the results as they are.
extern void (*FingerBLKTest)(const uint8_t* image, int32_t width, int32_t height, int32_t* results,
                             int32_t mode);

// When not null, receives each log line as "4 TQCODE " followed by the formatted text, its final
// line feed included, with 0 for the process and thread ids.
extern std::vector<std::string>* s_logSink;

// Every allocation attempt takes the number s_allocationCount and advances it. Attempt number
// s_failAllocation fails, and so does every attempt from number s_failAllocationsFrom on; -1 is
// off. Numbers start at 0.
extern int64_t s_allocationCount;
extern int64_t s_failAllocation;
extern int64_t s_failAllocationsFrom;

// Puts every variable above back to its load-time value, the test hooks included, and frees the
// buffers of the four frames.
void ResetAll();

// ---- Exported functions ------------------------------------------------------------------------

int32_t SetNaviParam(const int32_t* params);
void FpNaviClear();
NaviVoteInfo_t* PrintNaviLog();
int32_t GetNaviBlock(const uint8_t* p_data_origin, int32_t width, int32_t height,
                     uint8_t* p_data_resort);
int32_t GetDoubleScanNaviBlock(uint32_t gReg24, uint32_t gReg28);
int32_t OrientationCalc(const uint8_t* data_prev, const uint8_t* data_curr, int32_t time_out);
int32_t Voting(int32_t time_out);
int32_t vmk_fp_navigation_detect_finger_status(const uint8_t* p_data);
int32_t _NAVI_Tune(const uint8_t* img, int32_t img_width, int32_t img_height, uint32_t* iTuneDAC,
                   const uint32_t* iGain20, const uint32_t* iGain2C);

// ---- Context and frames ------------------------------------------------------------------------

void VoteInfoClear(NaviVoteInfo_t* voteInfo);
int32_t ImgInit(NaviFrame_t* img, int32_t i_start, int32_t i_end, int32_t j_start, int32_t j_end,
                const uint8_t* data);
void ImgClear(NaviFrame_t* img);
int32_t ImgCopy(NaviFrame_t* img_dst, const NaviFrame_t* img_src);
int32_t GetFullImg(const NaviFrame_t* img, NaviFrame_t* full_img);
int32_t DoubleScanGetCenterAndCoverage(const uint8_t* DoubleScanZone, int32_t* xc, int32_t* yc,
                                       int32_t* cvr);

// ---- Pre-processing ----------------------------------------------------------------------------

int32_t ImgPreProcess(NaviFrame_t* img);
int32_t CalcBiThr(const NaviFrame_t* img, int32_t* thr, int32_t* scale);
void GetFingerRidge(NaviFrame_t* img, int32_t thr);
int32_t StretchRange(NaviFrame_t* img, uint8_t scale);

// ---- Motion of a frame pair --------------------------------------------------------------------

int32_t OrntCalcProcess();
int32_t GetCenterAndCoverage(NaviFrame_t* img);
int32_t CalcCenterMove(const NaviFrame_t* img_prev, const NaviFrame_t* img_curr,
                       NaviVoteInfo_t* voteInfo);
int32_t CalcDoubleScanMove(const uint8_t* pPrev, const uint8_t* pCurr, NaviVoteInfo_t* voteInfo);
int32_t FingerNoMove(const NaviFrame_t* img_prev, const NaviFrame_t* img_curr);
int32_t MaxHeapify(uint32_t* arr, int32_t len, int32_t i);

// Both arrays hold s_candidateNum entries. FindMatch releases both with free.
int32_t FindCandidate(int32_t* candidate_di, int32_t* candidate_dj);
int32_t FindMatch(int32_t* candidate_di, int32_t* candidate_dj, int32_t* dx, int32_t* dy,
                  int32_t* difference);
int32_t CalcImgJoint();

// ---- Vote --------------------------------------------------------------------------------------

int32_t Voting_hg_mode();
int32_t Voting_fp_mode();

// ---- Finger presence ---------------------------------------------------------------------------

int32_t DoubleScanFingerDetect(const uint8_t* DoubleScanZone);
int32_t NavFingerDetectHg(const uint8_t* p_data);
int32_t GetBlkMeanMin(const uint8_t* p_data, int32_t* blk_mean_min);
int32_t NavFingerDetectFp(const uint8_t* p_data);
int32_t GetBlkMeanDiff(const uint8_t* buffer, int32_t* blk_mean_diff);
int32_t GetGreyRange(const uint8_t* buffer, int32_t* range);

// ---- Tuning ------------------------------------------------------------------------------------

// 1 when the call goes on, 0 when the DC value was too low and another frame is needed.
int32_t _NAVI_Tune_Init(const uint8_t* img, uint32_t* iTuneDAC, const uint32_t* iGain20,
                        const uint32_t* iGain2C);
void _NAVI_Tune_Process();
void _NAVI_Tune_Operation();
void _NAVI_Tune_Finalize(uint32_t* iTuneDAC);
void _NAVI_Tune_Param_Reset();
int32_t _NAVI_ImgHistogram(const uint8_t* img, int32_t height, int32_t width);
void _NAVI_SortIndex(int32_t* fValue, int32_t* iIndex, int32_t len);
int32_t _NAVI_CalcTop(uint32_t X, uint32_t Y, const uint32_t* histogram);
int32_t _NAVI_K_CALC(uint32_t g);
void _NAVI_GetDelta();
void _NAVI_UpdateDC();
void _NAVI_UpdateDC_mean();
void _NAVI_Change0C();

}  // namespace reference

#endif
