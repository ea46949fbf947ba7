// Tuning, the corner: which corner block of the frame is measured, how bright it is, and the top
// grey of its histogram. Owns nothing and reads no state: arguments in, values out.
#ifndef FPNAVI_TUNEHISTOGRAM_H
#define FPNAVI_TUNEHISTOGRAM_H

#include <cstdint>
#include <optional>

#include "base/GreyHistogram.h"

namespace fpnavi {

// What one corner block shows.
struct CornerGreys {
    int32_t mean;                     // sum of its greys / (pixels of the image / 16)
    uint32_t histogram[kGreyLevels];  // pixels of each grey level
};

// The image's pixels can be divided into sixteenths, the size of a corner block.
bool ImageDividable(int32_t height, int32_t width);

// Measures the corner block of the image (height rows of width bytes, the caller's) whose mean has
// the given rank, 0 the darkest to 3. Empty, with a log line, when the image cannot be divided by
// 16; height and width are positive and their product fits 32 bits otherwise.
std::optional<CornerGreys> MeasureCorner(const uint8_t* img, int32_t height, int32_t width,
                                         int32_t rank);

// Sorts the len values fValue [in, out] ascending, and the tags iIndex [in, out] in the same way.
// Not stable: each step swaps the last of the largest values with the last value not yet in place.
void _NAVI_SortIndex(int32_t* fValue, int32_t* iIndex, int32_t len);

// Mean grey of the pixels ranked between X and Y percent from the brightest, or -1 when the two
// ranks coincide. histogram: 256 counts by grey level, the caller's.
int32_t _NAVI_CalcTop(uint32_t X, uint32_t Y, const uint32_t* histogram);

}  // namespace fpnavi

#endif  // FPNAVI_TUNEHISTOGRAM_H
