// FindCandidate keeps its candidates in a heap, and of two that match equally well the earlier one
// in the heap's array wins. Keeping the heap costs more than all else, and the order seldom
// matters: so the same candidates are selected without order, and only when two different
// displacements share the best score the heap is built and asked.
#include "matching/JointSearch.h"

#include <algorithm>

#include "base/NaviSimd.h"
#include "matching/FindCandidate.h"
#include "matching/TileMatch.h"
#include "param/NaviParam.h"

namespace fpnavi {
namespace {

constexpr int32_t kDiffKept = 254;  // the worst difference that is better than a sentinel

uint32_t s_keys[kTpltMax * kPlacementMax];  // of placements with the worst difference that is kept

// Counts the placements by their difference. Two tables take turns, since neighbours are often
// equal and the second would wait for the first.
void CountDiffs(const PlacementDiffs* tables, uint32_t (&counts)[256]) {
    uint32_t odd[256] = {};
    std::fill_n(counts, 256, 0U);
    for (int32_t k = 0; k < kTpltMax; ++k) {
        const int32_t count = tables[k].Count();
        int32_t p = 0;
        for (; p + 2 <= count; p += 2) {
            ++counts[tables[k].diff[p]];
            ++odd[tables[k].diff[p + 1]];
        }
        if (p < count)
            ++counts[tables[k].diff[p]];
    }
    for (int32_t diff = 0; diff < 256; ++diff)
        counts[diff] += odd[diff];
}

// Calls visit(index) for the placements of table with a difference of at most most, in order.
template <typename Visit>
void ForEachUpTo(const PlacementDiffs& table, int32_t most, Visit visit) {
    const Bytes16 limit = Splat16(static_cast<uint8_t>(most));
    for (int32_t p = 0; p < table.Count(); p += kLanes) {
        const Bytes16 above = Excess16(Load16(table.diff + p), limit);
        uint32_t bits = TopBits16(Equal16(above, Splat16(0)));
        for (; bits != 0; bits &= bits - 1)
            visit(p + __builtin_ctz(bits));
    }
}

// Fills candidateList with the s_candidateNum smallest keys, the smallest first and the others in
// no order; sentinels where there are fewer placements.
void SelectCandidates(const PlacementDiffs* tables, uint32_t* candidateList) {
    uint32_t counts[256];
    CountDiffs(tables, counts);
    const uint32_t num = static_cast<uint32_t>(s_candidateNum);
    uint32_t below = 0;  // placements with a difference below worst
    int32_t worst = 0;   // difference of the worst placement that is kept
    while (worst < kDiffKept && below + counts[worst] < num)
        below += counts[worst++];
    uint32_t kept = 0;
    uint32_t ties = 0;
    for (int32_t k = 0; k < kTpltMax; ++k) {
        const PlacementDiffs& table = tables[k];
        ForEachUpTo(table, worst, [&](int32_t p) {
            const uint32_t key = MakeKey(table.diff[p], table.iFirst + p / table.columns,
                                         table.jFirst + p % table.columns, k);
            if (table.diff[p] < worst)
                candidateList[kept++] = key;
            else
                s_keys[ties++] = key;
        });
    }
    const uint32_t taken = std::min(ties, num - kept);
    if (taken < ties)
        std::nth_element(s_keys, s_keys + taken, s_keys + ties);
    std::copy_n(s_keys, taken, candidateList + kept);
    std::fill(candidateList + kept + taken, candidateList + num, kKeySentinel);
    // The best placement comes first: it mostly matches best, and then the others stop early.
    std::iter_swap(candidateList, std::min_element(candidateList, candidateList + num));
}

// The best score of all candidates, and the displacements that have it.
struct Best {
    int32_t diff;
    Displacement first;
    bool unique;  // no other displacement has it
};

Best MatchAll(const TemplateSet& set, const uint32_t* candidateList) {
    Best best = {kDiffWorst + 1, {0, 0}, true};
    for (int32_t m = 0; m < s_candidateNum; ++m) {
        const Displacement displacement = DisplacementOf(set.tplts, candidateList[m]);
        const int32_t diff = MatchAt(displacement, best.diff);
        if (diff < best.diff)
            best = {diff, displacement, true};
        else if (diff == best.diff && !(displacement == best.first))
            best.unique = false;
    }
    return best;
}

}  // namespace

Match SearchJointly(const TemplateSet& set, uint32_t* candidateList) {
    const PlacementDiffs* const tables = TabulatePlacements(set);
    SelectCandidates(tables, candidateList);
    SetMatchFrames(*set.cut, *set.searched);
    const Best best = MatchAll(set, candidateList);
    if (best.unique)
        return {best.first, best.diff};
    RankCandidates(set, tables, candidateList);
    // At least two of the candidates match best, so the first of them is not the last candidate.
    const uint32_t* const first =
        std::find_if(candidateList, candidateList + s_candidateNum - 1, [&](uint32_t key) {
            return MatchAt(DisplacementOf(set.tplts, key), best.diff) == best.diff;
        });
    return {DisplacementOf(set.tplts, *first), best.diff};
}

}  // namespace fpnavi
