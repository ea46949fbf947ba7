// A small frame laid out for comparing with another one at any displacement: rows of fixed length
// with room around, pixels outside the finger made neutral. Owns room for the two frames of a pair;
// ShiftTest and TileMatch lay out there what they compare.
#ifndef FPNAVI_MASKEDFRAME_H
#define FPNAVI_MASKEDFRAME_H

#include <cstdint>

#include "FpNavi.h"
#include "base/BitRows.h"

namespace fpnavi {

inline constexpr int32_t kRowStride = 2 * kWordPixels;  // 64 pixels, then 64 bytes of room
inline constexpr int32_t kPlaneBytes = kWordPixels * kRowStride + kWordPixels;

// A pixel's grey stands in low and high. Outside the finger low is 0 and high 255, so that for two
// pixels a and b max(a.low - b.high, 0) + max(b.low - a.high, 0) is their grey difference where
// both are finger, and 0 elsewhere. The room before and behind a row is outside the finger.
struct MaskedFrame {
    uint8_t low[kPlaneBytes];
    uint8_t high[kPlaneBytes];
    uint64_t finger[kWordPixels];  // for each row, the columns that are finger
    int32_t area;                  // pixels that are finger
    int32_t width;                 // of the frame laid out last; all bytes around it are neutral
    int32_t height;
};

// Scratch: each comparison lays out its frames anew; only the neutral bytes around them stay.
extern MaskedFrame s_maskedFirst;
extern MaskedFrame s_maskedSecond;

// Lays out img, which FitsWords.
void LayOut(const NaviFrame_t& img, MaskedFrame* masked);

// Which pixels of two frames meet: (r, c) of the first and (r + rowOffset, c + columnOffset) of the
// second, for the rows r and columns c that are set. All of them lie inside both frames.
struct Pairing {
    uint64_t rows;
    uint64_t columns;
    int32_t rowOffset;
    int32_t columnOffset;

    int32_t Pixels() const { return CountBits(rows) * CountBits(columns); }
};

// Pixels of the pairing that are finger in both frames.
int32_t CommonArea(const MaskedFrame& first, const MaskedFrame& second, const Pairing& pairing);

// Sum of the grey differences over the pairing's common area. Stops early, with a sum of at least
// limit, once limit is reached; a sum only grows.
int64_t DifferenceSum(const MaskedFrame& first, const MaskedFrame& second, const Pairing& pairing,
                      int64_t limit);

}  // namespace fpnavi

#endif  // FPNAVI_MASKEDFRAME_H
