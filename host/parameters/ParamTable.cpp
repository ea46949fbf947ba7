// The table behind ParamTable.h: names, defaults and meanings in the order of the parameter block.
// The meanings say what the code does with a value; units are those of the comparing code.
#include "parameters/ParamTable.h"

#include <cassert>
#include <unordered_map>

namespace host {

namespace {

constexpr const char* kNeverRead = "stored, never read";

constexpr std::array<ParamInfo, FPNAVI_PARAM_NUM> kTable = {{
    {"s_sensorBackFlag", 0, "1 swaps RIGHT and LEFT in the result of the vote"},
    {"s_directionControlFlag", 3,
     "filter of the vote's result: 0 everything becomes NO_MOVE, 1 RIGHT and LEFT do, 2 UP and "
     "DOWN "
     "do, other values keep all; 1 also makes the fp vote want two pairs that moved, and in mode 2 "
     "replaces row 0 of the re-sorted frame by row 1"},
    {"s_blockWidthHg", 8, "block width in pixels, used in mode 1"},
    {"s_blockHeightHg", 4, "block height in pixels, used in mode 1"},
    {"s_blockColNumHg", 5, "blocks in a row, used in mode 1"},
    {"s_blockRowNumHg", 12, "rows of blocks, used in mode 1"},
    {"s_meanThreshold", 180, "hg finger test: a mean grey at or below it is a finger"},
    {"s_deformThreshold", 3,
     "hg only: change of coverage per unit of centroid displacement above which a pair is NO_MOVE"},
    {"s_singleMoveThreshold", 2,
     "displacement of a pair below which a method sees no motion; centroid: pixels or percent, see "
     "s_dimensionlessFlag; template match: pixels"},
    {"s_totalMoveThreshold", 8,
     "travel of the gesture; hg vote: percent of the frame along the main axis, at least this; fp "
     "vote: centroid plus template distance, more than this"},
    {"s_imageWidthHg", 40,
     "hg finger test: width of the image whose mean is taken; not the geometry"},
    {"s_imageHeightHg", 48,
     "hg finger test: height of the image whose mean is taken; not the geometry"},
    {"s_moveCntMinThr", 2,
     "hg vote: with fewer moving pairs than s_moveCntEffThr, more than this many are needed (and "
     "more than resting ones)"},
    {"s_moveCntEffThr", 1, "hg vote: this many moving pairs suffice for a key"},
    {"s_modeFlag", 0, "1 hg, 2 fp with double scan, any other value fp"},
    {"_NAVI_TimeOut_threshold", 2,
     "tuning calls after which the calibration counts as complete; 0 or less: no limit"},
    {"_NAVI_blk_selection_mode", 0,
     "tuning measures the corner block of this rank by mean grey: 0 darkest to 3 brightest"},
    {"iDCMode", 1,
     "encoding of the DC register: 1 low byte, 0 two byte differences; others leave it alone"},
    {"_NAVI_DC_REF", 128, "lowest DC value the tuning accepts; below it the DC is reset"},
    {"_NAVI_TOP_REF", 128, kNeverRead},
    {"_NAVI_INPUT_K", 374,
     "grey levels per DC step at the reference gain, in hundredths; sizes the tuning's steps"},
    {"_NAVI_GAIN_REF", 10002, "packed code of the reference gain that _NAVI_INPUT_K holds for"},
    {"_NAVI_range_recommend.RANGE_LOW", 180,
     "tuning: recommended top grey from here on; classified, decides nothing"},
    {"_NAVI_range_recommend.RANGE_HIGH", 220,
     "tuning: recommended top grey up to here; classified, decides nothing"},
    {"_NAVI_range_effective.RANGE_LOW", 160, kNeverRead},
    {"_NAVI_range_effective.RANGE_HIGH", 240, kNeverRead},
    {"_NAVI_range_mean.RANGE_LOW", 140,
     "tuning: block mean below it is out of the effective band: the DC steps"},
    {"_NAVI_range_mean.RANGE_HIGH", 220,
     "tuning: block mean above it is out of the effective band: the DC steps"},
    {"_NAVI_range_mean_recommend.RANGE_LOW", 160,
     "tuning: a step brightens (DC up) when the block mean is below it"},
    {"_NAVI_range_mean_recommend.RANGE_HIGH", 200,
     "tuning: a step darkens (DC down) when the block mean is above it"},
    {"_NAVI_top_mean_interval.RANGE_LOW", 10,
     "tuning: the top grey averages the pixels ranked from this percent of the brightest"},
    {"_NAVI_top_mean_interval.RANGE_HIGH", 15,
     "tuning: the top grey averages the pixels ranked up to this percent of the brightest"},
    {"s_sensorWidth", 80,
     "100 percent of a template displacement's dx when s_dimensionlessFlag is 1, pixels"},
    {"s_sensorHeight", 200,
     "100 percent of a template displacement's dy when s_dimensionlessFlag is 1, pixels"},
    {"s_blockWidthFp", 8, "block width in pixels, used in modes other than 1"},
    {"s_blockHeightFp", 2, "block height in pixels, used in modes other than 1"},
    {"s_blockColNumFp", 7, "blocks in a row, used in modes other than 1"},
    {"s_blockRowNumFp", 18, "rows of blocks, used in modes other than 1"},
    {"s_centerWidth", 40, "width of the centre tile and of the templates' search region, pixels"},
    {"s_centerHeight", 20, "height of the centre tile and of the templates' search region, pixels"},
    {"s_boundWidth", 8, "width of the left and right border tiles, pixels"},
    {"s_boundHeight", 8, "height of the top and bottom border tiles, pixels"},
    {"s_gapWidth", 32,
     "unread sensor columns between tiles: blank columns of the full image, part of every "
     "candidate "
     "displacement; 0 for frames that are one window"},
    {"s_gapHeight", 16,
     "unread sensor rows between tiles: blank rows of the full image, part of every candidate "
     "displacement; 0 for frames that are one window"},
    {"s_coverageMinFp", 50,
     "coverage in percent that both frames of a pair need for template matching"},
    {"s_coverageMinEff", 15,
     "coverage in percent that both frames need for the pair to be counted at all"},
    {"s_smallMoveTolCol", 2, "no-move test: largest shift tried in columns, pixels"},
    {"s_smallMoveTolRow", 2, "no-move test: largest shift tried in rows, pixels"},
    {"s_overlapAreaMinFp", 200,
     "template match: a placement counts when more than this many finger pixels overlap"},
    {"s_templateWidth", 10, "long side of a template, pixels"},
    {"s_templateHeight", 6, "short side of a template, pixels"},
    {"s_candidateNum", 100, "best template placements kept and verified for each pair"},
    {"s_diffThresholdStr", 30,
     "template match: a mean grey difference above it gives the pair no verdict and no weight in "
     "the vote"},
    {"s_diffThresholdTol", 30,
     "no-move test: a smallest mean grey difference below it means the finger rested"},
    {"s_fftResThreshold", 7, "fp finger test: a block's texture response at or above it is skin"},
    {"s_meanThresholdFp", 40, "fp finger test: a block's mean grey below it is a finger"},
    {"s_coverageMaxCt", 90,
     "a small centroid move is NO_MOVE when either frame's coverage in percent is below it, else "
     "no "
     "statement"},
    {"s_downSampleFlag", 0, "1 halves s_sensorHeight and s_smallMoveTolRow as they are stored"},
    {"s_multiBloclkFlag", 1,
     "1: full image of nine tiles with gaps and 8 templates; else the frame itself and 4"},
    {"s_dimensionlessFlag", 0,
     "0: centroid displacements in pixels; 1: they stay percent of the frame, and template "
     "displacements become percent of the sensor; others: centroid percent, template pixels"},
    {"s_cutOffPercent", 3,
     "percent of pixels cut off at each end of the histogram in the grey stretch and in the fp "
     "finger test's grey range"},
    {"s_overlapAreaMinNoMove", 100,
     "no-move test: finger pixels that must overlap for a shift to count"},
    {"s_totalMoveThresholdLongpressCt", -1,
     "fp vote at a time-out with the finger down: centroid distance below it, and the template's "
     "below its own, turn the key into NO_MOVE; -1 never"},
    {"s_totalMoveThresholdLongpressFp", -1,
     "the same bound for the template distance; both must hold; -1 never"},
    {"s_open_vkey_none_navi", 1, "1 lets the fp vote answer NONE in its undecided cases"},
    {"s_ct_none_threshold", 3,
     "fp vote: a centroid distance above 0 and below it, with no template travel, is undecided"},
    {"s_ct_not_move_threshold", 10,
     "fp vote: NO_MOVE needs a centroid distance at or below it (and s_fpMoveThreshold)"},
    {"s_fpImp", 80, "fp vote: weight of the template scores, percent"},
    {"s_ctImp", 20, "fp vote: weight of the centroid (or double-scan) scores, percent"},
    {"s_minDelta", 4,
     "fp vote: displacement length from which a pair is scored; 0 or less lets a resting pair "
     "abandon the vote (-1)"},
    {"s_fpMoveThreshold", 9,
     "fp vote: NO_MOVE needs a template distance at or below it (and s_ct_not_move_threshold)"},
    {"s_rangeThreshold", 80, "fp finger test: a block's grey range at or above it is a finger"},
    {"s_blkMeanDiffThreshold", 50,
     "fp finger test: a spread of the 16 block means at or above it is a finger"},
    {"s_highSensitiveMode", 1,
     "hg finger test: 1 accepts a darkest quadrant whose mean is at or below s_meanThreshold"},
    {"s_fftFreqLow", 5, kNeverRead},
    {"s_fftFreqHigh", 12, kNeverRead},
    {"s_DoubleScanCvrThreshold", 10,
     "mode 2 finger test: percent of set map cells that must be exceeded for a finger"},
    {"s_logShowFlag", 0, "1 writes the diagnostic log lines"},
}};

// A missing last entry would be value-initialised silently.
static_assert(kTable.back().name != nullptr, "the table names every parameter");

const std::unordered_map<std::string_view, size_t>& IndexByName() {
    static const std::unordered_map<std::string_view, size_t> index = [] {
        std::unordered_map<std::string_view, size_t> map;
        for (size_t i = 0; i < kTable.size(); ++i)
            map.emplace(kTable[i].name, i);
        return map;
    }();
    return index;
}

size_t KnownIndex(std::string_view name) {
    const std::optional<size_t> index = ParamIndex(name);
    assert(index.has_value() && "the name must be one of ParamTable()");
    return index.value();
}

}  // namespace

const std::array<ParamInfo, FPNAVI_PARAM_NUM>& ParamTable() {
    return kTable;
}

std::optional<size_t> ParamIndex(std::string_view name) {
    const auto found = IndexByName().find(name);
    if (found == IndexByName().end())
        return std::nullopt;
    return found->second;
}

bool IsRead(size_t index) {
    return std::string_view(kTable[index].meaning) != kNeverRead;
}

ParamBlock DefaultParams() {
    ParamBlock params{};
    for (size_t i = 0; i < kTable.size(); ++i)
        params[i] = kTable[i].defaultValue;
    return params;
}

int32_t& ParamValue(ParamBlock& params, std::string_view name) {
    return params[KnownIndex(name)];
}

int32_t ParamValue(const ParamBlock& params, std::string_view name) {
    return params[KnownIndex(name)];
}

Mode ModeOf(const ParamBlock& params) {
    const int32_t flag = ParamValue(params, "s_modeFlag");
    if (flag == static_cast<int32_t>(Mode::Hg))
        return Mode::Hg;
    return flag == static_cast<int32_t>(Mode::DoubleScan) ? Mode::DoubleScan : Mode::Fp;
}

Geometry GeometryOf(const ParamBlock& params) {
    if (ParamValue(params, "s_modeFlag") == static_cast<int32_t>(Mode::Hg))
        return {ParamValue(params, "s_blockWidthHg"), ParamValue(params, "s_blockHeightHg"),
                ParamValue(params, "s_blockColNumHg"), ParamValue(params, "s_blockRowNumHg")};
    return {ParamValue(params, "s_blockWidthFp"), ParamValue(params, "s_blockHeightFp"),
            ParamValue(params, "s_blockColNumFp"), ParamValue(params, "s_blockRowNumFp")};
}

ParamBlock ParamsForMode(Mode mode, bool plainLayout) {
    ParamBlock params = DefaultParams();
    ParamValue(params, "s_modeFlag") = static_cast<int32_t>(mode);
    if (plainLayout) {
        ParamValue(params, "s_gapWidth") = 0;
        ParamValue(params, "s_gapHeight") = 0;
    }
    return params;
}

}  // namespace host
