// Stores the parameter block and derives the working geometry from it.
#include <iterator>

#include "base/NaviMath.h"
#include "param/NaviMode.h"
#include "param/NaviParam.h"

namespace fpnavi {
namespace {

// The bounds of a band are unsigned; a parameter's bits are stored in them unchanged.
void StoreBand(const int32_t* params, _NAVI_struRange* band) {
    band->RANGE_LOW = static_cast<uint32_t>(params[0]);
    band->RANGE_HIGH = static_cast<uint32_t>(params[1]);
}

// Where the parameters lie in the block: the first of each run, and the variables it goes to.
constexpr int32_t kFirstBand = 22;
constexpr int32_t kFirstAfterBands = 32;

int32_t* const kBeforeBands[] = {
    &s_sensorBackFlag,
    &s_directionControlFlag,
    &s_blockWidthHg,
    &s_blockHeightHg,
    &s_blockColNumHg,
    &s_blockRowNumHg,
    &s_meanThreshold,
    &s_deformThreshold,
    &s_singleMoveThreshold,
    &s_totalMoveThreshold,
    &s_imageWidthHg,
    &s_imageHeightHg,
    &s_moveCntMinThr,
    &s_moveCntEffThr,
    &s_modeFlag,
    &_NAVI_TimeOut_threshold,
    &_NAVI_blk_selection_mode,
    &iDCMode,
    &_NAVI_DC_REF,
    &_NAVI_TOP_REF,
    &_NAVI_INPUT_K,
    &_NAVI_GAIN_REF,
};

_NAVI_struRange* const kBands[] = {
    &_NAVI_range_recommend,      &_NAVI_range_effective,   &_NAVI_range_mean,
    &_NAVI_range_mean_recommend, &_NAVI_top_mean_interval,
};

int32_t* const kAfterBands[] = {
    &s_sensorWidth,
    &s_sensorHeight,
    &s_blockWidthFp,
    &s_blockHeightFp,
    &s_blockColNumFp,
    &s_blockRowNumFp,
    &s_centerWidth,
    &s_centerHeight,
    &s_boundWidth,
    &s_boundHeight,
    &s_gapWidth,
    &s_gapHeight,
    &s_coverageMinFp,
    &s_coverageMinEff,
    &s_smallMoveTolCol,
    &s_smallMoveTolRow,
    &s_overlapAreaMinFp,
    &s_templateWidth,
    &s_templateHeight,
    &s_candidateNum,
    &s_diffThresholdStr,
    &s_diffThresholdTol,
    &s_fftResThreshold,
    &s_meanThresholdFp,
    &s_coverageMaxCt,
    &s_downSampleFlag,
    &s_multiBloclkFlag,
    &s_dimensionlessFlag,
    &s_cutOffPercent,
    &s_overlapAreaMinNoMove,
    &s_totalMoveThresholdLongpressCt,
    &s_totalMoveThresholdLongpressFp,
    &s_open_vkey_none_navi,
    &s_ct_none_threshold,
    &s_ct_not_move_threshold,
    &s_fpImp,
    &s_ctImp,
    &s_minDelta,
    &s_fpMoveThreshold,
    &s_rangeThreshold,
    &s_blkMeanDiffThreshold,
    &s_highSensitiveMode,
    &s_fftFreqLow,
    &s_fftFreqHigh,
    &s_DoubleScanCvrThreshold,
    &s_logShowFlag,
};

static_assert(std::size(kBeforeBands) == kFirstBand, "22 parameters before the bands");
static_assert(kFirstBand + 2 * std::size(kBands) == kFirstAfterBands, "five bands");
static_assert(kFirstAfterBands + std::size(kAfterBands) == FPNAVI_PARAM_NUM, "78 parameters");

void StoreParams(const int32_t* params) {
    for (int32_t* const target : kBeforeBands)
        *target = *params++;
    for (_NAVI_struRange* const band : kBands) {
        StoreBand(params, band);
        params += 2;
    }
    for (int32_t* const target : kAfterBands)
        *target = *params++;
}

void DeriveBlockGeometry() {
    const bool hg = IsHg();
    s_blockWidth = hg ? s_blockWidthHg : s_blockWidthFp;
    s_blockHeight = hg ? s_blockHeightHg : s_blockHeightFp;
    s_blockColNum = hg ? s_blockColNumHg : s_blockColNumFp;
    s_blockRowNum = hg ? s_blockRowNumHg : s_blockRowNumFp;
    // Sticky: a process whose sensor has scanned twice keeps to it.
    if (IsDoubleScan())
        s_doubleScanFlag = 1;
    s_imageHeight = WrapMul(s_blockRowNum, s_blockHeight);
    s_imageWidth = WrapMul(s_blockColNum, s_blockWidth);
}

// Length of a full image's side: the centre, and on both sides a border tile and a gap.
int32_t FullSide(int32_t center, int32_t gap, int32_t bound) {
    return WrapAdd(center, WrapMul(2, WrapAdd(gap, bound)));
}

void DeriveMatchGeometry() {
    const bool tiled = IsTiled();
    s_fullImageHeight =
        tiled ? FullSide(s_centerHeight, s_gapHeight, s_boundHeight) : s_centerHeight;
    s_fullImageWidth = tiled ? FullSide(s_centerWidth, s_gapWidth, s_boundWidth) : s_centerWidth;
    s_tpltNum = tiled ? 8 : 4;
    s_tpltHeightUD = s_templateHeight;
    s_tpltWidthLR = s_templateHeight;
    s_tpltWidthUD = s_templateWidth;
    s_tpltHeightLR = s_templateWidth;
}

}  // namespace
}  // namespace fpnavi

int32_t SetNaviParam(const int32_t* params) {
    using namespace fpnavi;
    if (params == nullptr)
        return -1;
    StoreParams(params);
    DeriveBlockGeometry();
    DeriveMatchGeometry();
    // Every second row only is scanned: what counts rows of the sensor is halved.
    if (IsDownSampled()) {
        s_sensorHeight /= 2;
        s_smallMoveTolRow /= 2;
    }
    return 0;
}
