// Pre-processing of a new frame: which pixels are finger, how strong is the contrast, and, in the
// fp modes, the greys of the finger stretched to the full scale. Owns nothing.
#ifndef FPNAVI_PREPROCESS_H
#define FPNAVI_PREPROCESS_H

#include <cstdint>

#include "FpNavi.h"
#include "base/GreyHistogram.h"

namespace fpnavi {

// Pre-processes img in place. Returns 0, or -1 for a frame without pixels (fp modes).
int32_t ImgPreProcess(NaviFrame_t* img);

// Binarisation threshold by the largest variance between the classes. thr [out] receives the
// threshold 1..254 (0 for a flat image), scale [out] the distance of the class means, 0..254.
// Returns 0, or -1 for a null pointer or an empty frame.
int32_t CalcBiThr(const NaviFrame_t* img, int32_t* thr, int32_t* scale);

// CalcBiThr of size pixels. hist [in]: their greys, counted.
void SplitGreys(const int32_t (&hist)[kGreyLevels], int32_t size, int32_t* thr, int32_t* scale);

// Builds the finger area in pType: the pixels of grey <= thr and all between two of them in a row
// or a column, twice over. img has pixels, and room behind them (FrameBytes).
void GetFingerRidge(NaviFrame_t* img, int32_t thr);

// Stretches the greys of the finger area so that its s_cutOffPercent percentile becomes 0 and the
// opposite one scale. Returns 0, or -1 for a frame without pixels.
int32_t StretchRange(NaviFrame_t* img, uint8_t scale);

}  // namespace fpnavi

#endif  // FPNAVI_PREPROCESS_H
