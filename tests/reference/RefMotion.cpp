// The cheap methods of a frame pair: centroid and coverage, the double-scan shift and the no-move
// test. Displacements grow to the right and upwards. The results go to entry calc_cnt of the
// record.

#include "RefInternal.h"
#include "RefMath.h"
#include "Reference.h"

namespace reference {

int32_t GetCenterAndCoverage(NaviFrame_t* img) {
    if (img == nullptr || img->pType == nullptr || img->pData == nullptr || img->width < 1 ||
        img->height < 1)
        return -1;
    const int64_t width = img->width;
    const int64_t height = img->height;
    const int64_t size = width * height;
    int64_t cnt = 0;
    int64_t x = 0;
    int64_t y = 0;
    for (int64_t k = 0; k < size; ++k) {
        if (img->pType[k] == 1) {
            ++cnt;
            x += 100 * (k % width) + 50;
            y += 100 * (k / width) + 50;
        }
    }
    if (cnt == 0) {
        img->xc = 0;
        img->yc = 0;
        img->cvr = 0;
        return 0;
    }
    img->xc = Wrap32(x / (width * cnt) - 50);
    img->yc = Wrap32(50 - y / (height * cnt));
    img->cvr = Wrap32(100 * cnt / size);
    return 0;
}

namespace {

// A change of coverage that is large against the travel: the finger is pressed or lifted, it does
// not slide. Without travel nothing is claimed.
bool IsDeformed(int32_t dcvr, int32_t travel) {
    if (s_modeFlag != 1 || travel == 0)
        return false;
    const int32_t deform_rate = WrapDiv32(dcvr, travel);
    return WrapAbs32(deform_rate) > s_deformThreshold;
}

// At least the threshold and 1.2 times the other axis.
bool Dominates(int32_t travel, int32_t other) {
    return WrapAbs32(travel) >= s_singleMoveThreshold &&
           WrapMul32(100, WrapAbs32(travel)) >= WrapMul32(120, WrapAbs32(other));
}

}  // namespace

int32_t CalcCenterMove(const NaviFrame_t* img_prev, const NaviFrame_t* img_curr,
                       NaviVoteInfo_t* voteInfo) {
    const int32_t calc_cnt = PairsOf(*voteInfo);
    int32_t dx = WrapSub32(img_curr->xc, img_prev->xc);
    int32_t dy = WrapSub32(img_curr->yc, img_prev->yc);
    if (s_dimensionlessFlag == 0) {
        dx = WrapMul32(dx, s_imageWidth) / 100;
        dy = WrapMul32(dy, s_imageHeight) / 100;
    }
    voteInfo->dx_ct[calc_cnt] = dx;
    voteInfo->dy_ct[calc_cnt] = dy;
    int32_t& vkey = voteInfo->vkey_ct[calc_cnt];
    if (Max32(WrapAbs32(dx), WrapAbs32(dy)) < s_singleMoveThreshold) {
        // Under a finger that covers nearly everything the centroid cannot see a movement.
        const bool canSee = img_prev->cvr < s_coverageMaxCt || img_curr->cvr < s_coverageMaxCt;
        vkey = canSee ? VKEY_NO_MOVE : VKEY_NONE;
        return 0;
    }
    const int32_t dcvr = WrapSub32(img_curr->cvr, img_prev->cvr);
    bool deformed = false;
    if (Dominates(dx, dy)) {
        vkey = dx <= 0 ? VKEY_LEFT : VKEY_RIGHT;
        deformed = IsDeformed(dcvr, dx);
    } else if (Dominates(dy, dx)) {
        vkey = dy <= 0 ? VKEY_DOWN : VKEY_UP;
        deformed = IsDeformed(dcvr, dy);
    } else {
        vkey = VKEY_NONE;
    }
    if (deformed) {
        vkey = VKEY_NO_MOVE;
        voteInfo->dx_ct[calc_cnt] = 0;
        voteInfo->dy_ct[calc_cnt] = 0;
    }
    return 0;
}

int32_t CalcDoubleScanMove(const uint8_t* pPrev, const uint8_t* pCurr, NaviVoteInfo_t* voteInfo) {
    int32_t xc_prev = 0;
    int32_t yc_prev = 0;
    int32_t cvr_prev = 0;
    int32_t xc_cvrr = 0;
    int32_t yc_cvrr = 0;
    int32_t cvr_cvrr = 0;
    const int32_t calc_cnt = PairsOf(*voteInfo);
    if (DoubleScanGetCenterAndCoverage(pPrev, &xc_prev, &yc_prev, &cvr_prev) == -1)
        return -1;
    if (DoubleScanGetCenterAndCoverage(pCurr, &xc_cvrr, &yc_cvrr, &cvr_cvrr) == -1)
        return -1;
    if (calc_cnt >= kMaxPairs)
        return -1;  // the current frame has no entry any more
    voteInfo->xc_ds[calc_cnt] = xc_prev;
    voteInfo->yc_ds[calc_cnt] = yc_prev;
    voteInfo->cvr_ds[calc_cnt] = cvr_prev;
    voteInfo->xc_ds[calc_cnt + 1] = xc_cvrr;
    voteInfo->yc_ds[calc_cnt + 1] = yc_cvrr;
    voteInfo->cvr_ds[calc_cnt + 1] = cvr_cvrr;
    voteInfo->dx_ds[calc_cnt] = xc_cvrr - xc_prev;
    voteInfo->dy_ds[calc_cnt] = yc_cvrr - yc_prev;
    return 0;
}

namespace {

constexpr int32_t kBlockNum = 5;

// The frame without its four corner squares: top, bottom, left and right band, centre.
struct NoMoveBlocks {
    int32_t i_start_block[kBlockNum];
    int32_t j_start_block[kBlockNum];
    int32_t blk_width[kBlockNum];
    int32_t blk_height[kBlockNum];
};

NoMoveBlocks CutBlocks(int32_t width, int32_t height) {
    const int32_t bw = s_boundWidth;
    const int32_t bh = s_boundHeight;
    const int32_t innerWidth = WrapSub32(width, WrapMul32(2, bw));
    const int32_t innerHeight = WrapSub32(height, WrapMul32(2, bh));
    return {
        {0, WrapSub32(height, bh), bh, bh, bh},
        {bw, bw, 0, WrapSub32(width, bw), bw},
        {innerWidth, innerWidth, bw, bw, innerWidth},
        {bh, bh, innerHeight, innerHeight, innerHeight},
    };
}

struct Overlap {
    int32_t sum;  // 32 bits, wrapping on very large frames
    int32_t overlap_area;
};

bool StartsInside(int32_t start, int32_t side) {
    return start >= 0 && start < side;
}

// start lies inside; the whole run must, too.
bool RunsInside(int32_t start, int32_t length, int32_t side) {
    return int64_t{start} + length <= side;
}

// Adds the common finger pixels of block k, the frames shifted against each other by (dr, dc).
void CompareBlock(const NaviFrame_t* img_prev, const NaviFrame_t* img_curr,
                  const NoMoveBlocks& blocks, int32_t k, int32_t dr, int32_t dc, Overlap* overlap) {
    const int32_t width = img_prev->width;
    const int32_t height = img_prev->height;
    const int32_t i_start_prev = WrapAdd32(blocks.i_start_block[k], Max32(WrapNeg32(dr), 0));
    const int32_t i_start_curr = WrapAdd32(blocks.i_start_block[k], Max32(dr, 0));
    const int32_t j_start_prev = WrapAdd32(blocks.j_start_block[k], Max32(WrapNeg32(dc), 0));
    const int32_t j_start_curr = WrapAdd32(blocks.j_start_block[k], Max32(dc, 0));
    if (!StartsInside(i_start_prev, height) || !StartsInside(i_start_curr, height) ||
        !StartsInside(j_start_prev, width) || !StartsInside(j_start_curr, width))
        return;
    const int32_t row_range = WrapSub32(blocks.blk_height[k], WrapAbs32(dr));
    const int32_t col_range = WrapSub32(blocks.blk_width[k], WrapAbs32(dc));
    if (row_range <= 0 || col_range <= 0)
        return;
    if (!RunsInside(i_start_prev, row_range, height) ||
        !RunsInside(i_start_curr, row_range, height) ||
        !RunsInside(j_start_prev, col_range, width) || !RunsInside(j_start_curr, col_range, width))
        return;
    for (int32_t r = 0; r < row_range; ++r) {
        for (int32_t c = 0; c < col_range; ++c) {
            // The starts cross over: the previous frame is read at the "curr" start.
            const int64_t idx1 = int64_t{i_start_curr + r} * width + j_start_curr + c;
            const int64_t idx2 = int64_t{i_start_prev + r} * width + j_start_prev + c;
            if (img_prev->pType[idx1] == 1 && img_curr->pType[idx2] == 1) {
                ++overlap->overlap_area;
                overlap->sum = WrapAdd32(
                    overlap->sum, GreyDistance(img_prev->pData[idx1], img_curr->pData[idx2]));
            }
        }
    }
}

bool AreComparable(const NaviFrame_t* img_prev, const NaviFrame_t* img_curr) {
    return img_prev != nullptr && img_curr != nullptr && img_prev->width == img_curr->width &&
           img_prev->height == img_curr->height && img_prev->pData != nullptr &&
           img_prev->pType != nullptr && img_curr->pData != nullptr && img_curr->pType != nullptr &&
           img_prev->width >= 1 && img_prev->height >= 1;
}

}  // namespace

int32_t FingerNoMove(const NaviFrame_t* img_prev, const NaviFrame_t* img_curr) {
    if (!AreComparable(img_prev, img_curr))
        return kFingerFailed;
    const NoMoveBlocks blocks = CutBlocks(img_prev->width, img_prev->height);
    const int64_t dr_max = s_smallMoveTolRow;
    const int64_t dc_max = s_smallMoveTolCol;
    int32_t min = 256;  // above every mean of byte differences
    for (int64_t dr = -dr_max; dr <= dr_max; ++dr) {
        for (int64_t dc = -dc_max; dc <= dc_max; ++dc) {
            Overlap overlap = {0, 0};
            for (int32_t k = 0; k < kBlockNum; ++k) {
                if (WrapMul32(blocks.blk_width[k], blocks.blk_height[k]) != 0)
                    CompareBlock(img_prev, img_curr, blocks, k, Wrap32(dr), Wrap32(dc), &overlap);
            }
            if (overlap.overlap_area > 0 && overlap.overlap_area >= s_overlapAreaMinNoMove)
                min = Min32(min, overlap.sum / overlap.overlap_area);
        }
    }
    if (min < s_diffThresholdTol)
        return kFingerNoMove;
    return min == 256 ? kFingerUndetermined : kFingerMoved;
}

}  // namespace reference
