#include "tuning/TuneMeasure.h"

#include <limits>
#include <utility>

#include "base/NaviLog.h"
#include "base/NaviMath.h"
#include "param/NaviLimits.h"
#include "param/NaviParam.h"
#include "tuning/TuneRegisters.h"

namespace fpnavi {
namespace {

constexpr int32_t kCornerNum = 4;

// Calls visit with each grey value of a block of the image, which has width columns.
template <typename Visit>
void ForEachPixel(const uint8_t* img, int32_t width, const _NAVI_BlkNode& block, Visit visit) {
    for (int32_t row = block.StartHeight; row < block.EndHeight; ++row) {
        for (int32_t column = block.StartWidth; column < block.EndWidth; ++column)
            visit(img[row * width + column]);
    }
}

// Sum of the greys of the threshold brightest pixels.
int32_t SumBrightest(const uint32_t* histogram, int32_t threshold) {
    int32_t num_from_end = 0;
    int32_t sum = 0;
    for (int32_t index = kGreyMax; index >= 0; --index) {
        const int32_t count = static_cast<int32_t>(histogram[index]);
        if (count == 0)
            continue;
        if (WrapAdd(num_from_end, count) >= threshold)
            return WrapAdd(sum, WrapMul(index, WrapSub(threshold, num_from_end)));
        sum = WrapAdd(sum, WrapMul(index, count));
        num_from_end = WrapAdd(num_from_end, count);
    }
    return sum;
}

int32_t Classify(uint32_t value, const _NAVI_struRange& band) {
    if (value < band.RANGE_LOW)
        return -1;
    return value > band.RANGE_HIGH ? 1 : 0;
}

// Below 10 or above 250: the difference wraps for the former.
bool Saturated(uint32_t grey) {
    return WrapSubU(grey, 10) > 240;
}

// The frame has blocks, the number of its pixels fits 32 bits, and every table is indexed inside.
bool FrameUsable(const _NAVI_SIZE& size, uint32_t gainCode) {
    return BlockFactorsPositive() && size.iWidth >= 1 && size.iHeight >= 1 &&
           size.iWidth <= std::numeric_limits<int32_t>::max() / size.iHeight &&
           _NAVI_blk_selection_mode >= 0 && _NAVI_blk_selection_mode < kCornerNum &&
           GainCodesUsable(gainCode);
}

// The image's pixels can be divided into sixteenths, the size of a corner block.
bool ImageDividable(int32_t height, int32_t width) {
    return WrapMul(width, height) % 16 == 0;
}

}  // namespace

void _NAVI_SortIndex(int32_t* fValue, int32_t* iIndex, int32_t len) {
    for (; len > 0; --len) {
        int32_t fMax = -1000;  // below every grey
        int32_t iMaxIndex = 0;
        for (int32_t i = 0; i < len; ++i) {
            if (fValue[i] >= fMax) {  // the last of equal values goes to the end
                fMax = fValue[i];
                iMaxIndex = i;
            }
        }
        std::swap(fValue[iMaxIndex], fValue[len - 1]);
        std::swap(iIndex[iMaxIndex], iIndex[len - 1]);
    }
}

// Not inlined: clang would make longer loops of it in MeasureFrame.
[[gnu::noinline]] int32_t _NAVI_CalcTop(uint32_t X, uint32_t Y, const uint32_t* histogram) {
    uint32_t img_count = 0;
    for (int32_t index = 0; index <= kGreyMax; ++index)
        img_count = WrapAddU(img_count, histogram[index]);
    const int32_t i_threshold_X = static_cast<int32_t>(WrapMulU(img_count, X) / 100U);
    const int32_t i_threshold_Y = static_cast<int32_t>(WrapMulU(img_count, Y) / 100U);
    if (i_threshold_X == i_threshold_Y)
        return -1;
    const int32_t i_top_X = SumBrightest(histogram, i_threshold_X);
    const int32_t i_top_Y = SumBrightest(histogram, i_threshold_Y);
    return WrapDiv(WrapSub(i_top_Y, i_top_X), WrapSub(i_threshold_Y, i_threshold_X));
}

bool MeasureCorner(const uint8_t* img, int32_t height, int32_t width, CornerGreys* corner) {
    if (!ImageDividable(height, width)) {
        NAVI_LOG("_NAVI_ImgHistogram", 1590, "error! size cannot be divided by 16!\n");
        return false;
    }
    const int32_t right = static_cast<int32_t>(3 * int64_t{width} / 4);
    const int32_t bottom = static_cast<int32_t>(3 * int64_t{height} / 4);
    const _NAVI_BlkNode Blk_Nodes[kCornerNum] = {{0, 0, width / 4, height / 4},
                                                 {right, 0, width, height / 4},
                                                 {0, bottom, width / 4, height},
                                                 {right, bottom, width, height}};
    const int32_t blk_length = WrapMul(width, height) / 16;
    int32_t blk_mean[kCornerNum];
    for (int32_t b = 0; b < kCornerNum; ++b) {
        int64_t sum = 0;
        ForEachPixel(img, width, Blk_Nodes[b], [&sum](uint8_t grey) { sum += grey; });
        blk_mean[b] = static_cast<int32_t>(sum / blk_length);
    }
    int32_t blk_origin_order[kCornerNum] = {0, 1, 2, 3};
    _NAVI_SortIndex(blk_mean, blk_origin_order, kCornerNum);
    const int32_t rank = _NAVI_blk_selection_mode;
    *corner = {static_cast<uint32_t>(blk_mean[rank]), {}};
    ForEachPixel(img, width, Blk_Nodes[blk_origin_order[rank]],
                 [corner](uint8_t grey) { ++corner->histogram[grey]; });
    return true;
}

std::optional<GreyReading> MeasureFrame(const uint8_t* img, const _NAVI_SIZE& size,
                                        uint32_t gainCode) {
    // An image of the wrong size reads no table, and is reported as such.
    if (ImageDividable(size.iHeight, size.iWidth) && !FrameUsable(size, gainCode))
        return std::nullopt;
    GreyReading reading = {};
    if (!MeasureCorner(img, size.iHeight, size.iWidth, &reading))
        return std::nullopt;
    reading.top = static_cast<uint32_t>(_NAVI_CalcTop(
        _NAVI_top_mean_interval.RANGE_LOW, _NAVI_top_mean_interval.RANGE_HIGH, reading.histogram));
    reading.effective = Classify(reading.mean, _NAVI_range_mean);
    reading.recommend = Classify(reading.mean, _NAVI_range_mean_recommend);
    reading.recommendTop = Classify(reading.top, _NAVI_range_recommend);
    reading.nonLinear = Saturated(reading.mean) && Saturated(reading.top) ? 1 : 0;
    reading.gainCode = gainCode;
    reading.gainFactor = static_cast<uint32_t>(_NAVI_K_CALC(gainCode));
    return reading;
}

}  // namespace fpnavi
