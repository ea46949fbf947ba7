// The candidates of a search in the order of a bounded max-heap: of two that match equally well the
// one that comes earlier in the heap's array wins. Owns nothing.
#ifndef FPNAVI_CANDIDATEHEAP_H
#define FPNAVI_CANDIDATEHEAP_H

#include <cstdint>

#include "matching/PlacementScores.h"

namespace fpnavi {

// Sift-down of arr[i] in arr [in, out], a max-heap of len keys, the caller's. Ties: a parent stays
// above an equal child, and the left child is preferred to an equal right one. Returns 0 (also for
// i >= len), or -1 for a null arr or len < 1.
int32_t MaxHeapify(uint32_t* arr, int32_t len, int32_t i);

// Fills keys [out], num of them, with the best keys of all placements as a max-heap. Placements are
// offered template by template, row by row. Sentinels stay where there are fewer than num.
void RankCandidates(const PlacementTables& tables, uint32_t* keys, int32_t num);

}  // namespace fpnavi

#endif  // FPNAVI_CANDIDATEHEAP_H
