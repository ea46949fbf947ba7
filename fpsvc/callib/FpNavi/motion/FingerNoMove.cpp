#include "motion/FingerNoMove.h"

#include <algorithm>

#include "base/NaviMath.h"
#include "frame/NaviFrame.h"
#include "motion/ShiftTest.h"
#include "param/NaviParam.h"

namespace fpnavi {
namespace {

constexpr int32_t kBlockNum = 5;

// The regions that are compared: four border bands without the corners, and the centre.
struct Block {
    int32_t i_start;  // top row
    int32_t j_start;  // left column
    int32_t width;
    int32_t height;
};

struct Overlap {
    int32_t sum;   // of grey differences; wraps beyond 2^23 pixels of the greatest difference
    int32_t area;  // pixels that are finger in both frames
};

void CutBlocks(int32_t width, int32_t height, Block (&blocks)[kBlockNum]) {
    const int32_t bw = s_boundWidth;
    const int32_t bh = s_boundHeight;
    const int32_t innerWidth = WrapSub(width, WrapMul(2, bw));
    const int32_t innerHeight = WrapSub(height, WrapMul(2, bh));
    blocks[0] = {0, bw, innerWidth, bh};
    blocks[1] = {WrapSub(height, bh), bw, innerWidth, bh};
    blocks[2] = {bh, 0, bw, innerHeight};
    blocks[3] = {bh, WrapSub(width, bw), bw, innerHeight};
    blocks[4] = {bh, bw, innerWidth, innerHeight};
}

// One axis of a block under a shift: where the compared stretches start in both frames, and their
// length. The previous frame's pixel lies shift pixels behind the current frame's.
struct Stretch {
    int32_t prev;
    int32_t curr;
    int32_t length;
};

Stretch ShiftAxis(int32_t start, int32_t length, int32_t shift) {
    return {WrapAdd(start, std::max(shift, 0)), WrapAdd(start, std::max(-shift, 0)),
            WrapSub(length, WrapAbs(shift))};
}

// Both stretches lie in the side pixels of an axis, and are not empty.
bool Inside(const Stretch& stretch, int32_t side) {
    return stretch.prev >= 0 && stretch.curr >= 0 && stretch.length >= 1 &&
           stretch.length <= side - std::max(stretch.prev, stretch.curr);
}

void CompareBlock(const NaviFrame_t* img_prev, const NaviFrame_t* img_curr, const Stretch& rows,
                  const Stretch& columns, Overlap* overlap) {
    for (int32_t r = 0; r < rows.length; ++r) {
        const int32_t idx1 = (rows.prev + r) * img_prev->width + columns.prev;
        const int32_t idx2 = (rows.curr + r) * img_curr->width + columns.curr;
        for (int32_t c = 0; c < columns.length; ++c) {
            if (img_prev->pType[idx1 + c] != 1 || img_curr->pType[idx2 + c] != 1)
                continue;
            ++overlap->area;
            overlap->sum = WrapAdd(overlap->sum,
                                   GreyDiff(img_prev->pData[idx1 + c], img_curr->pData[idx2 + c]));
        }
    }
}

Overlap CompareShifted(const NaviFrame_t* img_prev, const NaviFrame_t* img_curr,
                       const Block (&blocks)[kBlockNum], int32_t dr, int32_t dc) {
    Overlap overlap = {0, 0};
    for (const Block& block : blocks) {
        const Stretch rows = ShiftAxis(block.i_start, block.height, dr);
        const Stretch columns = ShiftAxis(block.j_start, block.width, dc);
        if (Inside(rows, img_prev->height) && Inside(columns, img_prev->width))
            CompareBlock(img_prev, img_curr, rows, columns, &overlap);
    }
    return overlap;
}

// Least mean difference of all shifts that have enough common finger area; kMinNone without one.
int32_t LeastDifference(const NaviFrame_t* img_prev, const NaviFrame_t* img_curr) {
    Block blocks[kBlockNum];
    CutBlocks(img_prev->width, img_prev->height, blocks);
    const int32_t dr_max = s_smallMoveTolRow;
    const int32_t dc_max = s_smallMoveTolCol;
    int32_t min = kMinNone;
    if (dr_max < 0 || dc_max < 0)  // no shift at all
        return min;
    for (int32_t dr = -dr_max; dr <= dr_max; ++dr) {
        for (int32_t dc = -dc_max; dc <= dc_max; ++dc) {
            const Overlap overlap = CompareShifted(img_prev, img_curr, blocks, dr, dc);
            if (overlap.area >= 1 && overlap.area >= s_overlapAreaMinNoMove)
                min = std::min(min, overlap.sum / overlap.area);
        }
    }
    return min;
}

// Outcome of the least difference of all shifts.
int32_t Judge(int32_t min) {
    if (min < s_diffThresholdTol)
        return kNoMoveResting;
    return min == kMinNone ? kNoMoveUndetermined : kNoMoveMoved;
}

}  // namespace

int32_t FingerNoMove(const NaviFrame_t* img_prev, const NaviFrame_t* img_curr) {
    if (!HasPixels(img_prev) || !HasPixels(img_curr) || img_prev->width != img_curr->width ||
        img_prev->height != img_curr->height)
        return kNoMoveFailed;
    if (CanTestShifts(*img_prev))
        return TestShifts(*img_prev, *img_curr);
    return Judge(LeastDifference(img_prev, img_curr));
}

}  // namespace fpnavi
