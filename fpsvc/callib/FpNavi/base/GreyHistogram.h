// Sums, histograms and percentiles of grey levels. Owns nothing.
#ifndef FPNAVI_GREYHISTOGRAM_H
#define FPNAVI_GREYHISTOGRAM_H

#include <cstdint>
#include <cstring>
#include <numeric>

#include "base/NaviSimd.h"

namespace fpnavi {

inline constexpr int32_t kGreyLevels = 256;
inline constexpr int32_t kBlocksCounted = 4;
inline constexpr int32_t kMostSummed = 1 << 22;  // bytes: 255 * 2^22 < 2^30

// Sum of a block of a frame: height rows of width bytes, stride bytes apart, at most kMostSummed
// bytes in all.
//   frame [in]  the caller's; no byte before it or behind the block's last row is read
//   first       index in frame of the block's first byte
// The end of a row is read together with the bytes before it, which are masked; where frame has too
// few bytes before it, it is copied.
inline int32_t SumBlock(const uint8_t* frame, int32_t first, int32_t width, int32_t height,
                        int32_t stride) {
    const Bytes16 before = FirstBytes(kLanes - width % kLanes);
    Sums sums = NoSums();
    for (int32_t row = 0; row < height; ++row) {
        const uint8_t* p = frame + (first + row * stride);
        int32_t left = width;
        for (; left >= 4 * kLanes; left -= 4 * kLanes) {  // the loop costs as much as two of these
            sums = AddBytes(AddBytes(sums, Load16(p)), Load16(p + kLanes));
            sums = AddBytes(AddBytes(sums, Load16(p + 2 * kLanes)), Load16(p + 3 * kLanes));
            p += 4 * kLanes;
        }
        for (; left >= kLanes; left -= kLanes) {
            sums = AddBytes(sums, Load16(p));
            p += kLanes;
        }
        if (p + left - frame >= kLanes) {
            sums = AddBytes(sums, AndNot16(Load16(p + left - kLanes), before));
        } else {
            Bytes16 rest = {};
            std::memcpy(&rest, p, static_cast<size_t>(left));
            sums = AddBytes(sums, rest);
        }
    }
    return Total(sums);
}

// Counts bytes by value. Four histograms: equal neighbours in one table would serialise on
// store-to-load forwarding.
class ByteCounter {
  public:
    // Counts the count bytes at values [in]; less than 2^31 bytes in all calls.
    void Add(const uint8_t* values, int32_t count) {
        constexpr int32_t kUnrolled = 8;
        int32_t i = 0;
        for (; i + kUnrolled <= count; i += kUnrolled) {
            for (int32_t n = 0; n < kUnrolled; ++n)
                ++m_turns[n & 3][values[i + n]];
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

// hist [out]: counts of the count bytes at values [in], by value. Not inlined: the counter takes
// 4 KB of stack, which a caller would keep.
[[gnu::noinline]] inline void CountBytes(const uint8_t* values, int32_t count,
                                         int32_t (&hist)[kGreyLevels]) {
    ByteCounter counter;
    counter.Add(values, count);
    for (int32_t level = 0; level < kGreyLevels; ++level)
        hist[level] = counter.Of(level);
}

// Counts the pixels of four blocks that lie side by side, by grey level: one of each block in turn,
// for the same reason.
//   greys [in]  first pixel of the first block; blocks have height rows of width pixels, rows are
//               stride bytes apart
//   hist [out]  hist[b][grey]: pixels of block b
inline void CountFourBlocks(const uint8_t* greys, int32_t width, int32_t height, int32_t stride,
                            int32_t (&hist)[kBlocksCounted][kGreyLevels]) {
    std::memset(hist, 0, sizeof hist);
    for (int32_t row = 0; row < height; ++row, greys += stride) {
        for (int32_t i = 0; i < width; ++i) {
            for (int32_t b = 0; b < kBlocksCounted; ++b)
                ++hist[b][greys[b * width + i]];
        }
    }
}

// Levels at which the counts of a histogram exceed two limits.
struct LevelPair {
    int32_t low, high;
};

// Sixteen levels from first on, and the number of pixels below them without those of grey 0: below
// the first group -hist[0], which level 0 brings back to 0.
struct LevelGroup {
    int32_t first, below;
};

// First level of the group up to which more than limit pixels lie; the level behind the group when
// there is none. No branch: the position cannot be predicted.
inline int32_t LevelAbove(const int32_t* hist, LevelGroup group, int32_t limit) {
    int32_t level = group.first;
    int32_t upTo = group.below;
    for (int32_t i = 0; i < kLanes; ++i) {
        upTo += hist[group.first + i];
        level += upTo <= limit ? 1 : 0;
    }
    return level;
}

// For each limit the first level up to which more than limit pixels lie; kGreyLevels when there is
// none. hist [in]: kGreyLevels counts; pixels of grey 0 are not counted. Limits are not negative.
// The level lies in the last group below which at most limit pixels lie.
inline LevelPair FirstLevelsAbove(const int32_t* hist, int32_t lowLimit, int32_t highLimit) {
    LevelGroup group = {0, -hist[0]};
    LevelGroup low = group;
    LevelGroup high = group;
    for (; group.first < kGreyLevels; group.first += kLanes) {
        low = group.below <= lowLimit ? group : low;
        high = group.below <= highLimit ? group : high;
        group.below += std::accumulate(hist + group.first, hist + group.first + kLanes, 0);
    }
    return {LevelAbove(hist, low, lowLimit), LevelAbove(hist, high, highLimit)};
}

}  // namespace fpnavi

#endif  // FPNAVI_GREYHISTOGRAM_H
