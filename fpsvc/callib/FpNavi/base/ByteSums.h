// Sums of bytes, sixteen at a time, that read nothing outside the frame. Owns nothing.
#ifndef FPNAVI_BYTESUMS_H
#define FPNAVI_BYTESUMS_H

#include <cstdint>

#include "base/NaviSimd.h"

namespace fpnavi {

inline constexpr int32_t kMostSummed = 1 << 22;  // bytes: 255 * 2^22 < 2^30

// Sixteen bytes from rest on keep the last rest of sixteen.
inline constexpr uint8_t kLastBytes[2 * kLanes] = {
    0,   0,   0,   0,   0,   0,   0,   0,   0,   0,   0,   0,   0,   0,   0,   0,
    255, 255, 255, 255, 255, 255, 255, 255, 255, 255, 255, 255, 255, 255, 255, 255};

// Sum of a block of the frame: height rows of width bytes, the first at frame[first], each stride
// behind the one before; at most kMostSummed bytes. The end of a row is read with the bytes before
// it, which are masked; only rows that end within the first sixteen bytes of the frame are too near
// to its start for that.
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
