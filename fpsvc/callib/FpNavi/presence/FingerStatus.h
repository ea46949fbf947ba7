// Is there a finger? The finger tests of the modes, and the choice between them. Owns nothing; the
// answer goes to s_lastFrameFlag.
#ifndef FPNAVI_FINGERSTATUS_H
#define FPNAVI_FINGERSTATUS_H

#include <cstdint>

namespace fpnavi {

// The test of the hg mode: a dark frame, or one dark quadrant. p_data [in]: the image, at least
// s_imageWidthHg * s_imageHeightHg bytes, the caller's. Returns 1 finger, 0 none, -1 for an image
// without pixels.
int32_t NavFingerDetectHg(const uint8_t* p_data);

// The test of the fp modes: ridge texture, spread of block means, grey range of a block; any one of
// them is enough. p_data [in]: the frame, s_imageHeight rows of s_imageWidth bytes, the caller's.
// Returns 1 finger, 0 none, -1 for a null frame.
int32_t NavFingerDetectFp(const uint8_t* p_data);

// Coverage, in percent, of a double-scan map [in] of 64 cells, of which those exactly 1 count.
int32_t DoubleScanFingerDetect(const uint8_t* DoubleScanZone);

// blk_mean_min [out]: the least mean grey of the four quadrants of the s_imageWidth x
// s_imageHeight image at p_data, 256 when the image is too small for quadrants. Returns 0.
int32_t GetBlkMeanMin(const uint8_t* p_data, int32_t* blk_mean_min);

// blk_mean_diff [out]: the greatest minus the least mean grey of the 4 x 4 blocks of the frame at
// buffer, or -1, less than every spread, when the frame is too small for blocks. Returns 0.
int32_t GetBlkMeanDiff(const uint8_t* buffer, int32_t* blk_mean_diff);

// range [out]: the greatest grey range of the 4 x 4 blocks of the frame at buffer, each cut by
// s_cutOffPercent at both ends. Returns 0, or -1 for a null pointer.
int32_t GetGreyRange(const uint8_t* buffer, int32_t* range);

}  // namespace fpnavi

#endif  // FPNAVI_FINGERSTATUS_H
