#include "tuning/TuneMeasure.h"

#include <limits>

#include "base/NaviMath.h"
#include "param/NaviLimits.h"
#include "param/NaviParam.h"
#include "tuning/TuneRegisters.h"

namespace fpnavi {
namespace {

int32_t Classify(uint32_t value, const _NAVI_struRange& band) {
    if (value < band.RANGE_LOW)
        return -1;
    return value > band.RANGE_HIGH ? 1 : 0;
}

// Below 10 or above 250: the difference wraps for the former.
bool Saturated(uint32_t grey) {
    return WrapSubU(grey, 10) > 240;
}

// The frame has blocks of pixels whose number fits 32 bits, and every table is indexed inside.
bool FrameUsable(const _NAVI_SIZE& size, uint32_t gainCode) {
    return BlockFactorsPositive() && size.iWidth >= 1 && size.iHeight >= 1 &&
           size.iWidth <= std::numeric_limits<int32_t>::max() / size.iHeight &&
           _NAVI_blk_selection_mode >= 0 && _NAVI_blk_selection_mode <= 3 &&
           GainCodesUsable(gainCode);
}

GreyReading Read(const CornerGreys& corner, uint32_t gainCode) {
    GreyReading reading = {};
    reading.mean = static_cast<uint32_t>(corner.mean);
    reading.top = static_cast<uint32_t>(_NAVI_CalcTop(
        _NAVI_top_mean_interval.RANGE_LOW, _NAVI_top_mean_interval.RANGE_HIGH, corner.histogram));
    reading.effective = Classify(reading.mean, _NAVI_range_mean);
    reading.recommend = Classify(reading.mean, _NAVI_range_mean_recommend);
    reading.recommendTop = Classify(reading.top, _NAVI_range_recommend);
    reading.nonLinear = Saturated(reading.mean) && Saturated(reading.top) ? 1 : 0;
    reading.gainCode = gainCode;
    reading.gainFactor = static_cast<uint32_t>(_NAVI_K_CALC(gainCode));
    return reading;
}

}  // namespace

std::optional<FrameMeasure> MeasureFrame(const uint8_t* img, const _NAVI_SIZE& size,
                                         uint32_t gainCode) {
    // An image of the wrong size reads no table, and is reported as such.
    if (ImageDividable(size.iHeight, size.iWidth) && !FrameUsable(size, gainCode))
        return std::nullopt;
    const std::optional<CornerGreys> corner =
        MeasureCorner(img, size.iHeight, size.iWidth, _NAVI_blk_selection_mode);
    if (!corner)
        return std::nullopt;
    return FrameMeasure{Read(*corner, gainCode), *corner};
}

}  // namespace fpnavi
