// Rows of pixels as bits: words of 64 columns, as many as the row needs; bit c of word w is column
// 64 * w + c. Owns nothing.
#ifndef FPNAVI_BITROWS_H
#define FPNAVI_BITROWS_H

#include <algorithm>
#include <cstdint>

#include "base/NaviSimd.h"

namespace fpnavi {

inline constexpr int32_t kWordPixels = 64;

// Words of a row of width pixels.
inline int32_t WordsOf(int32_t width) {
    return (width + kWordPixels - 1) / kWordPixels;
}

// The first count bits, all from 64 on; count >= 1.
inline uint64_t FirstBits(int32_t count) {
    return count < kWordPixels ? ~uint64_t{0} >> (kWordPixels - count) : ~uint64_t{0};
}

// All bits from first on; 0 <= first < 64. Shifted twice, so that no set bit is shifted out.
inline uint64_t BitsFrom(int32_t first) {
    return ~uint64_t{0} >> first << first;
}

// The bits from first up to but without last; 0 <= first < last, first < 64.
inline uint64_t BitsBetween(int32_t first, int32_t last) {
    return BitsFrom(first) & FirstBits(last);
}

// Bit c is set where row[c] <= value. row [in]: width bytes, 1 <= width <= 64, of which up to 15
// bytes behind the last are read too.
inline uint64_t AtMostBits(const uint8_t* row, int32_t width, uint8_t value) {
    const Bytes16 most = Splat16(value);
    uint64_t bits = 0;
    for (int32_t c = 0; c < width; c += kLanes) {
        const Bytes16 above = Excess16(Load16(row + c), most);
        bits |= static_cast<uint64_t>(TopBits16(Equal16(above, Splat16(0)))) << c;
    }
    return bits & FirstBits(width);
}

}  // namespace fpnavi

#endif  // FPNAVI_BITROWS_H
