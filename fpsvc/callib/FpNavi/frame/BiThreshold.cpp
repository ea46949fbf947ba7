// CalcBiThr: the threshold between ridge and valley with the largest variance between the classes.
#include <cstdint>

#include "base/GreyHistogram.h"
#include "base/NaviMath.h"
#include "frame/NaviFrame.h"
#include "frame/PreProcess.h"

namespace fpnavi {
namespace {

constexpr int32_t kGreyLast = 254;  // 255 is saturation and belongs to neither class

// The counter of a grey level has 8 bits and wraps: of a level that fills the frame only the
// remainder counts, which keeps flat ground from outweighing the ridges.
uint32_t WrappedCount(int32_t count) {
    return static_cast<uint32_t>(count) & 0xFFU;
}

// One class: pixels of consecutive grey levels. At most 255 levels of at most 255 pixels: the sum
// stays below 255 * 255 * 255 < 2^24.
struct GreyClass {
    uint32_t count;
    uint32_t sum;

    int32_t Mean() const { return count != 0 ? static_cast<int32_t>(sum / count) : 0; }
};

// The class's share of the variance between the classes, in wrapping 32-bit arithmetic.
int32_t ClassVariance(uint32_t count, int32_t classMean, int32_t mean) {
    const int32_t distance = classMean - mean;  // mean: -256..255
    return Wrap(int64_t{count} * (distance * distance));
}

GreyClass CountAll(const int32_t (&hist)[kGreyLevels]) {
    GreyClass all = {0, 0};
    for (uint32_t i = 0; i <= kGreyLast; ++i) {
        const uint32_t count = WrappedCount(hist[i]);
        all.count += count;
        all.sum += i * count;
    }
    return all;
}

}  // namespace

BiThreshold SplitGreys(const int32_t (&hist)[kGreyLevels], int64_t sum, int32_t size) {
    const int32_t mean = Wrap(sum) / size;
    const GreyClass all = CountAll(hist);
    GreyClass lower = {0, 0};
    BiThreshold best = {0, 0};
    int32_t max = 0;
    for (int32_t t = 1; t <= kGreyLast; ++t) {
        const uint32_t added = WrappedCount(hist[t - 1]);
        // An empty level changes neither class, so the threshold before it was as good.
        if (added == 0 && t > 1)
            continue;
        lower.count += added;
        lower.sum += static_cast<uint32_t>(t - 1) * added;
        const GreyClass upper = {all.count - lower.count, all.sum - lower.sum};
        const int32_t lowerMean = lower.Mean();
        const int32_t upperMean = upper.Mean();
        const int32_t variance = WrapAdd(ClassVariance(upper.count, upperMean, mean),
                                         ClassVariance(lower.count, lowerMean, mean));
        if (variance > max) {
            max = variance;
            best = {t, lowerMean > upperMean ? lowerMean - upperMean : upperMean - lowerMean};
        }
    }
    return best;
}

int32_t CalcBiThr(const NaviFrame_t* img, int32_t* thr, int32_t* scale) {
    if (!HasPixels(img) || thr == nullptr || scale == nullptr)
        return -1;
    const int32_t size = img->width * img->height;
    int32_t hist[kGreyLevels];
    CountBytes(img->pData, size, hist);
    const BiThreshold split = SplitGreys(hist, SumBytes(img->pData, size), size);
    *thr = split.thr;
    *scale = split.scale;
    return 0;
}

}  // namespace fpnavi
