// Requirement: a finger is present when any of three signs says so: ridge texture (or a dark
// block), spread of the block means, grey range of a block.
//
// Observation: measuring a sign has no effect besides its value.
//
// Algorithm: measure the cheapest sign first, and stop at the first that says finger.
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
constexpr int32_t kSpreadNone = -1;  // less than every spread of block means

static_assert(colNum == kBlocksCounted, "a row of blocks is counted at a time");

constexpr int32_t kNeverAbove = INT32_MAX;  // a limit that no count exceeds

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
        const int32_t first = k / colNum * blkHeight * s_imageWidth + k % colNum * blkWidth;
        // At most 1024 x 1024 = 2^20 pixels, below kMostSummed.
        const int32_t sum = SumBlock(buffer, first, blkWidth, blkHeight, s_imageWidth);
        const int32_t mean = sum / (blkWidth * blkHeight);
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
    // In hundredths of a pixel. A hundredfold count is above the low limit when the count is above
    // lowLimit / 100, and at least the high limit when it is above (highLimit - 1) / 100.
    const int32_t lowLimit = WrapMul(blkSize, s_cutOffPercent);
    const int32_t highLimit = WrapMul(blkSize, WrapSub(100, s_cutOffPercent));
    // A count of 0 already exceeds a negative limit, so nothing crosses it.
    const int32_t lowCount = lowLimit >= 0 ? lowLimit / 100 : kNeverAbove;
    const int32_t highCount = highLimit > 0 ? (highLimit - 1) / 100 : kNeverAbove;
    // Deliberate: not reset for each block. A block without a crossing takes the level of the block
    // before it.
    int32_t iLow = 0;
    int32_t iHigh = 0;
    int32_t max = 0;
    for (int32_t blkRow = 0; blkRow < rowNum; ++blkRow) {
        int32_t hist[colNum][kGreyLevels];
        CountFourBlocks(buffer + blkRow * blkHeight * s_imageWidth, blkWidth, blkHeight,
                        s_imageWidth, hist);
        for (const auto& histOfBlock : hist) {
            const LevelPair levels = FirstLevelsAbove(histOfBlock, lowCount, highCount);
            iLow = levels.low < kGreyLevels ? levels.low - 1 : iLow;
            iHigh = levels.high < kGreyLevels ? levels.high : iHigh;
            max = std::max(max, iHigh - iLow);
        }
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
    for (int32_t i = 0; i < blockNum; ++i) {
        if (fftRes[i] >= s_fftResThreshold || fftRes[blockNum + i] < s_meanThresholdFp)
            return 1;
    }
    int32_t blkMeanDiff = 0;
    GetBlkMeanDiff(p_data, &blkMeanDiff);
    if (blkMeanDiff >= s_blkMeanDiffThreshold)
        return 1;
    int32_t greyRange = 0;
    GetGreyRange(p_data, &greyRange);
    return greyRange >= s_rangeThreshold ? 1 : 0;
}

}  // namespace fpnavi
