#include "matching/PairMatch.h"

#include <algorithm>
#include <cstdlib>

#include "base/NaviMath.h"
#include "frame/NaviFrame.h"
#include "gesture/NaviVoteInfo.h"
#include "matching/MatchSearch.h"
#include "param/NaviMode.h"
#include "param/NaviParam.h"

namespace fpnavi {
namespace {

// The verdict on a pair whose match of score diff has moved by move, in pixels.
int32_t JudgeMatch(const Move& move, int32_t diff) {
    if (diff > s_diffThresholdStr)
        return VKEY_NONE;
    const int32_t ax = WrapAbs(move.dx);
    const int32_t ay = WrapAbs(move.dy);
    if (std::max(ax, ay) < s_singleMoveThreshold)
        return VKEY_NO_MOVE;
    if (ax > ay)
        return move.dx <= 0 ? VKEY_LEFT : VKEY_RIGHT;
    return move.dy <= 0 ? VKEY_DOWN : VKEY_UP;
}

void RecordMatch(const Move& move, int32_t diff) {
    const int32_t calc_cnt = PairCount(s_voteInfo);
    const bool percent = TemplateInPercent() && s_sensorWidth > 0 && s_sensorHeight > 0;
    s_voteInfo.dx_fp[calc_cnt] = percent ? WrapMul(100, move.dx) / s_sensorWidth : move.dx;
    s_voteInfo.dy_fp[calc_cnt] = percent ? WrapMul(100, move.dy) / s_sensorHeight : move.dy;
    s_voteInfo.diff[calc_cnt] = diff;
    s_voteInfo.vkey_fp[calc_cnt] = JudgeMatch(move, diff);
}

// s_fullImage* are observable state: built although the match does not read them; this also refuses
// tiles that do not add up to the frame.
bool BuildFullImages() {
    return GetFullImg(&s_imagePrev, &s_fullImagePrev) == 0 &&
           GetFullImg(&s_imageCurr, &s_fullImageCurr) == 0;
}

// The candidate search and the match. candidates: scratch, the caller's. match [out].
bool JoinImages(const FramePair& pair, const Candidates& candidates, Match* match) {
    const SearchParams params = CurrentSearchParams();
    TemplateSet set;
    if (!CutTemplates(params, pair, &set))
        return false;
    auto* const candidateList =
        static_cast<uint8_t*>(std::malloc(PlanMemory(params, set, nullptr).bytes));
    const bool joined = candidateList != nullptr && (!params.tiled || BuildFullImages());
    if (joined)
        *match = SearchMatch(params, set, pair, PlanMemory(params, set, candidateList), candidates);
    std::free(candidateList);
    return joined;
}

int32_t* AllocateCandidates(int32_t num) {
    return static_cast<int32_t*>(std::malloc(static_cast<size_t>(num) * sizeof(int32_t)));
}

}  // namespace

int32_t MatchPair(const FramePair& pair) {
    if (s_candidateNum < 1)
        return -1;
    int32_t* const candidate_i = AllocateCandidates(s_candidateNum);
    int32_t* const candidate_j = AllocateCandidates(s_candidateNum);
    Match match;
    const bool joined = candidate_i != nullptr && candidate_j != nullptr &&
                        JoinImages(pair, {candidate_i, candidate_j, s_candidateNum}, &match);
    if (joined)
        RecordMatch(MoveOf(match.displacement, pair), match.diff);
    std::free(candidate_i);
    std::free(candidate_j);
    return joined ? 0 : -1;
}

int32_t CalcImgJoint() {
    if (!AreComparable(&s_imagePrev, &s_imageCurr))
        return -1;
    return MatchPair(LayOutPair(s_imagePrev, s_imageCurr));
}

}  // namespace fpnavi
