// Measurements of the tuning: mean and histogram of one corner block, chosen by the rank of its
// mean, the top grey level of a histogram, and the gain factor from the gain codes.

#include <cstring>

#include "RefInternal.h"
#include "RefMath.h"
#include "Reference.h"

namespace reference {

namespace {

constexpr int32_t kCornerNum = 4;
constexpr uint32_t kGainTableSize = 8;

// The divisor of the corner means, a sixteenth of the image.
int32_t BlockLength(int32_t height, int32_t width) {
    return WrapMul32(width, height) / 16;
}

void CutCorners(int32_t height, int32_t width, _NAVI_BlkNode (&Blk_Nodes)[kCornerNum]) {
    const int32_t left = width / 4;
    const int32_t right = WrapMul32(3, width) / 4;
    const int32_t top = height / 4;
    const int32_t bottom = WrapMul32(3, height) / 4;
    Blk_Nodes[0] = {0, 0, left, top};
    Blk_Nodes[1] = {right, 0, width, top};
    Blk_Nodes[2] = {0, bottom, left, height};
    Blk_Nodes[3] = {right, bottom, width, height};
}

int32_t SumBlock(const uint8_t* img, int32_t width, const _NAVI_BlkNode& node) {
    int32_t sum = 0;
    for (int32_t row = node.StartHeight; row < node.EndHeight; ++row) {
        for (int32_t column = node.StartWidth; column < node.EndWidth; ++column)
            sum = WrapAdd32(sum, img[int64_t{row} * width + column]);
    }
    return sum;
}

void CountBlock(const uint8_t* img, int32_t width, const _NAVI_BlkNode& node) {
    for (int32_t row = node.StartHeight; row < node.EndHeight; ++row) {
        for (int32_t column = node.StartWidth; column < node.EndWidth; ++column)
            ++_NAVI_img_histogram[img[int64_t{row} * width + column]];
    }
}

// Both sides positive, the rank inside its table, and a divisor that is not lost to wrapping.
bool IsMeasurable(int32_t height, int32_t width) {
    return height >= 1 && width >= 1 && BlockLength(height, width) >= 1 &&
           _NAVI_blk_selection_mode >= 0 && _NAVI_blk_selection_mode < kCornerNum;
}

}  // namespace

bool IsTuneSizeDivisible(int32_t height, int32_t width) {
    return WrapMul32(width, height) % 16 == 0;
}

int32_t _NAVI_ImgHistogram(const uint8_t* img, int32_t height, int32_t width) {
    _NAVI_mean = 0;
    if (!IsTuneSizeDivisible(height, width)) {
        // Written whatever s_logShowFlag says.
        LogLine("_NAVI_ImgHistogram", 1590, "error! size cannot be divided by 16!\n");
        return -1;
    }
    if (!IsMeasurable(height, width))
        return -1;
    int32_t blk_mean[kCornerNum] = {0, 0, 0, 0};
    int32_t blk_origin_order[kCornerNum] = {0, 1, 2, 3};
    _NAVI_BlkNode Blk_Nodes[kCornerNum] = {};
    const int32_t blk_length = BlockLength(height, width);
    std::memset(_NAVI_img_histogram, 0, sizeof _NAVI_img_histogram);
    CutCorners(height, width, Blk_Nodes);
    for (int32_t b = 0; b < kCornerNum; ++b)
        blk_mean[b] = SumBlock(img, width, Blk_Nodes[b]) / blk_length;
    _NAVI_SortIndex(blk_mean, blk_origin_order, kCornerNum);
    _NAVI_mean = static_cast<uint32_t>(blk_mean[_NAVI_blk_selection_mode]);
    CountBlock(img, width, Blk_Nodes[blk_origin_order[_NAVI_blk_selection_mode]]);
    return 0;
}

// A selection sort that swaps the maximum, the last of equals, to the end of the rest. The swaps
// move other equal values about: 100, 90, 90, 100 end in the order 2, 1, 0, 3.
void _NAVI_SortIndex(int32_t* fValue, int32_t* iIndex, int32_t len) {
    for (int32_t n = len; n >= 1; --n) {
        int32_t fMax = -1000;
        int32_t iMaxIndex = 0;
        for (int32_t i = 0; i < n; ++i) {
            if (fValue[i] >= fMax) {
                fMax = fValue[i];
                iMaxIndex = i;
            }
        }
        const int32_t value = fValue[iMaxIndex];
        const int32_t tag = iIndex[iMaxIndex];
        fValue[iMaxIndex] = fValue[n - 1];
        iIndex[iMaxIndex] = iIndex[n - 1];
        fValue[n - 1] = value;
        iIndex[n - 1] = tag;
    }
}

namespace {

// The grey sum of the `threshold` brightest pixels, or of all when there are fewer.
int32_t SumBrightest(const uint32_t* histogram, int32_t threshold) {
    int32_t num_from_end = 0;
    int32_t sum = 0;
    for (int32_t index = 255; index >= 0; --index) {
        const int32_t h = static_cast<int32_t>(histogram[index]);
        if (h == 0)
            continue;
        if (WrapAdd32(num_from_end, h) >= threshold)
            return WrapAdd32(sum, WrapMul32(index, WrapSub32(threshold, num_from_end)));
        sum = WrapAdd32(sum, WrapMul32(index, h));
        num_from_end = WrapAdd32(num_from_end, h);
    }
    return sum;
}

}  // namespace

int32_t _NAVI_CalcTop(uint32_t X, uint32_t Y, const uint32_t* histogram) {
    uint32_t img_count = 0;
    for (int32_t index = 0; index < 256; ++index)
        img_count = WrapAddU32(img_count, histogram[index]);
    const int32_t i_threshold_X = static_cast<int32_t>(WrapMulU32(img_count, X) / 100U);
    const int32_t i_threshold_Y = static_cast<int32_t>(WrapMulU32(img_count, Y) / 100U);
    if (i_threshold_X == i_threshold_Y)
        return -1;
    const int32_t i_top_X = SumBrightest(histogram, i_threshold_X);
    const int32_t i_top_Y = SumBrightest(histogram, i_threshold_Y);
    return WrapDiv32(WrapSub32(i_top_Y, i_top_X), WrapSub32(i_threshold_Y, i_threshold_X));
}

namespace {

// The three fields of a packed code that index a table; bits 8..11 take no part.
struct GainFields {
    uint32_t ratio21;
    uint32_t ratio43Low;
    uint32_t ratio43High;
};

GainFields UnpackGain(uint32_t g) {
    return {(g >> 12) & 0xFU, g & 0xFU, (g >> 4) & 0xFU};
}

bool AreInTables(const GainFields& fields) {
    return fields.ratio21 < kGainTableSize && fields.ratio43Low < kGainTableSize &&
           fields.ratio43High < kGainTableSize;
}

}  // namespace

bool AreGainsUsable(uint32_t g) {
    return AreInTables(UnpackGain(g)) &&
           AreInTables(UnpackGain(static_cast<uint32_t>(_NAVI_GAIN_REF)));
}

// 0 for codes outside the tables. The reference product is at most 140 * 8 * 8.
int32_t _NAVI_K_CALC(uint32_t g) {
    if (!AreGainsUsable(g))
        return 0;
    const GainFields actual = UnpackGain(g);
    const GainFields ref = UnpackGain(static_cast<uint32_t>(_NAVI_GAIN_REF));
    int32_t input_k_g_r = WrapMul32(_NAVI_INPUT_K, _NAVI_gain_ratio_21[actual.ratio21]);
    input_k_g_r = WrapMul32(input_k_g_r, _NAVI_gain_ratio_43[actual.ratio43Low]);
    input_k_g_r = WrapMul32(input_k_g_r, _NAVI_gain_ratio_43[actual.ratio43High]);
    const int32_t refProduct = _NAVI_gain_ratio_21[ref.ratio21] *
                               _NAVI_gain_ratio_43[ref.ratio43Low] *
                               _NAVI_gain_ratio_43[ref.ratio43High];
    return input_k_g_r / refProduct;
}

}  // namespace reference
