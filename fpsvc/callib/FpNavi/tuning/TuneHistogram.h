// Tuning, the measurement: which corner of the frame is looked at, how bright it is, and how much a
// step of the DC register changes it. Owns the values below; Tune stores the last three.
#ifndef FPNAVI_TUNEHISTOGRAM_H
#define FPNAVI_TUNEHISTOGRAM_H

#include <cstdint>

#include "FpNavi.h"

namespace fpnavi {

inline constexpr int32_t _NAVI_ENLARGE_K = 100;  // gain factors are in hundredths

extern uint32_t _NAVI_img_histogram[256];  // of the measured block, by grey level
extern uint32_t _NAVI_mean;                // grey of the measured block; 3 before the first call
extern uint32_t _NAVI_top_mean;            // grey of its brightest pixels; 3 before the first call
extern uint32_t _NAVI_G20C;                // packed gain code: four fields of 4 bits
extern uint32_t _NAVI_K_value;             // grey levels per DC step, in hundredths

// The image's pixels can be divided into sixteenths, the size of a corner block.
bool ImageDividable(int32_t height, int32_t width);

// Measures the corner block of the image (height rows of width bytes, the caller's) whose mean has
// the rank _NAVI_blk_selection_mode: _NAVI_mean and _NAVI_img_histogram. Returns 0; -1, with a
// mean of 0, the old histogram and a log line, when the image cannot be divided by 16.
int32_t _NAVI_ImgHistogram(const uint8_t* img, int32_t height, int32_t width);

// Sorts len values ascending, and the tags in iIndex along with them.
void _NAVI_SortIndex(int32_t* fValue, int32_t* iIndex, int32_t len);

// Mean grey of the pixels ranked between X and Y percent from the brightest, or -1 when the two
// ranks coincide. histogram: 256 counts by grey level, the caller's.
int32_t _NAVI_CalcTop(uint32_t X, uint32_t Y, const uint32_t* histogram);

// Packs the four gain fields of the two registers' values.
uint32_t PackGainCode(uint32_t gain20, uint32_t gain2C);

// The gain fields that _NAVI_K_CALC reads, of g and of _NAVI_GAIN_REF, lie in its tables.
bool GainCodesUsable(uint32_t g);

// Grey levels per DC step, in hundredths, at the packed gain code g: _NAVI_INPUT_K, which holds at
// the code _NAVI_GAIN_REF, scaled by the amplifiers' ratios. GainCodesUsable(g) holds.
int32_t _NAVI_K_CALC(uint32_t g);

}  // namespace fpnavi

#endif  // FPNAVI_TUNEHISTOGRAM_H
