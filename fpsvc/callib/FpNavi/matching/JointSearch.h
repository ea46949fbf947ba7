// Candidate search and match of small frames in one step: the same displacement and score as
// FindCandidate and FindMatch one after the other. Owns nothing but its scratch.
#ifndef FPNAVI_JOINTSEARCH_H
#define FPNAVI_JOINTSEARCH_H

#include <cstdint>

#include "matching/PlacementDiffs.h"
#include "matching/Templates.h"

namespace fpnavi {

struct Match {
    Displacement displacement;
    int32_t diff;
};

// The best match of all candidates, between the frame that the templates are cut from and the
// searched one. set: one for which CanTabulate, of frames that SetMatchFrames takes. candidateList:
// s_candidateNum keys, the caller's, used as scratch.
Match SearchJointly(const TemplateSet& set, uint32_t* candidateList);

}  // namespace fpnavi

#endif  // FPNAVI_JOINTSEARCH_H
