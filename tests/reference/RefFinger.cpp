// Finger presence: one detector per mode behind a common entry, which remembers in s_lastFrameFlag
// whether the finger has left. An error changes nothing.

#include "RefInternal.h"
#include "RefMath.h"
#include "Reference.h"

namespace reference {

namespace {

// A grid of equal blocks over the navigation image; pixels beyond the last whole block are unread.
struct BlockGrid {
    int32_t colNum;
    int32_t blkNum;
    int32_t blkWidth;
    int32_t blkHeight;
};

BlockGrid MakeGrid(int32_t colNum, int32_t rowNum) {
    return {colNum, colNum * rowNum, s_imageWidth / colNum, s_imageHeight / rowNum};
}

bool HasBlockPixels(const BlockGrid& grid) {
    return grid.blkWidth >= 1 && grid.blkHeight >= 1;
}

uint8_t BlockPixel(const uint8_t* image, const BlockGrid& grid, int32_t k, int32_t row,
                   int32_t column) {
    const int64_t imageRow = int64_t{k / grid.colNum} * grid.blkHeight + row;
    const int64_t imageColumn = int64_t{k % grid.colNum} * grid.blkWidth + column;
    return image[imageRow * s_imageWidth + imageColumn];
}

int32_t BlockMean(const uint8_t* image, const BlockGrid& grid, int32_t k) {
    int32_t sum = 0;
    for (int32_t row = 0; row < grid.blkHeight; ++row) {
        for (int32_t column = 0; column < grid.blkWidth; ++column)
            sum = WrapAdd32(sum, BlockPixel(image, grid, k, row, column));
    }
    return sum / WrapMul32(grid.blkWidth, grid.blkHeight);
}

}  // namespace

int32_t DoubleScanFingerDetect(const uint8_t* DoubleScanZone) {
    const int32_t width = 8;
    const int32_t height = 8;
    int32_t count = 0;
    for (int32_t cell = 0; cell < width * height; ++cell) {
        if (DoubleScanZone[cell] == 1)
            ++count;
    }
    return count * 100 / (width * height);
}

// 256, above every mean, for an image too small for quadrants.
int32_t GetBlkMeanMin(const uint8_t* p_data, int32_t* blk_mean_min) {
    const BlockGrid grid = MakeGrid(2, 2);
    int32_t min = 256;
    for (int32_t k = 0; k < grid.blkNum && HasBlockPixels(grid); ++k)
        min = Min32(min, BlockMean(p_data, grid, k));
    *blk_mean_min = min;
    return 0;
}

int32_t NavFingerDetectHg(const uint8_t* p_data) {
    if (!IsUsableImage() || !IsSide(s_imageWidthHg) || !IsSide(s_imageHeightHg))
        return -1;
    const int32_t imgSize = s_imageWidthHg * s_imageHeightHg;
    int32_t sum = 0;  // wraps beyond 2^23 white pixels
    for (int32_t p = 0; p < imgSize; ++p)
        sum = WrapAdd32(sum, p_data[p]);
    const int32_t mean = sum / imgSize;
    if (mean <= s_meanThreshold)
        return 1;
    if (s_highSensitiveMode == 1) {
        int32_t blkMeanMin = 0;
        GetBlkMeanMin(p_data, &blkMeanMin);
        return blkMeanMin <= s_meanThreshold ? 1 : 0;
    }
    return 0;
}

// -1 for an image too small for the grid.
int32_t GetBlkMeanDiff(const uint8_t* buffer, int32_t* blk_mean_diff) {
    const BlockGrid grid = MakeGrid(4, 4);
    if (!HasBlockPixels(grid)) {
        *blk_mean_diff = -1;
        return 0;
    }
    int32_t max = 0;
    int32_t min = 255;
    for (int32_t k = 0; k < grid.blkNum; ++k) {
        const int32_t mean = BlockMean(buffer, grid, k);
        max = Max32(max, mean);
        min = Min32(min, mean);
    }
    *blk_mean_diff = max - min;
    return 0;
}

namespace {

// The ends of the grey range once the darkest and brightest percent are cut off.
struct GreyEnds {
    int32_t iLow;
    int32_t iHigh;
};

// Grey 0 is never accumulated. A crossing that is not found leaves its end as it was.
void FindGreyEnds(const int32_t (&hist)[256], int32_t lowLimit, int32_t highLimit, GreyEnds* ends) {
    int32_t cumHist[256] = {};
    for (int32_t i = 1; i < 256; ++i) {
        cumHist[i] = cumHist[i - 1] + hist[i];
        const int32_t before = WrapMul32(100, cumHist[i - 1]);
        const int32_t here = WrapMul32(100, cumHist[i]);
        if (before <= lowLimit && here > lowLimit)
            ends->iLow = i - 1;
        if (before < highLimit && here >= highLimit)
            ends->iHigh = i;
    }
}

}  // namespace

// The ends are carried from block to block on purpose.
int32_t GetGreyRange(const uint8_t* buffer, int32_t* range) {
    if (buffer == nullptr || range == nullptr)
        return -1;
    const BlockGrid grid = MakeGrid(4, 4);
    const int32_t blkSize = WrapMul32(grid.blkWidth, grid.blkHeight);
    const int32_t lowLimit = WrapMul32(blkSize, s_cutOffPercent);
    const int32_t highLimit = WrapMul32(blkSize, WrapSub32(100, s_cutOffPercent));
    GreyEnds ends = {0, 0};
    int32_t max = 0;
    for (int32_t k = 0; k < grid.blkNum; ++k) {
        int32_t hist[256] = {};
        for (int32_t row = 0; row < grid.blkHeight; ++row) {
            for (int32_t column = 0; column < grid.blkWidth; ++column)
                ++hist[BlockPixel(buffer, grid, k, row, column)];
        }
        FindGreyEnds(hist, lowLimit, highLimit, &ends);
        max = Max32(max, ends.iHigh - ends.iLow);
    }
    *range = max;
    return 0;
}

// Without any geometry (both sides 0) the tests run on an empty image.
int32_t NavFingerDetectFp(const uint8_t* p_data) {
    const bool noGeometryYet = s_imageWidth == 0 && s_imageHeight == 0;
    if (!noGeometryYet && !IsUsableImage())
        return -1;
    const int32_t blockNum = 5;
    int32_t fftRes[2 * blockNum] = {0, 0, 0, 0, 0, 255, 255, 255, 255, 255};
    FingerBLKTest(p_data, s_imageWidth, s_imageHeight, fftRes, 0);
    int32_t pressedBlkNum = 0;
    for (int32_t i = 0; i < blockNum; ++i) {
        if (fftRes[i] >= s_fftResThreshold || fftRes[blockNum + i] < s_meanThresholdFp)
            ++pressedBlkNum;
    }
    int32_t blkMeanDiff = 0;
    GetBlkMeanDiff(p_data, &blkMeanDiff);
    int32_t greyRange = 0;
    if (GetGreyRange(p_data, &greyRange) == -1)
        return -1;
    const bool finger =
        pressedBlkNum > 0 || blkMeanDiff >= s_blkMeanDiffThreshold || greyRange >= s_rangeThreshold;
    return finger ? 1 : 0;
}

namespace {

// An empty map is no finger, whatever the threshold; one cell is already 1 percent.
int32_t DetectByDoubleScan() {
    const int32_t coverage = DoubleScanFingerDetect(DoubleScanZoneCurr);
    return coverage > 0 && coverage > s_DoubleScanCvrThreshold ? 1 : 0;
}

int32_t DetectByMode(const uint8_t* p_data) {
    if (s_doubleScanFlag == 1)
        return DetectByDoubleScan();
    return s_modeFlag == 1 ? NavFingerDetectHg(p_data) : NavFingerDetectFp(p_data);
}

}  // namespace

int32_t vmk_fp_navigation_detect_finger_status(const uint8_t* p_data) {
    if (p_data == nullptr)
        return -1;
    const int32_t finger = DetectByMode(p_data);
    if (finger != -1)
        s_lastFrameFlag = finger == 1 ? 0 : 1;
    return finger;
}

}  // namespace reference
