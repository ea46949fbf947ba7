#include "PairWork.h"

#include <algorithm>

#include "RefInternal.h"
#include "Reference.h"

namespace bench {
namespace {

// Comparisons of two bytes for all placements of tplt; none when less than half of it is finger.
double PlacementWork(const reference::MatchTemplate& tplt, const reference::NaviFrame_t& cut) {
    int32_t finger = 0;
    for (int32_t i = 0; i < tplt.tpltHeight; ++i) {
        for (int32_t j = 0; j < tplt.tpltWidth; ++j)
            finger += cut.pType[(tplt.tplt_i0 + i) * cut.width + tplt.tplt_j0 + j] == 1 ? 1 : 0;
    }
    const int32_t size = tplt.tpltWidth * tplt.tpltHeight;
    if (2 * finger < size)
        return 0;
    const reference::SearchRange range = reference::PlacementsOf(tplt);
    const int64_t rows = std::max<int64_t>(range.lastRow - range.firstRow + 1, 0);
    const int64_t columns = std::max<int64_t>(range.lastColumn - range.firstColumn + 1, 0);
    return static_cast<double>(rows * columns * size);
}

}  // namespace

double PairWork::Of(Unit unit) const {
    switch (unit) {
        case Unit::FramePixel:
            return pixels;
        case Unit::Placement:
            return placements;
        case Unit::Match:
            return matches;
        case Unit::Joint:
            return placements + matches;
        default:
            return 1;
    }
}

PairWork MeasureWork(const FramePair& pair) {
    reference::FpNaviClear();
    reference::OrientationCalc(pair.first.image.data(), pair.first.image.data(), 0);
    reference::OrientationCalc(pair.second.image.data(), pair.second.image.data(), 0);
    PairWork work;
    work.pixels = static_cast<double>(reference::s_imageWidth * reference::s_imageHeight);
    if (reference::s_modeFlag == 1)
        return work;
    work.matches = work.pixels * reference::s_candidateNum;
    const bool fromPrev = reference::s_imageCurr.cvr > reference::s_imagePrev.cvr;
    reference::MatchTemplate templates[reference::kTemplateNum];
    reference::BuildTemplates(templates);
    for (int32_t k = 0; k < reference::s_tpltNum; ++k)
        work.placements +=
            PlacementWork(templates[k], fromPrev ? reference::s_imagePrev : reference::s_imageCurr);
    return work;
}

}  // namespace bench
