#include "presence/FingerStatusHg.h"

#include <algorithm>

#include "base/ByteSums.h"
#include "base/NaviMath.h"
#include "param/NaviParam.h"

namespace fpnavi {
namespace {

constexpr int32_t kMeanNone = 256;  // above every mean of grey levels

// Sum of the first count bytes of the frame. Deliberate: its low 32 bits alone, which the mean
// divides.
int32_t FrameSum(const uint8_t* p_data, int32_t count) {
    int64_t sum = 0;
    while (count > 0) {
        const int32_t part = std::min(count, kMostSummed);
        sum += SumBlock(p_data, 0, part, 1, part);
        p_data += part;
        count -= part;
    }
    return Wrap(sum);
}

}  // namespace

int32_t GetBlkMeanMin(const uint8_t* p_data, int32_t* blk_mean_min) {
    const int32_t colNum = 2;
    const int32_t rowNum = 2;
    const int32_t blkNum = colNum * rowNum;
    const int32_t blkHeight = s_imageHeight / rowNum;
    const int32_t blkWidth = s_imageWidth / colNum;
    *blk_mean_min = kMeanNone;
    if (blkHeight < 1 || blkWidth < 1)
        return 0;
    for (int32_t k = 0; k < blkNum; ++k) {
        const int32_t first = k / colNum * blkHeight * s_imageWidth + k % colNum * blkWidth;
        // At most 2048 x 2048 = 2^22 pixels.
        const int32_t sum = SumBlock(p_data, first, blkWidth, blkHeight, s_imageWidth);
        *blk_mean_min = std::min(*blk_mean_min, sum / (blkWidth * blkHeight));
    }
    return 0;
}

int32_t NavFingerDetectHg(const uint8_t* p_data) {
    const int32_t imgSize = WrapMul(s_imageWidthHg, s_imageHeightHg);
    if (imgSize < 1)
        return -1;
    const int32_t mean = FrameSum(p_data, imgSize) / imgSize;
    if (mean <= s_meanThreshold)
        return 1;
    if (!IsHighSensitive())
        return 0;
    int32_t blkMeanMin = kMeanNone;
    GetBlkMeanMin(p_data, &blkMeanMin);
    return blkMeanMin <= s_meanThreshold ? 1 : 0;
}

}  // namespace fpnavi
