// Template matching, second stage: every proposed displacement is scored on the whole overlap of
// the two frames (or of their full images), counting only common finger pixels, and the best one
// becomes the pair's match in the record.

#include <cstdlib>

#include "RefInternal.h"
#include "RefMath.h"
#include "Reference.h"

namespace reference {

namespace {

// The mean difference of im1 against im2 displaced by (di, dj), 255 where they share too little.
int32_t ScoreDisplacement(const NaviFrame_t& im1, const NaviFrame_t& im2, int32_t width,
                          int32_t height, int32_t di, int32_t dj) {
    const int32_t rows = WrapSub32(height, WrapAbs32(di));
    const int32_t columns = WrapSub32(width, WrapAbs32(dj));
    int64_t sum = 0;
    int32_t cnt = 0;
    for (int32_t i = 0; i < rows; ++i) {
        for (int32_t j = 0; j < columns; ++j) {
            const int64_t row1 = Max32(WrapNeg32(di), 0) + i;
            const int64_t row2 = Max32(di, 0) + i;
            const int64_t idx1 = row1 * width + Max32(WrapNeg32(dj), 0) + j;
            const int64_t idx2 = row2 * width + Max32(dj, 0) + j;
            if (im1.pType[idx1] == 1 && im2.pType[idx2] == 1) {
                sum += GreyDistance(im1.pData[idx1], im2.pData[idx2]);
                ++cnt;
            }
        }
    }
    return cnt > 0 && cnt > s_overlapAreaMinFp ? static_cast<int32_t>(sum / cnt) : 255;
}

}  // namespace

// The coverage of the navigation frames decides also where the full images are compared: it names
// the frame the templates were cut from.
int32_t FindMatch(int32_t* candidate_di, int32_t* candidate_dj, int32_t* dx, int32_t* dy,
                  int32_t* difference) {
    const bool multiBlock = s_multiBloclkFlag == 1;
    const int32_t width = multiBlock ? s_fullImageWidth : s_imageWidth;
    const int32_t height = multiBlock ? s_fullImageHeight : s_imageHeight;
    const NaviFrame_t& prev = multiBlock ? s_fullImagePrev : s_imagePrev;
    const NaviFrame_t& curr = multiBlock ? s_fullImageCurr : s_imageCurr;
    const bool fromPrev = s_imageCurr.cvr > s_imagePrev.cvr;
    const NaviFrame_t& im1 = fromPrev ? prev : curr;
    const NaviFrame_t& im2 = fromPrev ? curr : prev;
    const int32_t sign = fromPrev ? -1 : 1;
    int32_t diff_min = 256;
    int32_t match_i = 0;
    int32_t match_j = 0;
    for (int32_t k = 0; k < s_candidateNum; ++k) {
        const int32_t di = candidate_di[k];
        const int32_t dj = candidate_dj[k];
        const int32_t diff = ScoreDisplacement(im1, im2, width, height, di, dj);
        if (diff < diff_min) {
            diff_min = diff;
            match_i = di;
            match_j = dj;
        }
    }
    std::free(candidate_di);
    std::free(candidate_dj);
    // A higher row is a move down, a higher column a move to the right.
    *dx = WrapMul32(-sign, match_j);
    *dy = WrapMul32(sign, match_i);
    *difference = diff_min;
    return 0;
}

namespace {

int32_t MatchVerdict(int32_t dx, int32_t dy, int32_t diff) {
    if (diff > s_diffThresholdStr)
        return VKEY_NONE;
    const int32_t ax = WrapAbs32(dx);
    const int32_t ay = WrapAbs32(dy);
    if (Max32(ax, ay) < s_singleMoveThreshold)
        return VKEY_NO_MOVE;
    if (ax > ay)
        return dx <= 0 ? VKEY_LEFT : VKEY_RIGHT;
    return dy <= 0 ? VKEY_DOWN : VKEY_UP;
}

void RecordMatch(int32_t calc_cnt, int32_t dx, int32_t dy, int32_t diff) {
    if (s_dimensionlessFlag == 1 && s_sensorWidth > 0 && s_sensorHeight > 0) {
        s_voteInfo.dx_fp[calc_cnt] = WrapMul32(100, dx) / s_sensorWidth;
        s_voteInfo.dy_fp[calc_cnt] = WrapMul32(100, dy) / s_sensorHeight;
    } else {
        s_voteInfo.dx_fp[calc_cnt] = dx;
        s_voteInfo.dy_fp[calc_cnt] = dy;
    }
    s_voteInfo.diff[calc_cnt] = diff;
    s_voteInfo.vkey_fp[calc_cnt] = MatchVerdict(dx, dy, diff);
}

// Candidates and, in the multi-block layout, both full images.
int32_t PrepareMatch(int32_t* candidate_i, int32_t* candidate_j) {
    for (int32_t i = 0; i < s_candidateNum; ++i) {
        candidate_i[i] = 0;
        candidate_j[i] = 0;
    }
    if (FindCandidate(candidate_i, candidate_j) == -1)
        return -1;
    if (s_multiBloclkFlag == 1) {
        if (GetFullImg(&s_imagePrev, &s_fullImagePrev) == -1 ||
            GetFullImg(&s_imageCurr, &s_fullImageCurr) == -1)
            return -1;
    }
    return 0;
}

}  // namespace

int32_t CalcImgJoint() {
    const int32_t calc_cnt = PairsOf(s_voteInfo);
    const int64_t bytes = int64_t{s_candidateNum} * static_cast<int64_t>(sizeof(int32_t));
    int32_t* candidate_i = static_cast<int32_t*>(Allocate(bytes));
    int32_t* candidate_j = static_cast<int32_t*>(Allocate(bytes));
    if (candidate_i == nullptr || candidate_j == nullptr ||
        PrepareMatch(candidate_i, candidate_j) == -1) {
        std::free(candidate_i);
        std::free(candidate_j);
        return -1;
    }
    int32_t dx = 0;
    int32_t dy = 0;
    int32_t diff = 0;
    FindMatch(candidate_i, candidate_j, &dx, &dy, &diff);
    RecordMatch(calc_cnt, dx, dy, diff);
    return 0;
}

}  // namespace reference
