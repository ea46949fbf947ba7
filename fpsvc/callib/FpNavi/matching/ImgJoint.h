// Template matching of a frame pair: candidates are proposed from small templates and verified on
// the whole overlap. Owns nothing; reads the frames, writes the fingerprint entries of the record.
#ifndef FPNAVI_IMGJOINT_H
#define FPNAVI_IMGJOINT_H

#include <cstdint>

namespace fpnavi {

// Matches s_imagePrev and s_imageCurr and writes dx_fp, dy_fp, diff and vkey_fp at calc_cnt of
// s_voteInfo. Returns 0, or -1 with nothing written when an allocation, the candidate search or
// the assembly of a full image failed.
int32_t CalcImgJoint();

// Compares the frames at each of the s_candidateNum displacements (rows candidate_di, columns
// candidate_dj; both arrays stay the caller's). Writes the best one, pixels to the right and
// upwards, and its mean grey difference (255: too little common finger area). Returns 0.
int32_t FindMatch(const int32_t* candidate_di, const int32_t* candidate_dj, int32_t* dx,
                  int32_t* dy, int32_t* difference);

}  // namespace fpnavi

#endif  // FPNAVI_IMGJOINT_H
