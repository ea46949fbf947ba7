// The full image: the nine tiles of a navigation frame at the distances that the sensor's unread
// gaps put between them. Owns nothing.
#ifndef FPNAVI_FULLIMAGE_H
#define FPNAVI_FULLIMAGE_H

#include <cstdint>

#include "FpNavi.h"

namespace fpnavi {

// Spreads img into full_img, whose buffers are replaced; gap pixels have class 255 and grey 0. The
// measures of full_img are not written. Returns 0; -1 for null pointers, a source without buffers
// or not of the tiles' size, or tiles and gaps that make no usable full image (full_img stays as it
// is), and for a failed allocation (full_img has the new sizes but no buffers).
int32_t GetFullImg(const NaviFrame_t* img, NaviFrame_t* full_img);

}  // namespace fpnavi

#endif  // FPNAVI_FULLIMAGE_H
