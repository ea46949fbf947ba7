// Requirement: number, column sum and row sum of the finger's pixels, exact for every size.
//
// Observation: the sum of row * pixels(row) is the sum, over all rows but row 0, of the pixels at
// or below that row. So row sums need additions only.
//
// Algorithm: strips of sixteen columns, each read from the last row upwards; the pixels so far are
// added up once for each row.
#include "motion/CenterMove.h"

#include <algorithm>

#include "base/NaviMath.h"
#include "base/NaviSimd.h"
#include "frame/NaviFrame.h"
#include "gesture/Gesture.h"
#include "param/NaviParam.h"

namespace fpnavi {
namespace {

// Mean of the pixels' centres, 100 * place + 50 in hundredths of a pixel, by the side: percent of
// the side.
int64_t Centre(int64_t placeSum, int64_t count, int32_t side) {
    return (100 * placeSum + 50 * count) / (side * count);
}

}  // namespace

int32_t GetCenterAndCoverage(NaviFrame_t* img) {
    if (!HasPixels(img))
        return -1;
    const Bytes16 one = Splat16(1);
    // At most 2^24 pixels, and sums below 2^36. Those of a strip fit 32 bits: at most 16 * 4096 =
    // 2^16 pixels, column sums below 2^16 * 15, row sums below 2^16 * 2^12 / 2 = 2^27.
    int64_t count = 0;
    int64_t columnSum = 0;
    int64_t rowSum = 0;
    for (int32_t first = 0; first < img->width; first += kLanes) {
        const Bytes16 inside = FirstBytes(std::min(img->width - first, kLanes));
        const Bytes16 ones = And16(inside, one);
        const Bytes16 columns = And16(inside, LaneNumbers());
        Sums pixels = NoSums();
        Sums columnSums = NoSums();
        Sums rowSums = NoSums();
        for (int32_t row = img->height - 1; row >= 0; --row) {
            rowSums = AddSums(rowSums, pixels);
            const Bytes16 finger = Equal16(Load16(img->pType + row * img->width + first), one);
            pixels = AddBytes(pixels, And16(finger, ones));
            columnSums = AddBytes(columnSums, And16(finger, columns));
        }
        const int64_t inStrip = Total(pixels);
        count += inStrip;
        columnSum += Total(columnSums) + first * inStrip;
        rowSum += Total(rowSums);
    }
    const bool any = count != 0;
    img->xc = any ? static_cast<int32_t>(Centre(columnSum, count, img->width) - 50) : 0;
    img->yc = any ? static_cast<int32_t>(50 - Centre(rowSum, count, img->height)) : 0;
    img->cvr = static_cast<int32_t>(100 * count / (img->width * img->height));
    return 0;
}

int32_t CalcCenterMove(const NaviFrame_t* img_prev, const NaviFrame_t* img_curr,
                       NaviVoteInfo_t* voteInfo) {
    const int32_t calc_cnt = PairCount(*voteInfo);
    // Percentages: differences within +-100, so all products below stay small.
    int32_t dx = img_curr->xc - img_prev->xc;
    int32_t dy = img_curr->yc - img_prev->yc;
    if (CentroidInPixels()) {
        dx = dx * s_imageWidth / 100;
        dy = dy * s_imageHeight / 100;
    }
    voteInfo->dx_ct[calc_cnt] = dx;
    voteInfo->dy_ct[calc_cnt] = dy;
    int32_t* const verdict = &voteInfo->vkey_ct[calc_cnt];
    const int32_t ax = WrapAbs(dx);
    const int32_t ay = WrapAbs(dy);
    if (std::max(ax, ay) < s_singleMoveThreshold) {
        // A finger that fills both frames has a centroid that cannot move: no statement.
        const bool visible = img_prev->cvr < s_coverageMaxCt || img_curr->cvr < s_coverageMaxCt;
        *verdict = visible ? VKEY_NO_MOVE : VKEY_NONE;
        return 0;
    }
    // The axis that carries the displacement has at least 1.2 times that of the other.
    const bool alongX = 100 * ax >= 120 * ay;
    if (!alongX && 100 * ay < 120 * ax) {
        *verdict = VKEY_NONE;  // diagonal
        return 0;
    }
    *verdict = alongX ? (dx <= 0 ? VKEY_LEFT : VKEY_RIGHT) : (dy <= 0 ? VKEY_DOWN : VKEY_UP);
    // Coverage that changes much for the way: the finger is pressed or lifted, it does not slide.
    const int32_t way = alongX ? dx : dy;
    const int32_t dcvr = img_curr->cvr - img_prev->cvr;
    if (IsHg() && way != 0 && WrapAbs(dcvr / way) > s_deformThreshold) {
        *verdict = VKEY_NO_MOVE;
        voteInfo->dx_ct[calc_cnt] = 0;
        voteInfo->dy_ct[calc_cnt] = 0;
    }
    return 0;
}

}  // namespace fpnavi
