// The candidates: the placements with the least grey difference, as displacements. Owns nothing.
#ifndef FPNAVI_CANDIDATESEARCH_H
#define FPNAVI_CANDIDATESEARCH_H

#include <cstdint>

#include "matching/PlacementScores.h"
#include "matching/Templates.h"

namespace fpnavi {

// Candidate displacements of num placements: rows di, columns dj. Both arrays are the caller's.
struct Candidates {
    int32_t* di;
    int32_t* dj;
    int32_t num;

    Displacement At(int32_t m) const { return {di[m], dj[m]}; }
    void Set(int32_t m, const Displacement& displacement) const {
        di[m] = displacement.di;
        dj[m] = displacement.dj;
    }
};

// Fills candidates [out] with the displacements of the candidates.num smallest keys: that of the
// best placement first, the others in no order; those of the sentinel where there are fewer
// placements.
void SelectCandidates(const TemplateSet& set, const PlacementTables& tables,
                      const Candidates& candidates);

// Fills keys [out], num of them, with the best keys of all placements as a bounded max-heap.
// Placements are offered template by template, row by row. Sentinels stay where there are fewer
// than num.
void RankCandidates(const PlacementTables& tables, uint32_t* keys, int32_t num);

// Sift-down of arr[i] in arr [in, out], a max-heap of len keys, the caller's. Ties: a parent stays
// above an equal child, and the left child is preferred to an equal right one. Returns 0 (also for
// i >= len), or -1 for a null arr or len < 1.
int32_t MaxHeapify(uint32_t* arr, int32_t len, int32_t i);

// Fills both arrays [out] (s_candidateNum entries, the caller's) with the displacements, rows and
// columns in pixels of the frame that FindMatch compares, of the best placements of the templates
// between s_imagePrev and s_imageCurr, in the order of the heap. Returns 0; -1 when the template
// has no area, the frames are not of the image's size, a template or a placement would leave the
// frame or its key, or the candidate list cannot be allocated.
int32_t FindCandidate(int32_t* candidate_di, int32_t* candidate_dj);

}  // namespace fpnavi

#endif  // FPNAVI_CANDIDATESEARCH_H
