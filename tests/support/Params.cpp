// The parameter table of the tests: name, default and variable of each entry.
#include "Params.h"

#include <cstdlib>
#include <cstring>
#include <iostream>

#include "param/NaviParam.h"

namespace fpnavi_test {
namespace {

const std::array<ParamEntry, FPNAVI_PARAM_NUM> kTable = {{
    {"s_sensorBackFlag", 0, &fpnavi::s_sensorBackFlag},
    {"s_directionControlFlag", 3, &fpnavi::s_directionControlFlag},
    {"s_blockWidthHg", 8, &fpnavi::s_blockWidthHg},
    {"s_blockHeightHg", 4, &fpnavi::s_blockHeightHg},
    {"s_blockColNumHg", 5, &fpnavi::s_blockColNumHg},
    {"s_blockRowNumHg", 12, &fpnavi::s_blockRowNumHg},
    {"s_meanThreshold", 180, &fpnavi::s_meanThreshold},
    {"s_deformThreshold", 3, &fpnavi::s_deformThreshold},
    {"s_singleMoveThreshold", 2, &fpnavi::s_singleMoveThreshold},
    {"s_totalMoveThreshold", 8, &fpnavi::s_totalMoveThreshold},
    {"s_imageWidthHg", 40, &fpnavi::s_imageWidthHg},
    {"s_imageHeightHg", 48, &fpnavi::s_imageHeightHg},
    {"s_moveCntMinThr", 2, &fpnavi::s_moveCntMinThr},
    {"s_moveCntEffThr", 1, &fpnavi::s_moveCntEffThr},
    {"s_modeFlag", 0, &fpnavi::s_modeFlag},
    {"_NAVI_TimeOut_threshold", 2, &fpnavi::_NAVI_TimeOut_threshold},
    {"_NAVI_blk_selection_mode", 0, &fpnavi::_NAVI_blk_selection_mode},
    {"iDCMode", 1, &fpnavi::iDCMode},
    {"_NAVI_DC_REF", 128, &fpnavi::_NAVI_DC_REF},
    {"_NAVI_TOP_REF", 128, &fpnavi::_NAVI_TOP_REF},
    {"_NAVI_INPUT_K", 374, &fpnavi::_NAVI_INPUT_K},
    {"_NAVI_GAIN_REF", 10002, &fpnavi::_NAVI_GAIN_REF},
    {"_NAVI_range_recommend.RANGE_LOW", 180, &fpnavi::_NAVI_range_recommend.RANGE_LOW},
    {"_NAVI_range_recommend.RANGE_HIGH", 220, &fpnavi::_NAVI_range_recommend.RANGE_HIGH},
    {"_NAVI_range_effective.RANGE_LOW", 160, &fpnavi::_NAVI_range_effective.RANGE_LOW},
    {"_NAVI_range_effective.RANGE_HIGH", 240, &fpnavi::_NAVI_range_effective.RANGE_HIGH},
    {"_NAVI_range_mean.RANGE_LOW", 140, &fpnavi::_NAVI_range_mean.RANGE_LOW},
    {"_NAVI_range_mean.RANGE_HIGH", 220, &fpnavi::_NAVI_range_mean.RANGE_HIGH},
    {"_NAVI_range_mean_recommend.RANGE_LOW", 160, &fpnavi::_NAVI_range_mean_recommend.RANGE_LOW},
    {"_NAVI_range_mean_recommend.RANGE_HIGH", 200, &fpnavi::_NAVI_range_mean_recommend.RANGE_HIGH},
    {"_NAVI_top_mean_interval.RANGE_LOW", 10, &fpnavi::_NAVI_top_mean_interval.RANGE_LOW},
    {"_NAVI_top_mean_interval.RANGE_HIGH", 15, &fpnavi::_NAVI_top_mean_interval.RANGE_HIGH},
    {"s_sensorWidth", 80, &fpnavi::s_sensorWidth},
    {"s_sensorHeight", 200, &fpnavi::s_sensorHeight},
    {"s_blockWidthFp", 8, &fpnavi::s_blockWidthFp},
    {"s_blockHeightFp", 2, &fpnavi::s_blockHeightFp},
    {"s_blockColNumFp", 7, &fpnavi::s_blockColNumFp},
    {"s_blockRowNumFp", 18, &fpnavi::s_blockRowNumFp},
    {"s_centerWidth", 40, &fpnavi::s_centerWidth},
    {"s_centerHeight", 20, &fpnavi::s_centerHeight},
    {"s_boundWidth", 8, &fpnavi::s_boundWidth},
    {"s_boundHeight", 8, &fpnavi::s_boundHeight},
    {"s_gapWidth", 32, &fpnavi::s_gapWidth},
    {"s_gapHeight", 16, &fpnavi::s_gapHeight},
    {"s_coverageMinFp", 50, &fpnavi::s_coverageMinFp},
    {"s_coverageMinEff", 15, &fpnavi::s_coverageMinEff},
    {"s_smallMoveTolCol", 2, &fpnavi::s_smallMoveTolCol},
    {"s_smallMoveTolRow", 2, &fpnavi::s_smallMoveTolRow},
    {"s_overlapAreaMinFp", 200, &fpnavi::s_overlapAreaMinFp},
    {"s_templateWidth", 10, &fpnavi::s_templateWidth},
    {"s_templateHeight", 6, &fpnavi::s_templateHeight},
    {"s_candidateNum", 100, &fpnavi::s_candidateNum},
    {"s_diffThresholdStr", 30, &fpnavi::s_diffThresholdStr},
    {"s_diffThresholdTol", 30, &fpnavi::s_diffThresholdTol},
    {"s_fftResThreshold", 7, &fpnavi::s_fftResThreshold},
    {"s_meanThresholdFp", 40, &fpnavi::s_meanThresholdFp},
    {"s_coverageMaxCt", 90, &fpnavi::s_coverageMaxCt},
    {"s_downSampleFlag", 0, &fpnavi::s_downSampleFlag},
    {"s_multiBloclkFlag", 1, &fpnavi::s_multiBloclkFlag},
    {"s_dimensionlessFlag", 0, &fpnavi::s_dimensionlessFlag},
    {"s_cutOffPercent", 3, &fpnavi::s_cutOffPercent},
    {"s_overlapAreaMinNoMove", 100, &fpnavi::s_overlapAreaMinNoMove},
    {"s_totalMoveThresholdLongpressCt", -1, &fpnavi::s_totalMoveThresholdLongpressCt},
    {"s_totalMoveThresholdLongpressFp", -1, &fpnavi::s_totalMoveThresholdLongpressFp},
    {"s_open_vkey_none_navi", 1, &fpnavi::s_open_vkey_none_navi},
    {"s_ct_none_threshold", 3, &fpnavi::s_ct_none_threshold},
    {"s_ct_not_move_threshold", 10, &fpnavi::s_ct_not_move_threshold},
    {"s_fpImp", 80, &fpnavi::s_fpImp},
    {"s_ctImp", 20, &fpnavi::s_ctImp},
    {"s_minDelta", 4, &fpnavi::s_minDelta},
    {"s_fpMoveThreshold", 9, &fpnavi::s_fpMoveThreshold},
    {"s_rangeThreshold", 80, &fpnavi::s_rangeThreshold},
    {"s_blkMeanDiffThreshold", 50, &fpnavi::s_blkMeanDiffThreshold},
    {"s_highSensitiveMode", 1, &fpnavi::s_highSensitiveMode},
    {"s_fftFreqLow", 5, &fpnavi::s_fftFreqLow},
    {"s_fftFreqHigh", 12, &fpnavi::s_fftFreqHigh},
    {"s_DoubleScanCvrThreshold", 10, &fpnavi::s_DoubleScanCvrThreshold},
    {"s_logShowFlag", 0, &fpnavi::s_logShowFlag},
}};

}  // namespace

int32_t ParamEntry::Stored() const {
    int32_t value = 0;
    std::memcpy(&value, variable, sizeof(value));
    return value;
}

const std::array<ParamEntry, FPNAVI_PARAM_NUM>& ParamTable() {
    return kTable;
}

size_t ParamIndex(std::string_view name) {
    for (size_t i = 0; i < kTable.size(); ++i) {
        if (name == kTable[i].name)
            return i;
    }
    std::cerr << "no parameter " << name << "\n";
    std::abort();
}

Params::Params() {
    for (size_t i = 0; i < m_values.size(); ++i)
        m_values[i] = kTable[i].defaultValue;
}

Params& Params::Set(std::string_view name, int32_t value) {
    m_values[ParamIndex(name)] = value;
    return *this;
}

Params& Params::SetAll(int32_t value) {
    m_values.fill(value);
    return *this;
}

int32_t Params::Apply() const {
    return SetNaviParam(m_values.data());
}

std::vector<int32_t> DerivedState() {
    using namespace fpnavi;
    return {s_blockWidth,  s_blockHeight,  s_blockColNum,    s_blockRowNum,     s_doubleScanFlag,
            s_imageWidth,  s_imageHeight,  s_fullImageWidth, s_fullImageHeight, s_tpltNum,
            s_tpltWidthUD, s_tpltHeightUD, s_tpltWidthLR,    s_tpltHeightLR};
}

std::vector<int32_t> StoredState() {
    std::vector<int32_t> state;
    state.reserve(kTable.size());
    for (const ParamEntry& entry : kTable)
        state.push_back(entry.Stored());
    return state;
}

}  // namespace fpnavi_test
