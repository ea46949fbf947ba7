// The finger test of the fp modes: ridge texture, spread of block means, grey range of a block; any
// one of them is enough. Owns nothing.
#ifndef FPNAVI_FINGERSTATUSFP_H
#define FPNAVI_FINGERSTATUSFP_H

#include <cstdint>

namespace fpnavi {

// p_data [in]: the frame, s_imageHeight rows of s_imageWidth bytes, the caller's. Returns 1 finger,
// 0 none, -1 for a null frame.
int32_t NavFingerDetectFp(const uint8_t* p_data);

// blk_mean_diff [out]: the greatest minus the least mean grey of the 4 x 4 blocks of the frame at
// buffer, or -1, less than every spread, when the frame is too small for blocks. Returns 0.
int32_t GetBlkMeanDiff(const uint8_t* buffer, int32_t* blk_mean_diff);

// range [out]: the greatest grey range of the 4 x 4 blocks of the frame at buffer, each cut by
// s_cutOffPercent at both ends. Returns 0, or -1 for a null pointer.
int32_t GetGreyRange(const uint8_t* buffer, int32_t* range);

}  // namespace fpnavi

#endif  // FPNAVI_FINGERSTATUSFP_H
