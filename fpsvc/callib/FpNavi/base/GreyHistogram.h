// Percentiles of a histogram of grey levels. Owns nothing.
#ifndef FPNAVI_GREYHISTOGRAM_H
#define FPNAVI_GREYHISTOGRAM_H

#include <cstdint>

namespace fpnavi {

inline constexpr int32_t kGreyLevels = 256;

// First level from 1 on at which start and the counts of hist from level 1 to it, hundredfold, sum
// up to more than limit; kGreyLevels without one. Counts are compared as hundredfold, so that no
// division rounds: at most 100 * 2^24 < 2^31 for the largest frame.
inline int32_t FirstLevelAbove(const int32_t* hist, int32_t start, int32_t limit) {
    int32_t upTo = start;
    int32_t level = 1;
    for (; level < kGreyLevels; ++level) {
        upTo += 100 * hist[level];
        if (upTo > limit)
            break;
    }
    return level;
}

}  // namespace fpnavi

#endif  // FPNAVI_GREYHISTOGRAM_H
