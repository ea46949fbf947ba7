// Requirement: the match that FindCandidate and FindMatch give one after the other. FindCandidate
// keeps the candidates in a heap, and of two that match equally well the one that comes earlier in
// the heap's array wins.
//
// Observation: to keep the heap takes longer than all other steps of the search, and the order
// matters only when two different displacements share the best score.
//
// Algorithm: select the same candidates without order and score each different displacement once.
// Only on a tie build the heap, and take its first key that has one of the best displacements.
#include "matching/PairMatch.h"

#include <algorithm>
#include <cstdlib>

#include "base/NaviMath.h"
#include "frame/NaviFrame.h"
#include "gesture/Gesture.h"
#include "matching/CandidateSearch.h"
#include "matching/DisplacementScore.h"
#include "param/NaviParam.h"

namespace fpnavi {
namespace {

struct Match {
    Displacement displacement;
    int32_t diff;  // score of DisplacementScore
};

// The best score, and the displacements that have it: the first count of the candidates.
struct Best {
    int32_t diff;
    int32_t count;
};

// Scores each different displacement: several templates propose the same one. Moves those with the
// best score to the front of candidates [in, out].
Best ScoreAll(const Candidates& candidates, DisplacementScore* score) {
    // A candidate that has been scored, for each hash of a displacement. Two displacements of one
    // hash may be scored again, which does not change the result.
    constexpr int32_t kSlots = 256;
    constexpr int32_t kPrime = 37;  // spreads neighbouring rows
    int32_t scored[kSlots];
    std::fill_n(scored, kSlots, -1);
    Best best = {kDiffWorst + 1, 0};
    for (int32_t m = 0; m < candidates.num; ++m) {
        const Displacement displacement = candidates.At(m);
        const int32_t hash = WrapAdd(WrapMul(displacement.di, kPrime), displacement.dj);
        int32_t& slot = scored[hash & (kSlots - 1)];
        if (slot >= 0 && candidates.At(slot) == displacement)
            continue;
        slot = m;
        const int32_t diff = score->At(displacement, best.diff);
        if (diff > best.diff || (diff == best.diff && displacement == candidates.At(0)))
            continue;
        if (diff < best.diff)
            best = {diff, 0};
        candidates.Set(best.count++, displacement);
    }
    return best;
}

constexpr int32_t kFew = 16;  // best displacements up to which a key is compared with each

// The first key that has one of the best displacements.
uint32_t FirstBest(const TemplateSet& set, const uint32_t* keys, const Candidates& candidates,
                   const Best& best, DisplacementScore* score) {
    const auto isBest = [&](uint32_t key) {
        const Displacement displacement = DisplacementOf(set, key);
        if (best.count > kFew)
            return score->At(displacement, best.diff) == best.diff;
        for (int32_t m = 0; m < best.count; ++m) {
            if (displacement == candidates.At(m))
                return true;
        }
        return false;
    };
    // Some key has a best displacement: when no other key has one, it is the last.
    return *std::find_if(keys, keys + candidates.num - 1, isBest);
}

// The best match of all candidates of pair. candidates: scratch, the caller's.
Match SearchMatch(const SearchParams& params, const TemplateSet& set, const FramePair& pair,
                  const SearchMemory& memory, const Candidates& candidates) {
    const PlacementTables tables = ScorePlacements(params, set, pair, memory);
    SelectCandidates(set, tables, candidates);
    DisplacementScore score(params, pair, memory.slots, kMeetingSlots);
    const Best best = ScoreAll(candidates, &score);
    if (best.count == 1)
        return {candidates.At(0), best.diff};
    RankCandidates(tables, memory.keys, params.candidateNum);
    const uint32_t key = FirstBest(set, memory.keys, candidates, best, &score);
    return {DisplacementOf(set, key), best.diff};
}

// A match as the record has it: pixels to the right and upwards.
struct Move {
    int32_t dx;
    int32_t dy;
};

// Rows count downwards, dy upwards. A displacement leads from the frame that the templates were cut
// from to the other one: its sign is changed when that is the current frame.
Move MoveOf(const Displacement& displacement, const FramePair& pair) {
    const int32_t sign = pair.cutFromPrev ? -1 : 1;
    return {WrapMul(-sign, displacement.dj), WrapMul(sign, displacement.di)};
}

// The verdict on a pair whose match of score diff has moved by move.
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

int32_t FindMatch(const int32_t* candidate_di, const int32_t* candidate_dj, int32_t* dx,
                  int32_t* dy, int32_t* difference) {
    if (!AreComparable(&s_imagePrev, &s_imageCurr))
        return -1;
    const SearchParams params = CurrentSearchParams();
    const FramePair pair = LayOutPair(s_imagePrev, s_imageCurr);
    MeetingSlot slot;
    DisplacementScore score(params, pair, &slot, 1);
    Match best = {{0, 0}, kDiffWorst + 1};
    for (int32_t k = 0; k < params.candidateNum; ++k) {
        const Displacement displacement = {candidate_di[k], candidate_dj[k]};
        const int32_t diff = score.At(displacement, best.diff - 1);
        if (diff < best.diff)
            best = {displacement, diff};
    }
    const Move move = MoveOf(best.displacement, pair);
    *dx = move.dx;
    *dy = move.dy;
    *difference = best.diff;
    return 0;
}

}  // namespace fpnavi
