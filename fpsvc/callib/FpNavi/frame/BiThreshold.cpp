// CalcBiThr: the threshold between ridge and valley with the largest variance between the classes.
//
// Requirement: of the thresholds 1..254, the first with the largest variance between the class of
// greys below it and the class from it up to 254, by truncated means and in wrapping 32-bit
// arithmetic; and the distance of the two means at that threshold.
//
// Observation: from one threshold to the next the pixels of one grey level change class. Both means
// only rise, mostly by 0 or 1; an empty level changes nothing.
//
// Algorithm: one pass over the histogram with running counts and sums. A mean is increased by
// comparison, and divided anew only when it rises by more than 1.
#include <cstdint>
#include <cstdlib>

#include "base/GreyHistogram.h"
#include "base/NaviMath.h"
#include "frame/NaviFrame.h"
#include "frame/PreProcess.h"

namespace fpnavi {
namespace {

// Deliberate: the counter of a grey level has 8 bits and wraps, so that a level that fills the
// frame does not outweigh the ridges.
uint32_t WrappedCount(int32_t count) {
    return static_cast<uint32_t>(count) & 0xFFU;
}

// One class: pixels of consecutive grey levels. At most 255 levels of at most 255 pixels each:
// count <= 255 * 255 < 2^16, sum <= 254 * count < 2^24, next * count <= sum + count < 2^24.
struct GreyClass {
    uint32_t count = 0;
    uint32_t sum = 0;
    // The truncated mean plus 1. Without meaning for an empty class: the lower class is empty at
    // the first threshold only and then gets 2 here, which no later mean plus 1 is below; an upper
    // class that is empty stays empty.
    uint32_t next = 1;

    // The mean of the present pixels is not below that before. A rise of 0 or 1 takes no division.
    void FollowMean() {
        next += next * count <= sum ? 1U : 0U;
        if (next * count <= sum && count != 0)
            next = sum / count + 1;
    }
    int32_t Mean() const { return count != 0 ? static_cast<int32_t>(next) - 1 : 0; }
    // The share of the variance between the classes, 0 for an empty class. A class has at most 254
    // levels of 255 pixels, and means are -254..255: the share is at most 64770 * 508^2 < 2^34.
    int64_t Share(int32_t nextToMean) const {
        const int32_t distance = static_cast<int32_t>(next) - nextToMean;
        return int64_t{count} * (distance * distance);
    }
};

}  // namespace

void SplitGreys(const int32_t (&hist)[kGreyLevels], int32_t size, int32_t* thr, int32_t* scale) {
    GreyClass lower;
    GreyClass upper;
    uint32_t total = 0;  // greys of all pixels: at most 255 * 2^24 < 2^32
    // Grey 255 is saturation and belongs to neither class.
    for (uint32_t level = 0; level < kGreyMax; ++level) {
        const uint32_t count = WrappedCount(hist[level]);
        upper.count += count;
        upper.sum += level * count;
        total += level * static_cast<uint32_t>(hist[level]);
    }
    total += kGreyMax * static_cast<uint32_t>(hist[kGreyMax]);
    // Deliberate: a total from 2^31 on is negative.
    const int32_t nextToMean = Wrap(total) / size + 1;
    int32_t max = 0;
    *thr = 0;
    *scale = 0;
    for (int32_t t = 1; t < kGreyMax; ++t) {
        // The level below t becomes lower. An empty one leaves the threshold before as good.
        const uint32_t added = WrappedCount(hist[t - 1]);
        if (added == 0 && t != 1)
            continue;
        const uint32_t greys = static_cast<uint32_t>(t - 1) * added;
        lower.count += added;
        lower.sum += greys;
        upper.count -= added;
        upper.sum -= greys;
        lower.FollowMean();
        upper.FollowMean();
        // Deliberate: the low 32 bits, signed.
        const int32_t variance = Wrap(upper.Share(nextToMean) + lower.Share(nextToMean));
        if (variance > max) {
            max = variance;
            *thr = t;
            *scale = std::abs(lower.Mean() - upper.Mean());
        }
    }
}

int32_t CalcBiThr(const NaviFrame_t* img, int32_t* thr, int32_t* scale) {
    if (!HasPixels(img) || thr == nullptr || scale == nullptr)
        return -1;
    const int32_t size = img->width * img->height;
    int32_t hist[kGreyLevels];
    CountBytes(img->pData, size, hist);
    SplitGreys(hist, size, thr, scale);
    return 0;
}

}  // namespace fpnavi
