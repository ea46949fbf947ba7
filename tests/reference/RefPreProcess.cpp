// Pre-processing of a frame. Hg mode marks dark pixels and nothing else. The fp modes search a
// threshold between the dark and the bright class, fill the finger area around the dark pixels
// and stretch the grey values inside it to the full scale.

#include <cstring>

#include "RefInternal.h"
#include "RefMath.h"
#include "Reference.h"

namespace reference {

namespace {

// Counters of eight bits that wrap: of a grey value that fills 256 pixels or more only the
// remainder counts in the threshold search.
struct ByteHistogram {
    uint8_t count[256];
    int32_t mean;  // of all pixels, from a 32-bit sum that wraps on very large frames
};

struct GreyClass {
    int32_t count;
    int32_t mean;  // 0 for an empty class
};

ByteHistogram CountGreys(const NaviFrame_t* img, int32_t size) {
    ByteHistogram hist = {};
    int32_t sum = 0;
    for (int32_t p = 0; p < size; ++p) {
        const uint8_t grey = img->pData[p];
        hist.count[grey] = static_cast<uint8_t>((hist.count[grey] + 1) & 0xFF);
        sum = WrapAdd32(sum, grey);
    }
    hist.mean = WrapDiv32(sum, size);
    return hist;
}

// The class of the grey values first..last; at most 255 * 255 pixels of at most 254.
GreyClass MeasureClass(const ByteHistogram& hist, int32_t first, int32_t last) {
    GreyClass greys = {0, 0};
    int32_t sum = 0;
    for (int32_t i = first; i <= last; ++i) {
        greys.count += hist.count[i];
        sum += i * hist.count[i];
    }
    if (greys.count != 0)
        greys.mean = sum / greys.count;
    return greys;
}

int32_t WeightedSquare(const GreyClass& greys, int32_t mean) {
    const int32_t distance = WrapSub32(greys.mean, mean);
    return WrapMul32(greys.count, WrapMul32(distance, distance));
}

}  // namespace

int32_t CalcBiThr(const NaviFrame_t* img, int32_t* thr, int32_t* scale) {
    if (img == nullptr || img->pType == nullptr || img->pData == nullptr || thr == nullptr ||
        scale == nullptr)
        return -1;
    const int32_t size = WrapMul32(img->width, img->height);
    if (size <= 0)
        return -1;
    const ByteHistogram hist = CountGreys(img, size);
    int32_t max = 0;
    int32_t target = 0;
    int32_t range = 0;
    for (int32_t t = 1; t <= 254; ++t) {
        const GreyClass lower = MeasureClass(hist, 0, t - 1);
        const GreyClass upper = MeasureClass(hist, t, 254);  // 255 is in neither class
        const int32_t variance =
            WrapAdd32(WeightedSquare(upper, hist.mean), WeightedSquare(lower, hist.mean));
        if (variance > max) {
            max = variance;
            target = t;
            range = WrapAbs32(lower.mean - upper.mean);
        }
    }
    *thr = target;
    *scale = range;
    return 0;
}

namespace {

// Fills `length` class bytes, `step` apart, between the first and the last 1 among them.
void FillBetween(uint8_t* type, int32_t length, int32_t step, int32_t maxLen) {
    int32_t idxMin = maxLen;
    int32_t idxMax = -1;
    for (int32_t i = 0; i < length; ++i) {
        if (type[int64_t{i} * step] == 1) {
            idxMin = Min32(idxMin, i);
            idxMax = i;
        }
    }
    if (idxMax == -1 || idxMin == maxLen)
        return;
    for (int32_t i = idxMin; i <= idxMax; ++i)
        type[int64_t{i} * step] = 1;
}

}  // namespace

void GetFingerRidge(NaviFrame_t* img, int32_t thr) {
    const int32_t width = img->width;
    const int32_t height = img->height;
    const int32_t maxLen = Max32(width, height);
    for (int64_t p = 0; p < int64_t{width} * height; ++p)
        img->pType[p] = img->pData[p] <= thr ? 1 : 0;
    for (int32_t pass = 0; pass < 2; ++pass) {
        for (int32_t row = 0; row < height; ++row)
            FillBetween(img->pType + int64_t{row} * width, width, 1, maxLen);
        for (int32_t column = 0; column < width; ++column)
            FillBetween(img->pType + column, height, width, maxLen);
    }
}

namespace {

struct GreySpan {
    int32_t min;
    int32_t max;
};

// Cumulative counts of the finger area's grey values, grey 0 included; returns the pixel count.
int32_t AccumulateFingerGreys(const NaviFrame_t* img, int32_t size, int32_t (&cumHist)[256]) {
    int32_t hist[256] = {};
    int32_t cnt = 0;
    for (int32_t p = 0; p < size; ++p) {
        if (img->pType[p] == 1) {
            ++hist[img->pData[p]];
            ++cnt;
        }
    }
    cumHist[0] = hist[0];
    for (int32_t i = 1; i < 256; ++i)
        cumHist[i] = cumHist[i - 1] + hist[i];
    return cnt;
}

// Where the cumulative count crosses the two cut-off percentages; 0 where it does not.
GreySpan FindSpan(const int32_t (&cumHist)[256], int32_t cnt) {
    const int32_t lo = WrapMul32(cnt, s_cutOffPercent);
    const int32_t hi = WrapMul32(cnt, WrapSub32(100, s_cutOffPercent));
    GreySpan span = {0, 0};
    for (int32_t i = 1; i <= 255; ++i) {
        const int32_t before = WrapMul32(100, cumHist[i - 1]);
        const int32_t here = WrapMul32(100, cumHist[i]);
        if (before <= lo && here > lo)
            span.min = i - 1;
        if (before < hi && here >= hi)
            span.max = i;
    }
    return span;
}

}  // namespace

int32_t StretchRange(NaviFrame_t* img, uint8_t scale) {
    if (img == nullptr || img->pType == nullptr || img->pData == nullptr)
        return -1;
    const int32_t size = WrapMul32(img->width, img->height);
    if (size < 1)
        return -1;
    int32_t cumHist[256] = {};
    const int32_t cnt = AccumulateFingerGreys(img, size, cumHist);
    const GreySpan span = FindSpan(cumHist, cnt);
    const int32_t range = span.max - span.min;
    if (range < 1)
        return 0;
    for (int32_t p = 0; p < size; ++p) {
        if (img->pType[p] == 1) {
            const int32_t value = (img->pData[p] - span.min) * scale / range;
            img->pData[p] = static_cast<uint8_t>(Min32(Max32(value, 0), 255));
        }
    }
    return 0;
}

// The hg branch goes by the global image size and tests no buffer: its caller has just loaded a
// frame of that size.
int32_t ImgPreProcess(NaviFrame_t* img) {
    const uint8_t meanThr = 128;
    if (s_modeFlag == 1) {
        for (int64_t p = 0; p < int64_t{s_imageHeight} * s_imageWidth; ++p)
            img->pType[p] = img->pData[p] <= meanThr ? 1 : 0;
        return 0;
    }
    int32_t thr = 0;
    int32_t scale = 0;
    if (CalcBiThr(img, &thr, &scale) == -1)
        return -1;
    img->range = static_cast<uint8_t>(scale);  // at most 254
    if (thr < 256 && img->pData != nullptr && img->pType != nullptr && img->width >= 1 &&
        img->height >= 1)
        GetFingerRidge(img, thr);
    return StretchRange(img, 255) == -1 ? -1 : 0;
}

}  // namespace reference
