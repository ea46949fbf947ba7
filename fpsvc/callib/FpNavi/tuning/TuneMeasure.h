// Tuning, the measurement: what a frame shows and where that lies in the bands. Owns nothing and
// writes no state; reads the parameters of the calibration.
#ifndef FPNAVI_TUNEMEASURE_H
#define FPNAVI_TUNEMEASURE_H

#include <cstdint>
#include <optional>

#include "FpNavi.h"
#include "tuning/TuneHistogram.h"

namespace fpnavi {

// A frame in numbers. Flags: -1 below a band, 0 inside, 1 above, 3 not computed yet.
struct GreyReading {
    uint32_t mean;         // grey of the measured block
    uint32_t top;          // grey of its brightest pixels; all bits set when there is none
    int32_t effective;     // mean against _NAVI_range_mean
    int32_t recommend;     // mean against _NAVI_range_mean_recommend
    int32_t recommendTop;  // top against _NAVI_range_recommend
    int32_t nonLinear;     // 1: mean and top both lie outside 10..250
    uint32_t gainCode;     // packed: four fields of 4 bits
    uint32_t gainFactor;   // grey levels per DC step, in hundredths
};

struct FrameMeasure {
    GreyReading reading;
    CornerGreys corner;  // the measured block
};

// Measures the frame img [in] of the given size (row by row, the caller's), taken at the packed
// gain code. Empty when it cannot be measured: its pixels are no multiple of 16, which is logged
// whatever else is wrong; one of the block sizes and counts is not positive; its pixels do not fit
// 32 bits; the rank of the block or a gain field lies outside its table.
std::optional<FrameMeasure> MeasureFrame(const uint8_t* img, const _NAVI_SIZE& size,
                                         uint32_t gainCode);

}  // namespace fpnavi

#endif  // FPNAVI_TUNEMEASURE_H
