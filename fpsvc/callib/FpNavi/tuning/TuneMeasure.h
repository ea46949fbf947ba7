// Tuning, the measurement: which corner block of the frame is measured, what it shows, and where
// that lies in the bands. Owns nothing and writes no state; reads the parameters of the
// calibration.
#ifndef FPNAVI_TUNEMEASURE_H
#define FPNAVI_TUNEMEASURE_H

#include <cstdint>
#include <optional>

#include "FpNavi.h"
#include "base/GreyHistogram.h"

namespace fpnavi {

// What one corner block shows.
struct CornerGreys {
    uint32_t mean;                    // sum of its greys / (pixels of the image / 16)
    uint32_t histogram[kGreyLevels];  // pixels of each grey level
};

// A frame in numbers: the measured block and the values below. Flags: -1 below a band, 0 inside, 1
// above, 3 not computed yet.
struct GreyReading : CornerGreys {
    uint32_t top;          // grey of its brightest pixels; all bits set when there is none
    int32_t effective;     // mean against _NAVI_range_mean
    int32_t recommend;     // mean against _NAVI_range_mean_recommend
    int32_t recommendTop;  // top against _NAVI_range_recommend; kept only
    int32_t nonLinear;     // 1: mean and top both lie outside 10..250
    uint32_t gainCode;     // packed: four fields of 4 bits
    uint32_t gainFactor;   // grey levels per DC step, in hundredths
};

// Measures the corner block of the image (height rows of width bytes, the caller's) whose mean has
// the rank _NAVI_blk_selection_mode, 0 the darkest to 3. Returns false, with a log line and corner
// [out] left as it was, when the image cannot be divided by 16; height and width are positive and
// their product fits 32 bits otherwise.
bool MeasureCorner(const uint8_t* img, int32_t height, int32_t width, CornerGreys* corner);

// Measures the frame img [in] of the given size (row by row, the caller's), taken at the packed
// gain code. Empty when it cannot be measured: its pixels are no multiple of 16, which is logged
// whatever else is wrong; one of the block sizes and counts is not positive; its pixels do not fit
// 32 bits; the rank of the block or a gain field lies outside its table.
std::optional<GreyReading> MeasureFrame(const uint8_t* img, const _NAVI_SIZE& size,
                                        uint32_t gainCode);

// Sorts the len values fValue [in, out] ascending, and the tags iIndex [in, out] in the same way.
// Not stable: each step swaps the last of the largest values with the last value not yet in place.
void _NAVI_SortIndex(int32_t* fValue, int32_t* iIndex, int32_t len);

// Mean grey of the pixels ranked between X and Y percent from the brightest, or -1 when the two
// ranks coincide. histogram: 256 counts by grey level, the caller's.
int32_t _NAVI_CalcTop(uint32_t X, uint32_t Y, const uint32_t* histogram);

}  // namespace fpnavi

#endif  // FPNAVI_TUNEMEASURE_H
