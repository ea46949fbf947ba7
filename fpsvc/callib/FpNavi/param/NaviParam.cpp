#include "param/NaviParam.h"

#include <cstring>

#include "base/NaviMath.h"

namespace fpnavi {
namespace {

// Length of a full image's side: the centre, and where there are tiles also on both sides a border
// tile and a gap.
int32_t FullSide(int32_t center, int32_t gap, int32_t bound) {
    return IsTiled() ? WrapAdd(center, WrapMul(2, WrapAdd(gap, bound))) : center;
}

void DeriveGeometry() {
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
    s_fullImageHeight = FullSide(s_centerHeight, s_gapHeight, s_boundHeight);
    s_fullImageWidth = FullSide(s_centerWidth, s_gapWidth, s_boundWidth);
    s_tpltNum = IsTiled() ? 8 : 4;
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
    std::memcpy(static_cast<void*>(&s_naviParams), params, sizeof s_naviParams);
    DeriveGeometry();
    // Every second row only is scanned: what counts rows of the sensor is halved.
    if (IsDownSampled()) {
        s_sensorHeight /= 2;
        s_smallMoveTolRow /= 2;
    }
    return 0;
}
