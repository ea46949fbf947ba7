// The frame-pair driver behind OrientationCalc. Owns nothing; moves frames, counts s_frameNum, lets
// the motion methods fill the record and advances calc_cnt. FpNaviClear empties all of it.
#ifndef FPNAVI_ORIENTATIONCALC_H
#define FPNAVI_ORIENTATIONCALC_H

#include <cstdint>

namespace fpnavi {

// Evaluates the pair s_imagePrev, s_imageCurr. Returns 0 when an entry was added, or the pair was
// dropped because a frame covers too little or the record is full; -1 when a step failed.
int32_t OrntCalcProcess();

}  // namespace fpnavi

#endif  // FPNAVI_ORIENTATIONCALC_H
