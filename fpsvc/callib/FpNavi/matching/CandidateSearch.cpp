// Requirement: the displacements of the num smallest keys of all placements, in any order.
//
// Observation: keys are ordered by difference, row, column and template. In loops over rows, then
// columns, then templates, placements of equal difference come in ascending order of their keys.
//
// Algorithm: count the placements by difference. That gives the worst difference that is kept and
// how many placements of it are wanted. Then one pass takes all better placements, and of that
// difference as many as are wanted, the first ones.
#include "matching/CandidateSearch.h"

#include <algorithm>
#include <cstdlib>
#include <utility>

#include "base/BitRows.h"
#include "base/GreyHistogram.h"
#include "base/NaviMath.h"
#include "frame/NaviFrame.h"

namespace fpnavi {
namespace {

// Which placements are kept: all below worst, and the first wanted ones of worst.
struct Cut {
    int32_t worst;   // grey difference
    int32_t wanted;  // placements
};

Cut CutDifferences(const PlacementTables& tables, int32_t num) {
    int32_t counts[kGreyLevels];
    CountBytes(tables.of[0].diff, tables.placements, counts);
    int32_t below = 0;
    int32_t worst = 0;
    while (worst < kDiffKept && below + counts[worst] < num)
        below += counts[worst++];
    return {worst, num - below};
}

// Takes the placements that are kept, in ascending order of rows, columns and templates.
class Selection {
  public:
    Selection(const TemplateSet& set, const PlacementTables& tables, const Candidates& candidates)
        : m_set(set),
          m_tables(tables),
          m_candidates(candidates),
          m_cut(CutDifferences(tables, candidates.num)) {}

    void TakeAll() {
        int32_t rows = 0;  // most of all tables
        int32_t columns = 0;
        for (int32_t t = 0; t < m_tables.count; ++t) {
            rows = std::max(rows, m_tables.of[t].rows);
            columns = std::max(columns, m_tables.of[t].columns);
        }
        for (int32_t row = 0; row < rows; ++row) {
            for (int32_t column = 0; column < columns; column += kWordPixels)
                TakeRow(row, column);
        }
        PutBestFirst();
    }

  private:
    // Takes from 64 columns of a row. Bit c of kept[t]: column + c of table t differs by at most
    // worst.
    void TakeRow(int32_t row, int32_t column) {
        uint64_t kept[kTpltMax];
        uint64_t any = 0;
        for (int32_t t = 0; t < m_tables.count; ++t) {
            kept[t] = FindKept(m_tables.of[t], row, column);
            any |= kept[t];
        }
        for (; any != 0; any &= any - 1) {
            const int32_t bit = __builtin_ctzll(any);
            // Mostly one table has the bit; a branch for each table would be mispredicted.
            uint32_t having = 0;
            for (int32_t t = 0; t < m_tables.count; ++t)
                having |= static_cast<uint32_t>(kept[t] >> bit & 1U) << t;
            for (; having != 0; having &= having - 1)
                Take(m_tables.of[__builtin_ctz(having)], row, column + bit);
        }
    }

    uint64_t FindKept(const PlacementTable& table, int32_t row, int32_t column) const {
        if (row >= table.rows || column >= table.columns)
            return 0;
        return AtMostBits(table.diff + row * table.columns + column,
                          std::min(table.columns - column, kWordPixels),
                          static_cast<uint8_t>(m_cut.worst));
    }

    void Take(const PlacementTable& table, int32_t row, int32_t column) {
        const int32_t diff = table.diff[row * table.columns + column];
        if (diff == m_cut.worst && m_cut.wanted-- <= 0)
            return;
        if (diff < m_bestDiff) {
            m_bestDiff = diff;
            m_best = m_taken;
        }
        m_candidates.Set(m_taken++,
                         {WrapAdd(table.first.di, row), WrapAdd(table.first.dj, column)});
    }

