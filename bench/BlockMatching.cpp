// Block matching as video coders do it: sums of absolute differences, two rows of a block at once.
#include <algorithm>
#include <cstring>

#include "Peers.h"
#include "base/NaviSimd.h"

namespace bench {
namespace {

constexpr int32_t kBlock = 8;
constexpr int32_t kReach = 8;    // pixels on each axis
constexpr int32_t kPerAxis = 5;  // blocks

// The first and last block on an axis leave kReach pixels to the edge.
int32_t StartOf(int32_t block, int32_t side) {
    return kReach + block * (side - 2 * kReach - kBlock) / (kPerAxis - 1);
}

// The 8 pixels at p and the 8 below them.
fpnavi::Bytes16 TwoRows(const uint8_t* p, int32_t width) {
#if defined(__SSE2__)
    return reinterpret_cast<fpnavi::Bytes16>(
        _mm_unpacklo_epi64(_mm_loadl_epi64(reinterpret_cast<const __m128i*>(p)),
                           _mm_loadl_epi64(reinterpret_cast<const __m128i*>(p + width))));
#else
    uint8_t rows[2 * kBlock];
    std::memcpy(rows, p, kBlock);
    std::memcpy(rows + kBlock, p + width, kBlock);
    return fpnavi::Load16(rows);
#endif
}

// The block's 8 x 8 pixels at p, two rows to a vector. width: of the frame, as the module has it:
// known at run time only.
struct BlockRows {
    fpnavi::Bytes16 pairs[kBlock / 2];

    BlockRows(const uint8_t* p, int32_t width) {
        for (int32_t i = 0; i < kBlock / 2; ++i, p += 2 * width)
            pairs[i] = TwoRows(p, width);
    }
};

// The place in searched, around p, that differs least from the block at cut.
Shift SearchBlock(const uint8_t* cut, const uint8_t* p, int32_t width) {
    const BlockRows block(cut, width);
    int32_t least = INT32_MAX;
    Shift best;
    for (int32_t dy = -kReach; dy <= kReach; ++dy) {
        for (int32_t dx = -kReach; dx <= kReach; ++dx) {
            const BlockRows place(p + dy * width + dx, width);
            fpnavi::Sums sums = fpnavi::NoSums();
            for (int32_t i = 0; i < kBlock / 2; ++i)
                sums = fpnavi::AddDiffs(sums, block.pairs[i], place.pairs[i]);
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
    const int32_t height = kDefaultFp.height;
    const int32_t width = static_cast<int32_t>(pair.first.image.size()) / height;
    double x[kPerAxis * kPerAxis];
    double y[kPerAxis * kPerAxis];
    for (int32_t block = 0; block < kPerAxis * kPerAxis; ++block) {
        const int32_t place =
            StartOf(block / kPerAxis, height) * width + StartOf(block % kPerAxis, width);
        const Shift shift =
            SearchBlock(pair.first.image.data() + place, pair.second.image.data() + place, width);
        x[block] = shift.x;
        y[block] = shift.y;
    }
    return {MiddleOf(x), MiddleOf(y)};
}

}  // namespace bench
