// Requirement: in the fp modes a finger is present when any of three signs says so: ridge texture
// (or a dark block), spread of the block means, grey range of a block.
//
// Observation: measuring a sign has no effect besides its value.
//
// Algorithm: measure the cheapest sign first, and stop at the first that says finger.
#include "presence/FingerStatus.h"

#include <algorithm>

#include "FingerDetect.h"
#include "base/GreyHistogram.h"
#include "base/NaviMath.h"
#include "gesture/Gesture.h"
#include "motion/DoubleScan.h"
#include "param/NaviLimits.h"
#include "param/NaviParam.h"

namespace fpnavi {
namespace {

constexpr int32_t kMeanNone = kGreyMax + 1;  // above every mean of grey levels
constexpr int32_t kNeverAbove = INT32_MAX;   // a limit that no count exceeds

// The least and the greatest mean grey of blocks.
struct MeanRange {
    int32_t min;
    int32_t max;
};

// Of the parts x parts blocks of the frame at greys; {kMeanNone, kMeanNone - 1} when the frame is
// too small for them. parts is at least 2: a block has at most 2048 x 2048 = kMostSummed pixels.
MeanRange BlockMeans(const uint8_t* greys, int32_t parts) {
    const int32_t width = s_imageWidth / parts;
    const int32_t height = s_imageHeight / parts;
    if (width < 1 || height < 1)
        return {kMeanNone, kMeanNone - 1};
    MeanRange means = {kMeanNone, 0};
    for (int32_t row = 0; row < parts; ++row) {
        for (int32_t column = 0; column < parts; ++column) {
            const int32_t first = row * height * s_imageWidth + column * width;
            const int32_t sum = SumBlock(greys, first, width, height, s_imageWidth);
            means.min = std::min(means.min, sum / (width * height));
            means.max = std::max(means.max, sum / (width * height));
        }
    }
    return means;
}

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

// 1, 0 or -1 as the entry. p_data is not null.
int32_t DetectFinger(const uint8_t* p_data) {
    if (ScansTwice()) {
        // An empty map is no finger even under a negative threshold.
        const int32_t coverage = DoubleScanFingerDetect(DoubleScanZoneCurr);
        return coverage > std::max(s_DoubleScanCvrThreshold, 0) ? 1 : 0;
    }
    if (IsHg()) {
        if (!ImageGeometryUsable() || !HgDetectGeometryUsable())
            return -1;
        return NavFingerDetectHg(p_data);
    }
    if (!ImageGeometryUnset() && !ImageGeometryUsable())
        return -1;
    return NavFingerDetectFp(p_data);
}

}  // namespace

int32_t DoubleScanFingerDetect(const uint8_t* DoubleScanZone) {
    const auto count = std::count(DoubleScanZone, DoubleScanZone + kZoneCells, 1);
    return static_cast<int32_t>(count) * 100 / kZoneCells;
}

int32_t GetBlkMeanMin(const uint8_t* p_data, int32_t* blk_mean_min) {
    *blk_mean_min = BlockMeans(p_data, 2).min;
    return 0;
}

int32_t GetBlkMeanDiff(const uint8_t* buffer, int32_t* blk_mean_diff) {
    const MeanRange means = BlockMeans(buffer, 4);
    *blk_mean_diff = means.max - means.min;
    return 0;
}

int32_t GetGreyRange(const uint8_t* buffer, int32_t* range) {
    if (buffer == nullptr || range == nullptr)
        return -1;
    constexpr int32_t rowNum = 4;
    constexpr int32_t colNum = kBlocksCounted;
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

int32_t NavFingerDetectHg(const uint8_t* p_data) {
    const int32_t imgSize = WrapMul(s_imageWidthHg, s_imageHeightHg);
    if (imgSize < 1)
        return -1;
    const int32_t mean = FrameSum(p_data, imgSize) / imgSize;
    if (mean <= s_meanThreshold)
        return 1;
    if (!IsHighSensitive())
        return 0;
    int32_t blkMeanMin = 0;
    GetBlkMeanMin(p_data, &blkMeanMin);
    return blkMeanMin <= s_meanThreshold ? 1 : 0;
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

int32_t vmk_fp_navigation_detect_finger_status(const uint8_t* p_data) {
    using namespace fpnavi;
    if (p_data == nullptr)
        return -1;
    const int32_t fingerState = DetectFinger(p_data);
    if (fingerState != -1)
        s_lastFrameFlag = fingerState == 1 ? 0 : 1;
    return fingerState;
}
