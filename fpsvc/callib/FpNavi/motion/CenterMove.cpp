#include "motion/CenterMove.h"

#include <algorithm>

#include "base/BitRows.h"
#include "base/NaviMath.h"
#include "frame/NaviFrame.h"
#include "gesture/NaviVoteInfo.h"
#include "param/NaviParam.h"

namespace fpnavi {
namespace {

// |a| carries the displacement: at least the threshold, and at least 1.2 times |b|.
bool Dominates(int32_t a, int32_t b) {
    return a >= s_singleMoveThreshold && 100 * a >= 120 * b;
}

// A large change of coverage for the way made: the finger is pressed or lifted, it does not slide.
bool IsDeformation(int32_t dcvr, int32_t way) {
    if (s_modeFlag != 1 || way == 0)
        return false;
    const int32_t deform_rate = dcvr / way;
    return WrapAbs(deform_rate) > s_deformThreshold;
}

// The finger's pixels, counted, and the sums of their centres in hundredths of a pixel.
struct FingerSums {
    int64_t cnt;
    int64_t x;
    int64_t y;
};

FingerSums SumBytes(const NaviFrame_t& img) {
    FingerSums sums = {0, 0, 0};
    for (int32_t row = 0; row < img.height; ++row) {
        for (int32_t column = 0; column < img.width; ++column) {
            if (img.pType[row * img.width + column] != 1)
                continue;
            ++sums.cnt;
            sums.x += 100 * column + 50;
            sums.y += 100 * row + 50;
        }
    }
    return sums;
}

// The same for up to 64 rows of up to 64 pixels: counts of rows come from words, counts of columns
// from bytes, and all fit 32 bits.
FingerSums SumWords(const NaviFrame_t& img) {
    uint8_t inColumn[kWordPixels] = {};
    int32_t cnt = 0;
    int32_t y = 0;
    for (int32_t row = 0; row < img.height; ++row) {
        const uint8_t* const type = img.pType + row * img.width;
        const int32_t inRow = CountBits(EqualBits(type, img.width, 1));
        cnt += inRow;
        y += inRow * (100 * row + 50);
        for (int32_t column = 0; column < img.width; ++column)
            inColumn[column] = static_cast<uint8_t>(inColumn[column] + (type[column] == 1));
    }
    int32_t x = 0;
    for (int32_t column = 0; column < img.width; ++column)
        x += inColumn[column] * (100 * column + 50);
    return {cnt, x, y};
}

}  // namespace

int32_t GetCenterAndCoverage(NaviFrame_t* img) {
    if (!HasPixels(img))
        return -1;
    const FingerSums sums = FitsWords(img->width, img->height) ? SumWords(*img) : SumBytes(*img);
    const int64_t size = int64_t{img->width} * img->height;
    img->xc = sums.cnt == 0 ? 0 : static_cast<int32_t>(sums.x / (img->width * sums.cnt) - 50);
    img->yc = sums.cnt == 0 ? 0 : static_cast<int32_t>(50 - sums.y / (img->height * sums.cnt));
    img->cvr = static_cast<int32_t>(100 * sums.cnt / size);
    return 0;
}

int32_t CalcCenterMove(const NaviFrame_t* img_prev, const NaviFrame_t* img_curr,
                       NaviVoteInfo_t* voteInfo) {
    const int32_t calc_cnt = PairCount(*voteInfo);
    // Percentages: differences within +-100, so all products below stay small.
    int32_t dx = img_curr->xc - img_prev->xc;
    int32_t dy = img_curr->yc - img_prev->yc;
    if (s_dimensionlessFlag == 0) {
        dx = dx * s_imageWidth / 100;
        dy = dy * s_imageHeight / 100;
    }
    voteInfo->dx_ct[calc_cnt] = dx;
    voteInfo->dy_ct[calc_cnt] = dy;
    int32_t* const verdict = &voteInfo->vkey_ct[calc_cnt];
    const int32_t ax = WrapAbs(dx);
    const int32_t ay = WrapAbs(dy);
    if (std::max(ax, ay) < s_singleMoveThreshold) {
        // Where the finger fills both frames its centroid cannot move: no statement.
        const bool visible = img_prev->cvr < s_coverageMaxCt || img_curr->cvr < s_coverageMaxCt;
        *verdict = visible ? VKEY_NO_MOVE : VKEY_NONE;
        return 0;
    }
    int32_t way = 0;
    if (Dominates(ax, ay)) {
        *verdict = dx <= 0 ? VKEY_LEFT : VKEY_RIGHT;
        way = dx;
    } else if (Dominates(ay, ax)) {
        *verdict = dy <= 0 ? VKEY_DOWN : VKEY_UP;
        way = dy;
    } else {
        *verdict = VKEY_NONE;  // diagonal
        return 0;
    }
    if (IsDeformation(img_curr->cvr - img_prev->cvr, way)) {
        *verdict = VKEY_NO_MOVE;
        voteInfo->dx_ct[calc_cnt] = 0;
        voteInfo->dy_ct[calc_cnt] = 0;
    }
    return 0;
}

}  // namespace fpnavi
