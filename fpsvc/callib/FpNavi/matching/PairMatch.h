// Template matching of a frame pair: which of the candidate displacements fits best on the whole
// overlap. Owns nothing; writes the fingerprint entries of the record.
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

// Compares s_imagePrev and s_imageCurr, in tiles where there are full images of them, at each of
// the s_candidateNum displacements (rows candidate_di, columns candidate_dj; both arrays stay the
// caller's). Writes [out] the first of the best ones, pixels to the right and upwards, and its mean
// grey difference (255: too little common finger area). Returns 0; -1 for frames without pixels or
// of different sizes.
int32_t FindMatch(const int32_t* candidate_di, const int32_t* candidate_dj, int32_t* dx,
                  int32_t* dy, int32_t* difference);

}  // namespace fpnavi

#endif  // FPNAVI_PAIRMATCH_H
