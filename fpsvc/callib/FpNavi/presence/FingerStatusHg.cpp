#include "presence/FingerStatusHg.h"

#include <algorithm>

#include "base/NaviMath.h"
#include "param/NaviParam.h"

namespace fpnavi {
namespace {

constexpr int32_t kMeanNone = 256;  // above every mean of grey levels

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
        const uint8_t* const block =
            p_data + k / colNum * blkHeight * s_imageWidth + k % colNum * blkWidth;
        int32_t sum = 0;  // at most 255 * 2048 * 2048 < 2^31
        for (int32_t row = 0; row < blkHeight; ++row) {
            for (int32_t column = 0; column < blkWidth; ++column)
                sum += block[row * s_imageWidth + column];
        }
        *blk_mean_min = std::min(*blk_mean_min, sum / (blkWidth * blkHeight));
    }
    return 0;
}

int32_t NavFingerDetectHg(const uint8_t* p_data) {
    const int32_t imgSize = WrapMul(s_imageWidthHg, s_imageHeightHg);
    if (imgSize < 1)
        return -1;
    int64_t sum = 0;
    for (int32_t p = 0; p < imgSize; ++p)
        sum += p_data[p];
    const int32_t mean = Wrap(sum) / imgSize;
    if (mean <= s_meanThreshold)
        return 1;
    if (s_highSensitiveMode != 1)
        return 0;
    int32_t blkMeanMin = kMeanNone;
    GetBlkMeanMin(p_data, &blkMeanMin);
    return blkMeanMin <= s_meanThreshold ? 1 : 0;
}

}  // namespace fpnavi
