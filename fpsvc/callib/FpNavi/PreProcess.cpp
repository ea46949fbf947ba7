#include "PreProcess.h"

#include <algorithm>

#include "NaviFrame.h"
#include "NaviMath.h"
#include "NaviParam.h"

namespace fpnavi {
namespace {

constexpr int32_t kGreyLevels = 256;

// Marks the dark pixels; the hg sensor needs nothing more.
void MarkDarkPixels(NaviFrame_t* img) {
    const uint8_t meanThr = 128;
    const int32_t size = s_imageHeight * s_imageWidth;
    for (int32_t p = 0; p < size; ++p)
        img->pType[p] = img->pData[p] <= meanThr ? 1 : 0;
}

// One class of the histogram: grey levels first to last.
struct GreyClass {
    int32_t count;
    int32_t mean;
};

// At most 255 levels of at most 255 pixels: sums stay below 255 * 255 * 255 < 2^24.
GreyClass MeasureClass(const uint8_t* hist, int32_t first, int32_t last) {
    int32_t count = 0;
    int32_t sum = 0;
    for (int32_t i = first; i <= last; ++i) {
        count += hist[i];
        sum += i * hist[i];
    }
    return {count, count != 0 ? sum / count : 0};
}

// The class's share of the variance between the classes, in wrapping 32-bit arithmetic.
int32_t ClassVariance(const GreyClass& greyClass, int32_t mean) {
    const int32_t distance = WrapSub(greyClass.mean, mean);
    return WrapMul(WrapMul(greyClass.count, distance), distance);
}

// Marks all from the first to the last marked pixel of a line: count pixels, stride bytes apart.
void FillLine(uint8_t* line, int32_t count, int32_t stride) {
    int32_t idxMin = count;
    int32_t idxMax = -1;
    for (int32_t i = 0; i < count; ++i) {
        if (line[i * stride] != 1)
            continue;
        idxMin = std::min(idxMin, i);
        idxMax = i;
    }
    for (int32_t i = idxMin; i <= idxMax; ++i)
        line[i * stride] = 1;
}

// Grey levels of the finger area's percentiles.
struct GreySpan {
    int32_t min;
    int32_t max;
};

// hist: kGreyLevels counts, cnt their sum. Counts are compared as hundredfold, at most
// 100 * 2^24 < 2^31, so that no division rounds.
GreySpan CutPercentiles(const int32_t* hist, int32_t cnt) {
    const int32_t lo = WrapMul(cnt, s_cutOffPercent);
    const int32_t hi = WrapMul(cnt, WrapSub(100, s_cutOffPercent));
    GreySpan span = {0, 0};
    int32_t below = 100 * hist[0];
    for (int32_t i = 1; i < kGreyLevels; ++i) {
        const int32_t upTo = below + 100 * hist[i];
        if (below <= lo && upTo > lo)
            span.min = i - 1;
        if (below < hi && upTo >= hi)
            span.max = i;
        below = upTo;
    }
    return span;
}

}  // namespace

int32_t CalcBiThr(const NaviFrame_t* img, int32_t* thr, int32_t* scale) {
    if (!HasPixels(img) || thr == nullptr || scale == nullptr)
        return -1;
    // 8-bit counters that wrap: of a grey level that fills the frame only the remainder counts,
    // which keeps flat ground from outweighing the ridges.
    uint8_t hist[kGreyLevels] = {};
    int64_t sum = 0;
    const int32_t size = img->width * img->height;
    for (int32_t p = 0; p < size; ++p) {
        hist[img->pData[p]] = static_cast<uint8_t>(hist[img->pData[p]] + 1U);
        sum += img->pData[p];
    }
    const int32_t mean = Wrap(sum) / size;
    int32_t max = 0;
    *thr = 0;
    *scale = 0;
    for (int32_t t = 1; t <= 254; ++t) {
        const GreyClass lower = MeasureClass(hist, 0, t - 1);
        const GreyClass upper = MeasureClass(hist, t, 254);  // 255 is saturation, in neither class
        const int32_t variance = WrapAdd(ClassVariance(upper, mean), ClassVariance(lower, mean));
        if (variance > max) {
            max = variance;
            *thr = t;
            *scale = lower.mean > upper.mean ? lower.mean - upper.mean : upper.mean - lower.mean;
        }
    }
    return 0;
}

void GetFingerRidge(NaviFrame_t* img, int32_t thr) {
    const int32_t width = img->width;
    const int32_t height = img->height;
    for (int32_t p = 0; p < width * height; ++p)
        img->pType[p] = img->pData[p] <= thr ? 1 : 0;
    for (int32_t pass = 0; pass < 2; ++pass) {
        for (int32_t row = 0; row < height; ++row)
            FillLine(img->pType + row * width, width, 1);
        for (int32_t column = 0; column < width; ++column)
            FillLine(img->pType + column, height, width);
    }
}

int32_t StretchRange(NaviFrame_t* img, uint8_t scale) {
    if (!HasPixels(img))
        return -1;
    int32_t hist[kGreyLevels] = {};
    int32_t cnt = 0;
    const int32_t size = img->width * img->height;
    for (int32_t p = 0; p < size; ++p) {
        if (img->pType[p] != 1)
            continue;
        ++hist[img->pData[p]];
        ++cnt;
    }
    const GreySpan span = CutPercentiles(hist, cnt);
    const int32_t range = span.max - span.min;
    if (range < 1)
        return 0;
    for (int32_t p = 0; p < size; ++p) {
        if (img->pType[p] == 1)
            img->pData[p] = ClampToGrey((img->pData[p] - span.min) * scale / range);
    }
    return 0;
}

int32_t ImgPreProcess(NaviFrame_t* img) {
    if (s_modeFlag == 1) {
        MarkDarkPixels(img);
        return 0;
    }
    int32_t thr = 0;
    int32_t scale = 0;
    if (CalcBiThr(img, &thr, &scale) != 0)
        return -1;
    img->range = static_cast<uint8_t>(scale);  // at most 254
    GetFingerRidge(img, thr);
    return StretchRange(img, kGreyMax);
}

}  // namespace fpnavi
