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

constexpr int32_t kGreyLast = 254;  // 255 is saturation and belongs to neither class

// Deliberate: the counter of a grey level has 8 bits and wraps, so that a level that fills the
// frame does not outweigh the ridges.
uint32_t WrappedCount(int32_t count) {
    return static_cast<uint32_t>(count) & 0xFFU;
}

// One class: pixels of consecutive grey levels. At most 255 levels of at most 255 pixels each:
// count <= 255 * 255 < 2^16, sum <= 254 * count < 2^24, (mean + 1) * count <= sum + count < 2^24.
struct GreyClass {
    uint32_t count;
    uint32_t sum;
};

// The truncated mean of a class, of which both only rise from one threshold to the next: the lower
// class gains brighter pixels than it has, the upper one loses its darkest. A rise of 0 or 1 takes
// no division.
struct RisingMean {
    // The mean plus 1. Without meaning for an empty class, whose count is 0: the lower class is
    // empty at the first threshold only and then has 2 here, which no later mean plus 1 is below;
    // an upper class that is empty stays empty.
    uint32_t next = 1;

    void Follow(const GreyClass& members) {
        next += next * members.count <= members.sum ? 1U : 0U;
        if (next * members.count <= members.sum && members.count != 0)
            next = members.sum / members.count + 1;
    }
    int32_t Of(const GreyClass& members) const {
        return members.count != 0 ? static_cast<int32_t>(next) - 1 : 0;
    }
};

// Both classes together. hist [in]; sum [out]: of the greys of all pixels, also of those that the
// counters lose and of grey 255; at most 255 * 2^24 < 2^32.
GreyClass CountAll(const int32_t (&hist)[kGreyLevels], uint32_t* sum) {
    GreyClass all = {0, 0};
    uint32_t lost = 0;  // by the wraps: sum of level * (count / 256)
    for (uint32_t i = 0; i <= kGreyLast; ++i) {
        const uint32_t count = static_cast<uint32_t>(hist[i]);
        all.count += count & 0xFFU;
        all.sum += i * (count & 0xFFU);
        lost += i * (count >> 8);
    }
    *sum = all.sum + 256 * lost + kGreyMax * static_cast<uint32_t>(hist[kGreyMax]);
    return all;
}

// The search for the threshold, from the lowest one up.
class Split {
  public:
    // mean: of all pixels, also of those in neither class; -254..255, since a sum above 2^31 wraps.
    Split(const GreyClass& all, int32_t mean) : m_all(all), m_nextToMean(mean + 1) {}

    // Tries threshold t: the added pixels of level t - 1 join the lower class.
    void Try(int32_t t, uint32_t added) {
        m_lower.count += added;
        m_lower.sum += static_cast<uint32_t>(t - 1) * added;
        const GreyClass upper = {m_all.count - m_lower.count, m_all.sum - m_lower.sum};
        m_lowerMean.Follow(m_lower);
        m_upperMean.Follow(upper);
        // Deliberate: the low 32 bits, signed.
        const int32_t variance =
            Wrap(static_cast<int64_t>(Share(upper, m_upperMean) + Share(m_lower, m_lowerMean)));
        if (variance <= m_max)
            return;
        m_max = variance;
        m_best = {t, std::abs(m_lowerMean.Of(m_lower) - m_upperMean.Of(upper))};
    }

    const BiThreshold& Best() const { return m_best; }

  private:
    // A class's share of the variance between the classes: 0 for an empty one. A class has at most
    // 254 levels of 255 pixels: the share is at most 64770 * 508^2 < 2^34.
    uint64_t Share(const GreyClass& members, const RisingMean& mean) const {
        const int32_t distance = static_cast<int32_t>(mean.next) - m_nextToMean;
        return uint64_t{members.count} * static_cast<uint32_t>(distance * distance);
    }

    const GreyClass m_all;
    const int32_t m_nextToMean;
    GreyClass m_lower = {0, 0};
    RisingMean m_lowerMean;
    RisingMean m_upperMean;
    int32_t m_max = 0;
    BiThreshold m_best = {0, 0};
};

}  // namespace

BiThreshold SplitGreys(const int32_t (&hist)[kGreyLevels], int32_t size) {
    uint32_t sum;
    const GreyClass all = CountAll(hist, &sum);
    Split split(all, Wrap(sum) / size);
    split.Try(1, WrappedCount(hist[0]));
    for (int32_t t = 2; t <= kGreyLast; ++t) {
        // An empty level changes neither class, so the threshold before it was as good.
        const uint32_t added = WrappedCount(hist[t - 1]);
        if (added != 0)
            split.Try(t, added);
    }
    return split.Best();
}

int32_t CalcBiThr(const NaviFrame_t* img, int32_t* thr, int32_t* scale) {
    if (!HasPixels(img) || thr == nullptr || scale == nullptr)
        return -1;
    const int32_t size = img->width * img->height;
    int32_t hist[kGreyLevels];
    CountBytes(img->pData, size, hist);
    const BiThreshold split = SplitGreys(hist, size);
    *thr = split.thr;
    *scale = split.scale;
    return 0;
}

}  // namespace fpnavi
