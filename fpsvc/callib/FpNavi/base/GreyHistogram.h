// Histograms of grey levels and their percentiles. Owns nothing.
#ifndef FPNAVI_GREYHISTOGRAM_H
#define FPNAVI_GREYHISTOGRAM_H

#include <cstdint>

namespace fpnavi {

inline constexpr int32_t kGreyLevels = 256;

// Counts bytes by value. Four histograms take turns: neighbours are often equal, and each would
// wait for the store of the one before.
class ByteCounter {
  public:
    // Counts the bytes from values on; less than 2^31 in all calls.
    void Add(const uint8_t* values, int32_t count) {
        int32_t i = 0;
        for (; i + 4 <= count; i += 4) {
            ++m_turns[0][values[i]];
            ++m_turns[1][values[i + 1]];
            ++m_turns[2][values[i + 2]];
            ++m_turns[3][values[i + 3]];
        }
        for (; i < count; ++i)
            ++m_turns[i & 3][values[i]];
    }

    int32_t Of(int32_t level) const {
        return m_turns[0][level] + m_turns[1][level] + m_turns[2][level] + m_turns[3][level];
    }

  private:
    int32_t m_turns[4][kGreyLevels] = {};
};

// hist [out]: the count bytes at values, by value.
inline void CountBytes(const uint8_t* values, int32_t count, int32_t (&hist)[kGreyLevels]) {
    ByteCounter counter;
    counter.Add(values, count);
    for (int32_t level = 0; level < kGreyLevels; ++level)
        hist[level] = counter.Of(level);
}

// Cumulative counts of a histogram are compared hundredfold, so that no division rounds: at most
// 100 * 2^24 < 2^31 for the largest frame.

// First level from 1 on at which start and the counts of hist from level 1 to it, hundredfold, sum
// up to more than limit; kGreyLevels without one.
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

// The same, from the last level down: all is what start and the counts of all levels from 1 on sum
// up to, hundredfold. For limits near it.
inline int32_t FirstLevelAboveDownwards(const int32_t* hist, int32_t all, int32_t limit) {
    if (all <= limit)
        return kGreyLevels;
    int32_t level = kGreyLevels - 1;
    for (int32_t below = all - 100 * hist[level]; level > 1 && below > limit;
         below -= 100 * hist[level])
        --level;
    return level;
}

}  // namespace fpnavi

#endif  // FPNAVI_GREYHISTOGRAM_H
