#include "tuning/TuneHistogram.h"

#include <utility>

#include "FpNavi.h"
#include "base/NaviLog.h"
#include "base/NaviMath.h"

namespace fpnavi {
namespace {

constexpr int32_t kCornerNum = 4;

// The corner blocks, a quarter of each side: top left, top right, bottom left, bottom right.
void CutCorners(int32_t height, int32_t width, _NAVI_BlkNode (&Blk_Nodes)[kCornerNum]) {
    const int32_t right = static_cast<int32_t>(3 * int64_t{width} / 4);
    const int32_t bottom = static_cast<int32_t>(3 * int64_t{height} / 4);
    Blk_Nodes[0] = {0, 0, width / 4, height / 4};
    Blk_Nodes[1] = {right, 0, width, height / 4};
    Blk_Nodes[2] = {0, bottom, width / 4, height};
    Blk_Nodes[3] = {right, bottom, width, height};
}

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

}  // namespace

bool ImageDividable(int32_t height, int32_t width) {
    return WrapMul(width, height) % 16 == 0;
}

std::optional<CornerGreys> MeasureCorner(const uint8_t* img, int32_t height, int32_t width,
                                         int32_t rank) {
    if (!ImageDividable(height, width)) {
        NAVI_LOG("_NAVI_ImgHistogram", 1590, "error! size cannot be divided by 16!\n");
        return std::nullopt;
    }
    int32_t blk_mean[kCornerNum] = {0, 0, 0, 0};
    int32_t blk_origin_order[kCornerNum] = {0, 1, 2, 3};
    const int32_t blk_length = WrapMul(width, height) / 16;
    _NAVI_BlkNode Blk_Nodes[kCornerNum];
    CutCorners(height, width, Blk_Nodes);
    for (int32_t b = 0; b < kCornerNum; ++b) {
        int64_t sum = 0;
        ForEachPixel(img, width, Blk_Nodes[b], [&sum](uint8_t grey) { sum += grey; });
        blk_mean[b] = static_cast<int32_t>(sum / blk_length);
    }
    _NAVI_SortIndex(blk_mean, blk_origin_order, kCornerNum);
    CornerGreys corner = {blk_mean[rank], {}};
    ForEachPixel(img, width, Blk_Nodes[blk_origin_order[rank]],
                 [&corner](uint8_t grey) { ++corner.histogram[grey]; });
    return corner;
}

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

int32_t _NAVI_CalcTop(uint32_t X, uint32_t Y, const uint32_t* histogram) {
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

}  // namespace fpnavi
