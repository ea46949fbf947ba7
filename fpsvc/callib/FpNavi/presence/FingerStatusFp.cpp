#include "presence/FingerStatusFp.h"

#include <algorithm>

#include "FingerDetect.h"
#include "base/GreyHistogram.h"
#include "base/NaviMath.h"
#include "param/NaviParam.h"

namespace fpnavi {
namespace {

constexpr int32_t colNum = 4;
constexpr int32_t rowNum = 4;
constexpr int32_t blkNum = colNum * rowNum;
constexpr int32_t kSpreadNone = -1;  // below every spread of block means

// First pixel of block k of the frame at buffer, blocks counted row by row.
const uint8_t* BlockAt(const uint8_t* buffer, int32_t k, int32_t blkWidth, int32_t blkHeight) {
    return buffer + k / colNum * blkHeight * s_imageWidth + k % colNum * blkWidth;
}

int32_t BlockMean(const uint8_t* block, int32_t blkWidth, int32_t blkHeight) {
    int32_t sum = 0;  // at most 255 * 1024 * 1024 < 2^31
    for (int32_t row = 0; row < blkHeight; ++row) {
        for (int32_t column = 0; column < blkWidth; ++column)
            sum += block[row * s_imageWidth + column];
    }
    return sum / (blkWidth * blkHeight);
}

// Moves iLow and iHigh to where the cumulative counts of hist cross the limits (in hundredths of
// a pixel). Grey 0 is never accumulated; a crossing that is not found leaves its level alone.
void FindCrossings(const int32_t* hist, int32_t lowLimit, int32_t highLimit, int32_t* iLow,
                   int32_t* iHigh) {
    if (lowLimit >= 0) {
        const int32_t level = FirstLevelAbove(hist, 0, lowLimit);
        *iLow = level < kGreyLevels ? level - 1 : *iLow;
    }
    if (highLimit > 0) {
        const int32_t level = FirstLevelAbove(hist, 0, highLimit - 1);
        *iHigh = level < kGreyLevels ? level : *iHigh;
    }
}

}  // namespace

int32_t GetBlkMeanDiff(const uint8_t* buffer, int32_t* blk_mean_diff) {
    const int32_t blkWidth = s_imageWidth / colNum;
    const int32_t blkHeight = s_imageHeight / rowNum;
    *blk_mean_diff = kSpreadNone;
    if (blkWidth < 1 || blkHeight < 1)
        return 0;
    int32_t max = 0;
    int32_t min = kGreyMax;
    for (int32_t k = 0; k < blkNum; ++k) {
        const int32_t mean =
            BlockMean(BlockAt(buffer, k, blkWidth, blkHeight), blkWidth, blkHeight);
        max = std::max(max, mean);
        min = std::min(min, mean);
    }
    *blk_mean_diff = max - min;
    return 0;
}

int32_t GetGreyRange(const uint8_t* buffer, int32_t* range) {
    if (buffer == nullptr || range == nullptr)
        return -1;
    const int32_t blkWidth = s_imageWidth / colNum;
    const int32_t blkHeight = s_imageHeight / rowNum;
    const int32_t blkSize = blkWidth * blkHeight;
    const int32_t lowLimit = WrapMul(blkSize, s_cutOffPercent);
    const int32_t highLimit = WrapMul(blkSize, WrapSub(100, s_cutOffPercent));
    // Not reset for each block: one without a crossing is measured by the levels before it.
    int32_t iLow = 0;
    int32_t iHigh = 0;
    int32_t max = 0;
    for (int32_t k = 0; k < blkNum; ++k) {
        const uint8_t* const block = BlockAt(buffer, k, blkWidth, blkHeight);
        int32_t hist[kGreyLevels] = {};
        for (int32_t row = 0; row < blkHeight; ++row) {
            for (int32_t column = 0; column < blkWidth; ++column)
                ++hist[block[row * s_imageWidth + column]];
        }
        FindCrossings(hist, lowLimit, highLimit, &iLow, &iHigh);
        max = std::max(max, iHigh - iLow);
    }
    *range = max;
    return 0;
}

int32_t NavFingerDetectFp(const uint8_t* p_data) {
    if (p_data == nullptr)
        return -1;
    const int32_t blockNum = 5;
    // A block that the texture test leaves unwritten has no texture and a white mean.
    int32_t fftRes[2 * blockNum] = {0, 0, 0, 0, 0, 255, 255, 255, 255, 255};
    FingerBLKTest(p_data, s_imageWidth, s_imageHeight, fftRes, 0);
    int32_t pressedBlkNum = 0;
    for (int32_t i = 0; i < blockNum; ++i) {
        if (fftRes[i] >= s_fftResThreshold || fftRes[blockNum + i] < s_meanThresholdFp)
            ++pressedBlkNum;
    }
    int32_t blkMeanDiff = 0;
    int32_t greyRange = 0;
    GetBlkMeanDiff(p_data, &blkMeanDiff);
    GetGreyRange(p_data, &greyRange);
    return pressedBlkNum > 0 || blkMeanDiff >= s_blkMeanDiffThreshold ||
                   greyRange >= s_rangeThreshold
               ? 1
               : 0;
}

}  // namespace fpnavi
