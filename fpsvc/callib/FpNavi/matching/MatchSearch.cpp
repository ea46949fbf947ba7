// Requirement: the match that FindCandidate and FindMatch give one after the other. FindCandidate
// keeps the candidates in a heap, and of two that match equally well the one that comes earlier in
// the heap's array wins.
//
// Observation: to keep the heap takes longer than all other steps of the search, and the order
// matters only when two different displacements share the best score.
//
// Algorithm: select the same candidates without order and score each different displacement once.
// Only on a tie build the heap, and take its first key that has one of the best displacements.
#include "matching/MatchSearch.h"

#include <algorithm>

#include "base/NaviMath.h"
#include "frame/NaviFrame.h"
#include "matching/CandidateHeap.h"
#include "matching/DisplacementScore.h"

namespace fpnavi {
namespace {

// Which displacements have been scored: several templates propose the same one. A slot holds one
// candidate; two displacements of one slot may be scored again, which does not change the result.
class Scored {
  public:
    explicit Scored(const Candidates& candidates) : m_candidates(candidates) {
        std::fill_n(m_candidate, kSlots, -1);
    }

    // Returns whether the displacement of candidate m has been scored before, and marks it as
    // scored.
    bool TestAndSet(int32_t m) {
        const Displacement displacement = m_candidates.At(m);
        const int32_t hash = WrapAdd(WrapMul(displacement.di, kPrime), displacement.dj);
        int32_t& slot = m_candidate[hash & (kSlots - 1)];
        if (slot >= 0 && m_candidates.At(slot) == displacement)
            return true;
        slot = m;
        return false;
    }

  private:
    static constexpr int32_t kSlots = 256;
    static constexpr int32_t kPrime = 37;  // spreads neighbouring rows
    const Candidates m_candidates;
    int32_t m_candidate[kSlots];
};

// The best score, and the displacements that have it: the first count of the candidates.
struct Best {
    int32_t diff;
    int32_t count;
};

// Moves the displacements with the best score to the front of candidates [in, out].
Best ScoreAll(const Candidates& candidates, DisplacementScore* score) {
    Scored scored(candidates);
    Best best = {kDiffWorst + 1, 0};
    for (int32_t m = 0; m < candidates.num; ++m) {
        if (scored.TestAndSet(m))
            continue;
        const Displacement displacement = candidates.At(m);
        const int32_t diff = score->At(displacement, best.diff);
        if (diff > best.diff || (diff == best.diff && displacement == candidates.At(0)))
            continue;
        if (diff < best.diff)
            best = {diff, 0};
        candidates.Set(best.count, displacement);
        ++best.count;
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

}  // namespace

Match SearchMatch(const SearchParams& params, const TemplateSet& set, const FramePair& pair,
                  const SearchMemory& memory, const Candidates& candidates) {
    const PlacementTables tables = ScorePlacements(params, set, pair, memory);
    SelectCandidates(set, tables, candidates);
    DisplacementScore score(params, pair, memory.columns, kColumnSlots);
    const Best best = ScoreAll(candidates, &score);
    if (best.count == 1)
        return {candidates.At(0), best.diff};
    RankCandidates(tables, memory.keys, params.candidateNum);
    const uint32_t key = FirstBest(set, memory.keys, candidates, best, &score);
    return {DisplacementOf(set, key), best.diff};
}

// Rows count downwards, dy upwards. A displacement leads from the frame that the templates were cut
// from to the other one: its sign is changed when that is the current frame.
Move MoveOf(const Displacement& displacement, const FramePair& pair) {
    const int32_t sign = pair.cutFromPrev ? -1 : 1;
    return {WrapMul(-sign, displacement.dj), WrapMul(sign, displacement.di)};
}

int32_t FindMatch(const int32_t* candidate_di, const int32_t* candidate_dj, int32_t* dx,
                  int32_t* dy, int32_t* difference) {
    if (!AreComparable(&s_imagePrev, &s_imageCurr))
        return -1;
    const SearchParams params = CurrentSearchParams();
    const FramePair pair = LayOutPair(s_imagePrev, s_imageCurr);
    ColumnMeetings columns;
    DisplacementScore score(params, pair, &columns, 1);
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
