// Template matching of a frame pair: candidates are proposed from small templates and verified on
// the whole overlap. Owns nothing; writes the fingerprint entries of the record.
#ifndef FPNAVI_PAIRMATCH_H
#define FPNAVI_PAIRMATCH_H

#include <cstdint>

#include "frame/FramePair.h"

namespace fpnavi {

// Matches pair, the laid out s_imagePrev and s_imageCurr, and writes dx_fp, dy_fp, diff and vkey_fp
// at calc_cnt of s_voteInfo. Returns 0, or -1 with nothing written when an allocation, the
// candidate search or the assembly of a full image failed.
int32_t MatchPair(const FramePair& pair);

// MatchPair of s_imagePrev and s_imageCurr. Returns -1 also for frames without pixels or of
// different sizes.
int32_t CalcImgJoint();

}  // namespace fpnavi

#endif  // FPNAVI_PAIRMATCH_H
