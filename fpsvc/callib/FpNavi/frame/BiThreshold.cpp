// CalcBiThr: the threshold between ridge and valley with the largest variance between the classes.
#include <cstdint>

#include "base/GreyHistogram.h"
#include "base/NaviMath.h"
#include "frame/NaviFrame.h"
#include "frame/PreProcess.h"

namespace fpnavi {
namespace {

constexpr int32_t kGreyLast = 254;  // 255 is saturation and belongs to neither class

// What the frame's pixels count up to.
struct GreyCounts {
    // 8-bit counters that wrap: of a grey level that fills the frame only the remainder counts,
    // which keeps flat ground from outweighing the ridges.
    uint8_t hist[kGreyLevels];
    int64_t sum;  // of all greys, nothing wrapped
};

// Two tables take turns, since neighbours are often equal and the second would wait for the first.
void CountGreys(const uint8_t* greys, int32_t size, GreyCounts* counts) {
    uint32_t even[kGreyLevels] = {};
    uint32_t odd[kGreyLevels] = {};
    int32_t p = 0;
    for (; p + 2 <= size; p += 2) {
        ++even[greys[p]];
        ++odd[greys[p + 1]];
    }
    if (p < size)
        ++even[greys[p]];
    counts->sum = 0;
    for (int32_t i = 0; i < kGreyLevels; ++i) {
        const uint32_t count = even[i] + odd[i];  // at most 2^24 pixels
        counts->hist[i] = static_cast<uint8_t>(count & 0xFFU);
        counts->sum += int64_t{i} * count;
    }
}

// One class: pixels of consecutive grey levels. At most 255 levels of at most 255 pixels: the sum
// stays below 255 * 255 * 255 < 2^24.
struct GreyClass {
    int32_t count;
    int32_t sum;

    int32_t Mean() const { return count != 0 ? sum / count : 0; }
};

// The class's share of the variance between the classes, in wrapping 32-bit arithmetic.
int32_t ClassVariance(int32_t count, int32_t classMean, int32_t mean) {
    const int32_t distance = WrapSub(classMean, mean);
    return WrapMul(WrapMul(count, distance), distance);
}

GreyClass CountAll(const uint8_t* hist) {
    GreyClass all = {0, 0};
    for (int32_t i = 0; i <= kGreyLast; ++i) {
        all.count += hist[i];
        all.sum += i * hist[i];
    }
    return all;
}

}  // namespace

int32_t CalcBiThr(const NaviFrame_t* img, int32_t* thr, int32_t* scale) {
    if (!HasPixels(img) || thr == nullptr || scale == nullptr)
        return -1;
    const int32_t size = img->width * img->height;
    GreyCounts counts;
    CountGreys(img->pData, size, &counts);
    const int32_t mean = Wrap(counts.sum) / size;
    const GreyClass all = CountAll(counts.hist);
    GreyClass lower = {0, 0};
    int32_t max = 0;
    *thr = 0;
    *scale = 0;
    for (int32_t t = 1; t <= kGreyLast; ++t) {
        const int32_t added = counts.hist[t - 1];
        lower.count += added;
        lower.sum += (t - 1) * added;
        // An empty level changes neither class, so the threshold before it was as good.
        if (added == 0 && t > 1)
            continue;
        const GreyClass upper = {all.count - lower.count, all.sum - lower.sum};
        const int32_t lowerMean = lower.Mean();
        const int32_t upperMean = upper.Mean();
        const int32_t variance = WrapAdd(ClassVariance(upper.count, upperMean, mean),
                                         ClassVariance(lower.count, lowerMean, mean));
        if (variance > max) {
            max = variance;
            *thr = t;
            *scale = lowerMean > upperMean ? lowerMean - upperMean : upperMean - lowerMean;
        }
    }
    return 0;
}

}  // namespace fpnavi
