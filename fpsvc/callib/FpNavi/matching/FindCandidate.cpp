#include "matching/FindCandidate.h"

#include <algorithm>
#include <cstdlib>
#include <utility>

#include "base/NaviMath.h"
#include "frame/NaviFrame.h"
#include "matching/PlacementDiffs.h"
#include "matching/Templates.h"
#include "param/NaviParam.h"

namespace fpnavi {
namespace {

// Mean grey difference between the template and its placement at (i, j), 0..255.
int32_t PlacementDiff(const TemplateSet& set, const Template& tplt, int32_t i, int32_t j) {
    int64_t sum = 0;
    for (int32_t m = 0; m < tplt.height; ++m) {
        const uint8_t* const placed = set.searched->pData + (i + m) * s_imageWidth + j;
        const uint8_t* const cut = set.cut->pData + (tplt.i0 + m) * s_imageWidth + tplt.j0;
        for (int32_t n = 0; n < tplt.width; ++n)
            sum += GreyDiff(placed[n], cut[n]);
    }
    return static_cast<int32_t>(sum / set.tpltSize);
}

// Keeps key when it is better than the worst of the s_candidateNum keys kept, which is the root.
void OfferKey(uint32_t key, uint32_t* candidateList) {
    if (key >= candidateList[0])
        return;
    candidateList[0] = key;
    MaxHeapify(candidateList, s_candidateNum, 0);
}

// Scores the placements of template k one by one, whatever their number and size.
void SearchTemplate(const TemplateSet& set, int32_t k, uint32_t* candidateList) {
    const Placements where = PlacementsOf(set.tplts[k]);
    if (where.Empty())
        return;
    const int32_t iLast = static_cast<int32_t>(where.iLast);  // usable: 0..255
    const int32_t jLast = static_cast<int32_t>(where.jLast);
    for (int32_t i = s_boundHeight; i <= iLast; ++i) {
        for (int32_t j = s_boundWidth; j <= jLast; ++j)
            OfferKey(MakeKey(PlacementDiff(set, set.tplts[k], i, j), i, j, k), candidateList);
    }
}

// Offers the placements of template k, whose differences stand in table. Only those that could be
// kept get a key.
void OfferTable(const PlacementDiffs& table, int32_t k, uint32_t* candidateList) {
    const uint8_t* diff = table.diff;
    for (int32_t i = 0; i < table.rows; ++i) {
        uint32_t worst = candidateList[0] >> 24;
        for (int32_t j = 0; j < table.columns; ++j, ++diff) {
            if (*diff > worst)
                continue;
            OfferKey(MakeKey(*diff, table.iFirst + i, table.jFirst + j, k), candidateList);
            worst = candidateList[0] >> 24;
        }
    }
}

}  // namespace

int32_t MaxHeapify(uint32_t* arr, int32_t len, int32_t i) {
    if (arr == nullptr || len < 1)
        return -1;
    if (i < 0 || i >= len)
        return 0;
    // Children of i are 2i + 1 and 2i + 2; none exists from len / 2 on, so that nothing overflows.
    while (i < len / 2) {
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

void RankCandidates(const TemplateSet& set, const PlacementDiffs* tables, uint32_t* candidateList) {
    std::fill_n(candidateList, static_cast<size_t>(s_candidateNum), kKeySentinel);
    for (int32_t k = 0; k < kTpltMax; ++k) {
        if (!set.valid[k])
            continue;
        if (tables != nullptr)
            OfferTable(tables[k], k, candidateList);
        else
            SearchTemplate(set, k, candidateList);
    }
}

int32_t FindCandidate(int32_t* candidate_di, int32_t* candidate_dj) {
    TemplateSet set;
    if (candidate_di == nullptr || candidate_dj == nullptr || s_candidateNum < 1 ||
        !CutTemplates(&set))
        return -1;
    const size_t num = static_cast<size_t>(s_candidateNum);
    uint32_t* const candidateList = static_cast<uint32_t*>(std::malloc(num * sizeof(uint32_t)));
    if (candidateList == nullptr)
        return -1;
    RankCandidates(set, CanTabulate(set) ? TabulatePlacements(set) : nullptr, candidateList);
    for (size_t m = 0; m < num; ++m) {
        const Displacement displacement = DisplacementOf(set.tplts, candidateList[m]);
        candidate_di[m] = displacement.di;
        candidate_dj[m] = displacement.dj;
    }
    std::free(candidateList);
    return 0;
}

}  // namespace fpnavi
