// The match: which of the candidate displacements fits best on the whole overlap. Owns nothing.
#ifndef FPNAVI_MATCHSEARCH_H
#define FPNAVI_MATCHSEARCH_H

#include <cstdint>

#include "matching/CandidateSearch.h"
#include "matching/PlacementScores.h"

namespace fpnavi {

struct Match {
    Displacement displacement;
    int32_t diff;  // score of DisplacementScore
};

// The best match of all candidates of pair, as FindCandidate and FindMatch would give it one after
// the other. candidates: scratch of params.candidateNum entries, the caller's.
Match SearchMatch(const SearchParams& params, const TemplateSet& set, const FramePair& pair,
                  const SearchMemory& memory, const Candidates& candidates);

// A match as the vote record has it: pixels to the right and upwards.
struct Move {
    int32_t dx;
    int32_t dy;
};
Move MoveOf(const Displacement& displacement, const FramePair& pair);

// Compares s_imagePrev and s_imageCurr, in tiles where there are full images of them, at each of
// the s_candidateNum displacements (rows candidate_di, columns candidate_dj; both arrays stay the
// caller's). Writes [out] the first of the best ones, pixels to the right and upwards, and its mean
// grey difference (255: too little common finger area). Returns 0; -1 for frames without pixels or
// of different sizes.
int32_t FindMatch(const int32_t* candidate_di, const int32_t* candidate_dj, int32_t* dx,
                  int32_t* dy, int32_t* difference);

}  // namespace fpnavi

#endif  // FPNAVI_MATCHSEARCH_H
