#include "matching/ImgJoint.h"

#include <algorithm>
#include <cstdlib>

#include "base/NaviMath.h"
#include "frame/FullImage.h"
#include "frame/NaviFrame.h"
#include "gesture/NaviVoteInfo.h"
#include "matching/FindCandidate.h"
#include "matching/JointSearch.h"
#include "matching/PlacementDiffs.h"
#include "matching/TileMatch.h"
#include "param/NaviParam.h"

namespace fpnavi {
namespace {

// Mean grey difference between p_im1 and p_im2 where pixel (row, column) of the first meets
// (row + di, column + dj) of the second, over the pixels that are finger in both; kDiffWorst when
// they are too few.
int32_t OverlapDiff(const NaviFrame_t& p_im1, const NaviFrame_t& p_im2, int32_t di, int32_t dj) {
    const int32_t width = p_im1.width;
    const int64_t rows = p_im1.height - std::abs(int64_t{di});
    const int64_t columns = width - std::abs(int64_t{dj});
    if (rows < 1 || columns < 1)
        return kDiffWorst;
    const int32_t start1 = std::max(-di, 0) * width + std::max(-dj, 0);
    const int32_t start2 = std::max(di, 0) * width + std::max(dj, 0);
    int64_t sum = 0;
    int32_t cnt = 0;
    for (int32_t r = 0; r < rows; ++r) {
        const int32_t idx1 = start1 + r * width;
        const int32_t idx2 = start2 + r * width;
        for (int32_t c = 0; c < columns; ++c) {
            if (p_im1.pType[idx1 + c] != 1 || p_im2.pType[idx2 + c] != 1)
                continue;
            ++cnt;
            sum += GreyDiff(p_im1.pData[idx1 + c], p_im2.pData[idx2 + c]);
        }
    }
    if (cnt < 1 || cnt <= s_overlapAreaMinFp)
        return kDiffWorst;
    return static_cast<int32_t>(sum / cnt);
}

// The key of a displacement, in pixels, of a pair whose best score is diff.
int32_t JudgeMatch(int32_t dx, int32_t dy, int32_t diff) {
    if (diff > s_diffThresholdStr)
        return VKEY_NONE;
    const int32_t ax = WrapAbs(dx);
    const int32_t ay = WrapAbs(dy);
    if (std::max(ax, ay) < s_singleMoveThreshold)
        return VKEY_NO_MOVE;
    if (ax > ay)
        return dx <= 0 ? VKEY_LEFT : VKEY_RIGHT;
    return dy <= 0 ? VKEY_DOWN : VKEY_UP;
}

void RecordMatch(int32_t dx, int32_t dy, int32_t diff) {
    const int32_t calc_cnt = PairCount(s_voteInfo);
    const bool percent = s_dimensionlessFlag == 1 && s_sensorWidth > 0 && s_sensorHeight > 0;
    s_voteInfo.dx_fp[calc_cnt] = percent ? WrapMul(100, dx) / s_sensorWidth : dx;
    s_voteInfo.dy_fp[calc_cnt] = percent ? WrapMul(100, dy) / s_sensorHeight : dy;
    s_voteInfo.diff[calc_cnt] = diff;
    s_voteInfo.vkey_fp[calc_cnt] = JudgeMatch(dx, dy, diff);
}

bool BuildFullImages() {
    return GetFullImg(&s_imagePrev, &s_fullImagePrev) == 0 &&
           GetFullImg(&s_imageCurr, &s_fullImageCurr) == 0;
}

// s_candidateNum zeroes, or null.
template <typename Entry>
Entry* AllocateCandidates() {
    if (s_candidateNum < 1)
        return nullptr;
    const size_t num = static_cast<size_t>(s_candidateNum);
    Entry* const candidates = static_cast<Entry*>(std::malloc(num * sizeof(Entry)));
    if (candidates != nullptr)
        std::fill_n(candidates, num, Entry{0});
    return candidates;
}

// The displacement of the pair, pixels to the right and upwards, and its score.
struct JointResult {
    int32_t dx;
    int32_t dy;
    int32_t diff;
};

// Rows count downwards, dy upwards; the match goes from the frame that the templates were cut from.
JointResult Orient(const Match& match) {
    const int32_t sign = s_imageCurr.cvr > s_imagePrev.cvr ? -1 : 1;
    return {WrapMul(-sign, match.displacement.dj), WrapMul(sign, match.displacement.di),
            match.diff};
}

// Small frames: both steps in one. The full images are built all the same, for whoever reads them;
// so tiles that do not make up the frame are refused before they are matched.
bool JoinSmall(const TemplateSet& set, JointResult* result) {
    uint32_t* const candidateList = AllocateCandidates<uint32_t>();
    const bool joined = candidateList != nullptr && (s_multiBloclkFlag != 1 || BuildFullImages());
    if (joined)
        *result = Orient(SearchJointly(set, candidateList));
    std::free(candidateList);
    return joined;
}

// Frames of any size: the candidate search, then the match.
bool JoinAny(int32_t* candidate_i, int32_t* candidate_j, JointResult* result) {
    const bool joined = FindCandidate(candidate_i, candidate_j) == 0 &&
                        (s_multiBloclkFlag != 1 || BuildFullImages());
    if (joined)
        FindMatch(candidate_i, candidate_j, &result->dx, &result->dy, &result->diff);
    return joined;
}

}  // namespace

int32_t FindMatch(const int32_t* candidate_di, const int32_t* candidate_dj, int32_t* dx,
                  int32_t* dy, int32_t* difference) {
    // The coverage of the frames decides, also where their full images are compared: full images
    // are not measured.
    const bool fromPrev = s_imageCurr.cvr > s_imagePrev.cvr;
    const bool multi = s_multiBloclkFlag == 1;
    const NaviFrame_t& prev = multi ? s_fullImagePrev : s_imagePrev;
    const NaviFrame_t& curr = multi ? s_fullImageCurr : s_imageCurr;
    const NaviFrame_t& p_im1 = fromPrev ? prev : curr;
    const NaviFrame_t& p_im2 = fromPrev ? curr : prev;
    const int32_t sign = fromPrev ? -1 : 1;
    int32_t diff_min = kDiffWorst + 1;
    int32_t match_i = 0;
    int32_t match_j = 0;
    for (int32_t k = 0; k < s_candidateNum; ++k) {
        const int32_t diff = OverlapDiff(p_im1, p_im2, candidate_di[k], candidate_dj[k]);
        if (diff < diff_min) {
            diff_min = diff;
            match_i = candidate_di[k];
            match_j = candidate_dj[k];
        }
    }
    // Rows count downwards, the record's dy upwards.
    *dx = WrapMul(-sign, match_j);
    *dy = WrapMul(sign, match_i);
    *difference = diff_min;
    return 0;
}

int32_t CalcImgJoint() {
    int32_t* const candidate_i = AllocateCandidates<int32_t>();
    int32_t* const candidate_j = AllocateCandidates<int32_t>();
    TemplateSet set;
    JointResult result = {0, 0, 0};
    bool joined = false;
    if (candidate_i != nullptr && candidate_j != nullptr && CutTemplates(&set))
        joined =
            CanTabulate(set) ? JoinSmall(set, &result) : JoinAny(candidate_i, candidate_j, &result);
    if (joined)
        RecordMatch(result.dx, result.dy, result.diff);
    std::free(candidate_i);
    std::free(candidate_j);
    return joined ? 0 : -1;
}

}  // namespace fpnavi
