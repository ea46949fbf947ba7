// Block matching as video coders do it: sums of absolute differences, two rows of a block at once.
#include <algorithm>
#include <cstring>

#include "Peers.h"
#include "base/NaviSimd.h"

namespace bench {
namespace {

constexpr int32_t kWidth = kDefaultFp.width;
constexpr int32_t kHeight = kDefaultFp.height;
constexpr int32_t kBlock = 8;
constexpr int32_t kReach = 8;    // pixels on each axis
constexpr int32_t kPerAxis = 5;  // blocks

// The first and last block on an axis leave kReach pixels to the edge.
constexpr int32_t StartOf(int32_t block, int32_t side) {
    return kReach + block * (side - 2 * kReach - kBlock) / (kPerAxis - 1);
}

// The 8 pixels at p and the 8 below them.
fpnavi::Bytes16 TwoRows(const uint8_t* p) {
#if defined(__SSE2__)
    return _mm_unpacklo_epi64(_mm_loadl_epi64(reinterpret_cast<const __m128i*>(p)),
                              _mm_loadl_epi64(reinterpret_cast<const __m128i*>(p + kWidth)));
#else
    uint8_t rows[2 * kBlock];
    std::memcpy(rows, p, kBlock);
    std::memcpy(rows + kBlock, p + kWidth, kBlock);
    return fpnavi::Load16(rows);
#endif
}

// The place in searched, around p, that differs least from the block at cut.
Shift SearchBlock(const uint8_t* cut, const uint8_t* p) {
    fpnavi::Bytes16 block[kBlock / 2];
    for (int32_t i = 0; i < kBlock / 2; ++i)
        block[i] = TwoRows(cut + 2 * i * kWidth);
    int32_t least = INT32_MAX;
    Shift best;
    for (int32_t dy = -kReach; dy <= kReach; ++dy) {
        for (int32_t dx = -kReach; dx <= kReach; ++dx) {
            const uint8_t* const place = p + dy * kWidth + dx;
            fpnavi::Sums sums = fpnavi::NoSums();
            for (int32_t i = 0; i < kBlock / 2; ++i)
                sums = fpnavi::AddDiffs(sums, block[i], TwoRows(place + 2 * i * kWidth));
            const int32_t sum = fpnavi::Total(sums);
            if (sum < least) {
                least = sum;
                best = {static_cast<double>(dx), static_cast<double>(dy)};
            }
        }
    }
    return best;
}

double MiddleOf(double (&values)[kPerAxis * kPerAxis]) {
    double* const middle = values + kPerAxis * kPerAxis / 2;
    std::nth_element(values, middle, values + kPerAxis * kPerAxis);
    return *middle;
}

}  // namespace

Shift MatchBlocks(const FramePair& pair) {
    double x[kPerAxis * kPerAxis];
    double y[kPerAxis * kPerAxis];
    for (int32_t block = 0; block < kPerAxis * kPerAxis; ++block) {
        const int32_t place =
            StartOf(block / kPerAxis, kHeight) * kWidth + StartOf(block % kPerAxis, kWidth);
        const Shift shift =
            SearchBlock(pair.first.image.data() + place, pair.second.image.data() + place);
        x[block] = shift.x;
        y[block] = shift.y;
    }
    return {MiddleOf(x), MiddleOf(y)};
}

}  // namespace bench
