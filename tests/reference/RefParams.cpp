// The parameter block: the 78 parameters with their load-time values, the geometry derived from
// them and SetNaviParam, which replaces all of them at once. No value is range-checked here; the
// functions that use a geometry reject what they cannot work with.

#include "RefInternal.h"
#include "RefMath.h"
#include "Reference.h"

namespace reference {

namespace {

constexpr uint32_t DefaultBound(int32_t index) {
    return static_cast<uint32_t>(kDefaultParams[index]);
}

}  // namespace

int32_t s_sensorBackFlag = kDefaultParams[0];
int32_t s_directionControlFlag = kDefaultParams[1];
int32_t s_blockWidthHg = kDefaultParams[2];
int32_t s_blockHeightHg = kDefaultParams[3];
int32_t s_blockColNumHg = kDefaultParams[4];
int32_t s_blockRowNumHg = kDefaultParams[5];
int32_t s_meanThreshold = kDefaultParams[6];
int32_t s_deformThreshold = kDefaultParams[7];
int32_t s_singleMoveThreshold = kDefaultParams[8];
int32_t s_totalMoveThreshold = kDefaultParams[9];
int32_t s_imageWidthHg = kDefaultParams[10];
int32_t s_imageHeightHg = kDefaultParams[11];
int32_t s_moveCntMinThr = kDefaultParams[12];
int32_t s_moveCntEffThr = kDefaultParams[13];
int32_t s_modeFlag = kDefaultParams[14];
int32_t _NAVI_TimeOut_threshold = kDefaultParams[15];
int32_t _NAVI_blk_selection_mode = kDefaultParams[16];
int32_t iDCMode = kDefaultParams[17];
int32_t _NAVI_DC_REF = kDefaultParams[18];
int32_t _NAVI_TOP_REF = kDefaultParams[19];
int32_t _NAVI_INPUT_K = kDefaultParams[20];
int32_t _NAVI_GAIN_REF = kDefaultParams[21];
_NAVI_struRange _NAVI_range_recommend = {DefaultBound(22), DefaultBound(23)};
_NAVI_struRange _NAVI_range_effective = {DefaultBound(24), DefaultBound(25)};
_NAVI_struRange _NAVI_range_mean = {DefaultBound(26), DefaultBound(27)};
_NAVI_struRange _NAVI_range_mean_recommend = {DefaultBound(28), DefaultBound(29)};
_NAVI_struRange _NAVI_top_mean_interval = {DefaultBound(30), DefaultBound(31)};
int32_t s_sensorWidth = kDefaultParams[32];
int32_t s_sensorHeight = kDefaultParams[33];
int32_t s_blockWidthFp = kDefaultParams[34];
int32_t s_blockHeightFp = kDefaultParams[35];
int32_t s_blockColNumFp = kDefaultParams[36];
int32_t s_blockRowNumFp = kDefaultParams[37];
int32_t s_centerWidth = kDefaultParams[38];
int32_t s_centerHeight = kDefaultParams[39];
int32_t s_boundWidth = kDefaultParams[40];
int32_t s_boundHeight = kDefaultParams[41];
int32_t s_gapWidth = kDefaultParams[42];
int32_t s_gapHeight = kDefaultParams[43];
int32_t s_coverageMinFp = kDefaultParams[44];
int32_t s_coverageMinEff = kDefaultParams[45];
int32_t s_smallMoveTolCol = kDefaultParams[46];
int32_t s_smallMoveTolRow = kDefaultParams[47];
int32_t s_overlapAreaMinFp = kDefaultParams[48];
int32_t s_templateWidth = kDefaultParams[49];
int32_t s_templateHeight = kDefaultParams[50];
int32_t s_candidateNum = kDefaultParams[51];
int32_t s_diffThresholdStr = kDefaultParams[52];
int32_t s_diffThresholdTol = kDefaultParams[53];
int32_t s_fftResThreshold = kDefaultParams[54];
int32_t s_meanThresholdFp = kDefaultParams[55];
int32_t s_coverageMaxCt = kDefaultParams[56];
int32_t s_downSampleFlag = kDefaultParams[57];
int32_t s_multiBloclkFlag = kDefaultParams[58];
int32_t s_dimensionlessFlag = kDefaultParams[59];
int32_t s_cutOffPercent = kDefaultParams[60];
int32_t s_overlapAreaMinNoMove = kDefaultParams[61];
int32_t s_totalMoveThresholdLongpressCt = kDefaultParams[62];
int32_t s_totalMoveThresholdLongpressFp = kDefaultParams[63];
int32_t s_open_vkey_none_navi = kDefaultParams[64];
int32_t s_ct_none_threshold = kDefaultParams[65];
int32_t s_ct_not_move_threshold = kDefaultParams[66];
int32_t s_fpImp = kDefaultParams[67];
int32_t s_ctImp = kDefaultParams[68];
int32_t s_minDelta = kDefaultParams[69];
int32_t s_fpMoveThreshold = kDefaultParams[70];
int32_t s_rangeThreshold = kDefaultParams[71];
int32_t s_blkMeanDiffThreshold = kDefaultParams[72];
int32_t s_highSensitiveMode = kDefaultParams[73];
int32_t s_fftFreqLow = kDefaultParams[74];
int32_t s_fftFreqHigh = kDefaultParams[75];
int32_t s_DoubleScanCvrThreshold = kDefaultParams[76];
int32_t s_logShowFlag = kDefaultParams[77];

int32_t s_blockWidth = 0;
int32_t s_blockHeight = 0;
int32_t s_blockColNum = 0;
int32_t s_blockRowNum = 0;
int32_t s_doubleScanFlag = 0;
int32_t s_imageHeight = 0;
int32_t s_imageWidth = 0;
int32_t s_fullImageHeight = 0;
int32_t s_fullImageWidth = 0;
int32_t s_tpltNum = 0;
int32_t s_tpltHeightUD = 0;
int32_t s_tpltWidthUD = 0;
int32_t s_tpltHeightLR = 0;
int32_t s_tpltWidthLR = 0;

namespace {

void StoreVoteAndHgParams(const int32_t* params) {
    s_sensorBackFlag = params[0];
    s_directionControlFlag = params[1];
    s_blockWidthHg = params[2];
    s_blockHeightHg = params[3];
    s_blockColNumHg = params[4];
    s_blockRowNumHg = params[5];
    s_meanThreshold = params[6];
    s_deformThreshold = params[7];
    s_singleMoveThreshold = params[8];
    s_totalMoveThreshold = params[9];
    s_imageWidthHg = params[10];
    s_imageHeightHg = params[11];
    s_moveCntMinThr = params[12];
    s_moveCntEffThr = params[13];
    s_modeFlag = params[14];
}

void StoreTuningParams(const int32_t* params) {
    _NAVI_TimeOut_threshold = params[15];
    _NAVI_blk_selection_mode = params[16];
    iDCMode = params[17];
    _NAVI_DC_REF = params[18];
    _NAVI_TOP_REF = params[19];
    _NAVI_INPUT_K = params[20];
    _NAVI_GAIN_REF = params[21];
    _NAVI_range_recommend.RANGE_LOW = static_cast<uint32_t>(params[22]);
    _NAVI_range_recommend.RANGE_HIGH = static_cast<uint32_t>(params[23]);
    _NAVI_range_effective.RANGE_LOW = static_cast<uint32_t>(params[24]);
    _NAVI_range_effective.RANGE_HIGH = static_cast<uint32_t>(params[25]);
    _NAVI_range_mean.RANGE_LOW = static_cast<uint32_t>(params[26]);
    _NAVI_range_mean.RANGE_HIGH = static_cast<uint32_t>(params[27]);
    _NAVI_range_mean_recommend.RANGE_LOW = static_cast<uint32_t>(params[28]);
    _NAVI_range_mean_recommend.RANGE_HIGH = static_cast<uint32_t>(params[29]);
    _NAVI_top_mean_interval.RANGE_LOW = static_cast<uint32_t>(params[30]);
    _NAVI_top_mean_interval.RANGE_HIGH = static_cast<uint32_t>(params[31]);
}

void StoreGeometryParams(const int32_t* params) {
    s_sensorWidth = params[32];
    s_sensorHeight = params[33];
    s_blockWidthFp = params[34];
    s_blockHeightFp = params[35];
    s_blockColNumFp = params[36];
    s_blockRowNumFp = params[37];
    s_centerWidth = params[38];
    s_centerHeight = params[39];
    s_boundWidth = params[40];
    s_boundHeight = params[41];
    s_gapWidth = params[42];
    s_gapHeight = params[43];
    s_coverageMinFp = params[44];
    s_coverageMinEff = params[45];
    s_smallMoveTolCol = params[46];
    s_smallMoveTolRow = params[47];
    s_overlapAreaMinFp = params[48];
    s_templateWidth = params[49];
    s_templateHeight = params[50];
}

void StoreMatchParams(const int32_t* params) {
    s_candidateNum = params[51];
    s_diffThresholdStr = params[52];
    s_diffThresholdTol = params[53];
    s_fftResThreshold = params[54];
    s_meanThresholdFp = params[55];
    s_coverageMaxCt = params[56];
    s_downSampleFlag = params[57];
    s_multiBloclkFlag = params[58];
    s_dimensionlessFlag = params[59];
    s_cutOffPercent = params[60];
    s_overlapAreaMinNoMove = params[61];
}

void StoreFpVoteAndFingerParams(const int32_t* params) {
    s_totalMoveThresholdLongpressCt = params[62];
    s_totalMoveThresholdLongpressFp = params[63];
    s_open_vkey_none_navi = params[64];
    s_ct_none_threshold = params[65];
    s_ct_not_move_threshold = params[66];
    s_fpImp = params[67];
    s_ctImp = params[68];
    s_minDelta = params[69];
    s_fpMoveThreshold = params[70];
    s_rangeThreshold = params[71];
    s_blkMeanDiffThreshold = params[72];
    s_highSensitiveMode = params[73];
    s_fftFreqLow = params[74];
    s_fftFreqHigh = params[75];
    s_DoubleScanCvrThreshold = params[76];
    s_logShowFlag = params[77];
}

// s_doubleScanFlag is only ever raised here: a later call with another mode leaves it at 1.
void SelectBlockGeometry() {
    if (s_modeFlag == 1) {
        s_blockHeight = s_blockHeightHg;
        s_blockWidth = s_blockWidthHg;
        s_blockColNum = s_blockColNumHg;
        s_blockRowNum = s_blockRowNumHg;
        return;
    }
    s_blockHeight = s_blockHeightFp;
    s_blockWidth = s_blockWidthFp;
    s_blockColNum = s_blockColNumFp;
    s_blockRowNum = s_blockRowNumFp;
    if (s_modeFlag == 2)
        s_doubleScanFlag = 1;
}

// center + 2 * (gap + bound), the side of the image with the nine tiles spread apart.
int32_t SpreadSide(int32_t center, int32_t gap, int32_t bound) {
    return WrapAdd32(center, WrapMul32(2, WrapAdd32(gap, bound)));
}

void DeriveSizes() {
    s_imageHeight = WrapMul32(s_blockRowNum, s_blockHeight);
    s_imageWidth = WrapMul32(s_blockColNum, s_blockWidth);
    if (s_multiBloclkFlag == 1) {
        s_fullImageHeight = SpreadSide(s_centerHeight, s_gapHeight, s_boundHeight);
        s_fullImageWidth = SpreadSide(s_centerWidth, s_gapWidth, s_boundWidth);
        s_tpltNum = 8;
    } else {
        s_fullImageHeight = s_centerHeight;
        s_fullImageWidth = s_centerWidth;
        s_tpltNum = 4;
    }
    s_tpltHeightUD = s_templateHeight;
    s_tpltWidthUD = s_templateWidth;
    s_tpltHeightLR = s_templateWidth;
    s_tpltWidthLR = s_templateHeight;
}

}  // namespace

void StoreParams(const int32_t* params) {
    StoreVoteAndHgParams(params);
    StoreTuningParams(params);
    StoreGeometryParams(params);
    StoreMatchParams(params);
    StoreFpVoteAndFingerParams(params);
}

int32_t SetNaviParam(const int32_t* params) {
    if (params == nullptr)
        return -1;
    StoreParams(params);
    SelectBlockGeometry();
    DeriveSizes();
    if (s_downSampleFlag == 1) {
        s_sensorHeight = s_sensorHeight / 2;
        s_smallMoveTolRow = s_smallMoveTolRow / 2;
    }
    return 0;
}

}  // namespace reference
