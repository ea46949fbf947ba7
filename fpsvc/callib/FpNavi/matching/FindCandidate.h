// The template candidate search: small templates of one frame are slid over the other, and the
// placements with the least grey difference become candidate displacements. Owns nothing.
#ifndef FPNAVI_FINDCANDIDATE_H
#define FPNAVI_FINDCANDIDATE_H

#include <cstdint>

#include "matching/PlacementDiffs.h"
#include "matching/Templates.h"

namespace fpnavi {

// Sinks arr[i] until no child is larger; of equal children the left one rises, a parent never
// yields to an equal. arr: len keys, the caller's. Returns 0 (also for i >= len), or -1 for a null
// arr or len < 1.
int32_t MaxHeapify(uint32_t* arr, int32_t len, int32_t i);

// Fills candidateList (s_candidateNum keys, the caller's) with the best keys of all placements, as
// a heap: offered template by template, row by row, they take an order that decides between equals.
// tables: what TabulatePlacements gives for set, or null to score the placements one by one.
void RankCandidates(const TemplateSet& set, const PlacementDiffs* tables, uint32_t* candidateList);

// Fills both arrays (s_candidateNum entries, the caller's) with the displacements, rows and
// columns in pixels of the frame that FindMatch compares, of the best placements of the templates
// between s_imagePrev and s_imageCurr. Returns 0; -1 when the template has no area, a template or
// a placement would leave the frame or its key, or the candidate list cannot be allocated.
int32_t FindCandidate(int32_t* candidate_di, int32_t* candidate_dj);

}  // namespace fpnavi

#endif  // FPNAVI_FINDCANDIDATE_H
