// The finger test of the hg mode: a dark frame, or one dark quadrant. Owns nothing.
#ifndef FPNAVI_FINGERSTATUSHG_H
#define FPNAVI_FINGERSTATUSHG_H

#include <cstdint>

namespace fpnavi {

// p_data [in]: the image, at least s_imageWidthHg * s_imageHeightHg bytes, the caller's. Returns 1
// finger, 0 none, -1 for an image without pixels.
int32_t NavFingerDetectHg(const uint8_t* p_data);

// blk_mean_min [out]: the least mean grey of the four quadrants of the s_imageWidth x
// s_imageHeight image at p_data, 256 when the image is too small for quadrants. Returns 0.
int32_t GetBlkMeanMin(const uint8_t* p_data, int32_t* blk_mean_min);

}  // namespace fpnavi

#endif  // FPNAVI_FINGERSTATUSHG_H