    // The best placement mostly matches best, and then the scores of the others stop early.
    void PutBestFirst() {
        while (m_taken < m_candidates.num)
            m_candidates.Set(m_taken++, DisplacementOf(m_set, kKeySentinel));
        const Displacement best = m_candidates.At(m_best);
        m_candidates.Set(m_best, m_candidates.At(0));
        m_candidates.Set(0, best);
    }

    const TemplateSet& m_set;
    const PlacementTables& m_tables;
    const Candidates m_candidates;
    Cut m_cut;
    int32_t m_taken = 0;
    int32_t m_best = 0;
    int32_t m_bestDiff = kGreyLevels;
};

// Offers the placements of a row to the heap keys [in, out], num of them. The root is the worst key
// kept and only becomes smaller, so placements whose difference is above the root's get no key.
// Reads up to 15 bytes behind the row.
void OfferRow(const PlacementTable& table, int32_t row, uint32_t* keys, int32_t num) {
    const uint8_t* const diff = table.diff + row * table.columns;
    for (int32_t first = 0; first < table.columns; first += kLanes) {
        uint64_t bits = AtMostBits(diff + first, std::min(table.columns - first, kLanes),
                                   static_cast<uint8_t>(keys[0] >> 24));
        for (; bits != 0; bits &= bits - 1) {
            const int32_t column = first + __builtin_ctzll(bits);
            const uint32_t key =
                MakeKey(diff[column], table.iFirst + row, table.jFirst + column, table.k);
            if (key >= keys[0])
                continue;
            keys[0] = key;
            MaxHeapify(keys, num, 0);
        }
    }
}

}  // namespace

void SelectCandidates(const TemplateSet& set, const PlacementTables& tables,
                      const Candidates& candidates) {
    Selection(set, tables, candidates).TakeAll();
}

void RankCandidates(const PlacementTables& tables, uint32_t* keys, int32_t num) {
    std::fill_n(keys, static_cast<size_t>(num), kKeySentinel);
    for (int32_t t = 0; t < tables.count; ++t) {
        for (int32_t row = 0; row < tables.of[t].rows; ++row)
            OfferRow(tables.of[t], row, keys, num);
    }
}

int32_t MaxHeapify(uint32_t* arr, int32_t len, int32_t i) {
    if (arr == nullptr || len < 1)
        return -1;
    // Children of i are 2i + 1 and 2i + 2; none exists from len / 2 on, so that nothing overflows.
    while (i >= 0 && i < len / 2) {
        const int32_t left = 2 * i + 1;
        int32_t max = arr[left] > arr[i] ? left : i;
        if (left < len - 1 && arr[left + 1] > arr[max])
            max = left + 1;
        if (max == i)
            break;
        std::swap(arr[i], arr[max]);
        i = max;
    }
    return 0;
}

int32_t FindCandidate(int32_t* candidate_di, int32_t* candidate_dj) {
    const SearchParams params = CurrentSearchParams();
    if (candidate_di == nullptr || candidate_dj == nullptr || params.candidateNum < 1 ||
        !AreComparable(&s_imagePrev, &s_imageCurr))
        return -1;
    const FramePair pair = LayOutPair(s_imagePrev, s_imageCurr);
    TemplateSet set;
    if (!CutTemplates(params, pair, &set))
        return -1;
    auto* const candidateList =
        static_cast<uint8_t*>(std::malloc(PlanMemory(params, set, nullptr).bytes));
    if (candidateList == nullptr)
        return -1;
    const SearchMemory memory = PlanMemory(params, set, candidateList);
    RankCandidates(ScorePlacements(params, set, pair, memory), memory.keys, params.candidateNum);
    for (int32_t m = 0; m < params.candidateNum; ++m) {
        const Displacement displacement = DisplacementOf(set, memory.keys[m]);
        candidate_di[m] = displacement.di;
        candidate_dj[m] = displacement.dj;
    }
    std::free(candidateList);
    return 0;
}

}  // namespace fpnavi
