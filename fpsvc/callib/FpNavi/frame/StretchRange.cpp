// StretchRange: the greys of the finger area stretched to the full scale.
#include <algorithm>
#include <cstdint>

#include "base/GreyHistogram.h"
#include "base/NaviMath.h"
#include "base/NaviSimd.h"
#include "frame/NaviFrame.h"
#include "frame/PreProcess.h"
#include "param/NaviParam.h"

namespace fpnavi {
namespace {

constexpr int32_t kChunk = 512;  // pixels that are looked at in one go

// Grey levels of the finger area's percentiles.
struct GreySpan {
    int32_t min;
    int32_t max;
};

// Copies count greys, those outside the finger area as 0, and returns how many lie inside.
int32_t CopyFinger(const uint8_t* grey, const uint8_t* type, int32_t count, uint8_t* finger) {
    const Bytes16 one = Splat16(1);
    Sums sums = NoSums();
    int32_t i = 0;
    for (; i + kLanes <= count; i += kLanes) {
        const Bytes16 mask = Equal16(Load16(type + i), one);
        Store16(finger + i, And16(Load16(grey + i), mask));
        sums = AddBytes(sums, And16(mask, one));
    }
    int32_t inside = Total(sums);
    for (; i < count; ++i) {
        const bool isFinger = type[i] == 1;
        finger[i] = isFinger ? grey[i] : uint8_t{0};
        inside += isFinger ? 1 : 0;
    }
    return inside;
}

// Counts the pixels of the finger area by grey level. Pixels outside are counted as grey 0 at
// first, without a branch. Two tables take turns, since neighbours are often equal and the second
// would wait for the first. Returns the number of pixels in the area.
int32_t CountFingerGreys(const NaviFrame_t& img, int32_t (&hist)[kGreyLevels]) {
    int32_t odd[kGreyLevels] = {};
    std::fill_n(hist, kGreyLevels, 0);
    const int32_t size = img.width * img.height;
    int32_t inside = 0;
    for (int32_t start = 0; start < size; start += kChunk) {
        const int32_t count = std::min(kChunk, size - start);
        uint8_t finger[kChunk + 1];
        inside += CopyFinger(img.pData + start, img.pType + start, count, finger);
        finger[count] = 0;  // makes an even number of an odd one
        for (int32_t i = 0; i < count; i += 2) {
            ++hist[finger[i]];
            ++odd[finger[i + 1]];
        }
        odd[0] -= count % 2;
    }
    for (int32_t i = 0; i < kGreyLevels; ++i)
        hist[i] += odd[i];
    hist[0] -= size - inside;
    return inside;
}

// hist: counts by grey level, cnt their sum. The cumulative count only grows: it crosses each limit
// once at most, and not at all when it lies beyond from the start.
GreySpan CutPercentiles(const int32_t (&hist)[kGreyLevels], int32_t cnt) {
    const int32_t lo = WrapMul(cnt, s_cutOffPercent);
    const int32_t hi = WrapMul(cnt, WrapSub(100, s_cutOffPercent));
    const int32_t start = 100 * hist[0];
    GreySpan span = {0, 0};
    if (start <= lo) {
        const int32_t level = FirstLevelAbove(hist, start, lo);
        span.min = level < kGreyLevels ? level - 1 : 0;
    }
    if (start < hi) {
        const int32_t level = FirstLevelAbove(hist, start, hi - 1);
        span.max = level < kGreyLevels ? level : 0;
    }
    return span;
}

// table[grey] = (grey - min) * scale / (max - min), clamped; below min the quotient is not
// positive. The division is a multiplication with scale / (max - min) in 1/2^16, rounded up: the
// product is too large by less than 255 / 2^16, and a quotient lies at least 1 / (max - min) >= 1 /
// 255 below the next integer.
void MakeStretchTable(const GreySpan& span, uint32_t scale, uint8_t (&table)[kGreyLevels]) {
    const uint32_t range = static_cast<uint32_t>(span.max - span.min);
    const uint32_t factor = ((scale << 16) + range - 1) / range;  // at most 255 * 2^16
    for (int32_t grey = 0; grey < kGreyLevels; ++grey) {
        const uint32_t above = static_cast<uint32_t>(std::max(grey - span.min, 0));
        table[grey] = ClampToGrey(static_cast<int32_t>(above * factor >> 16));
    }
}

// Replaces the greys of the finger area by their entries in table.
void StretchPixels(NaviFrame_t* img, const uint8_t (&table)[kGreyLevels]) {
    const int32_t size = img->width * img->height;
    for (int32_t start = 0; start < size; start += kChunk) {
        const int32_t count = std::min(kChunk, size - start);
        uint8_t* const grey = img->pData + start;
        const uint8_t* const type = img->pType + start;
        uint8_t stretched[kChunk];
        for (int32_t i = 0; i < count; ++i)
            stretched[i] = table[grey[i]];
        for (int32_t i = 0; i < count; ++i)
            grey[i] = type[i] == 1 ? stretched[i] : grey[i];
    }
}

}  // namespace

int32_t StretchRange(NaviFrame_t* img, uint8_t scale) {
    if (!HasPixels(img))
        return -1;
    int32_t hist[kGreyLevels];
    const int32_t cnt = CountFingerGreys(*img, hist);
    const GreySpan span = CutPercentiles(hist, cnt);
    if (span.max - span.min < 1)
        return 0;
    uint8_t table[kGreyLevels];
    MakeStretchTable(span, scale, table);
    StretchPixels(img, table);
    return 0;
}

}  // namespace fpnavi
