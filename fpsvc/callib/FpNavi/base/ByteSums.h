// Sums of bytes, sixteen at a time, that read nothing outside the frame. Owns nothing.
#ifndef FPNAVI_BYTESUMS_H
#define FPNAVI_BYTESUMS_H

#include <cstdint>

#include "base/NaviSimd.h"

namespace fpnavi {

inline constexpr int32_t kMostSummed = 1 << 22;  // bytes: 255 * 2^22 < 2^30

// Sixteen bytes from kLastBytes + n on are a mask of the last n of sixteen; 0 <= n <= 16.
inline constexpr uint8_t kLastBytes[2 * kLanes] = {
    0,   0,   0,   0,   0,   0,   0,   0,   0,   0,   0,   0,   0,   0,   0,   0,
    255, 255, 255, 255, 255, 255, 255, 255, 255, 255, 255, 255, 255, 255, 255, 255};

// Sum of a block of a frame: height rows of width bytes, stride bytes apart, at most kMostSummed
// bytes in all.
//   frame [in]  the caller's; no byte before it or behind the block's last row is read
//   first       index in frame of the block's first byte
// The end of a row is read together with the bytes before it, which are masked. A row that ends
// within the first 15 bytes of frame has too few bytes before its end and is summed byte by byte.
inline int32_t SumBlock(const uint8_t* frame, int32_t first, int32_t width, int32_t height,
                        int32_t stride) {
    const Bytes16 last = Load16(kLastBytes + width % kLanes);
    Sums sums = NoSums();
    int32_t nearStart = 0;
    for (int32_t row = 0; row < height; ++row) {
        const uint8_t* p = frame + (first + row * stride);
        int32_t left = width;
        for (; left >= 4 * kLanes; left -= 4 * kLanes) {  // the loop costs as much as two of these
            sums = AddBytes(AddBytes(sums, Load16(p)), Load16(p + kLanes));
            sums = AddBytes(AddBytes(sums, Load16(p + 2 * kLanes)), Load16(p + 3 * kLanes));
            p += 4 * kLanes;
        }
        for (; left >= kLanes; left -= kLanes) {
            sums = AddBytes(sums, Load16(p));
            p += kLanes;
        }
        if (p + left - frame >= kLanes) {
            sums = AddBytes(sums, And16(Load16(p + left - kLanes), last));
        } else {
            for (; left > 0; --left)
                nearStart += *p++;
        }
    }
    return Total(sums) + nearStart;
}

}  // namespace fpnavi

#endif  // FPNAVI_BYTESUMS_H
