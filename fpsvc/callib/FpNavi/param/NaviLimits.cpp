// Why these numbers: no sensor of this kind has a side above a few hundred pixels, and 4096 x 4096
// bytes can still be summed and allocated on a phone. A candidate list of 65536 entries is 655
// times the default. 2^28 byte comparisons are about 250 times those of a default pair: a longer
// pair would stall the service that waits for the key. The longest pair that they allow, a no-move
// test of 225 shifts of 1024 x 1024 pixels without an early stop, was measured with
// bench/LongestPair: 34 ms on one core of an AMD EPYC server (GCC 12). Keys of the search hold rows
// and columns of 8 bits; CutTemplates checks those itself.
#include "param/NaviLimits.h"

#include <algorithm>
#include <cstdint>

#include "param/NaviParam.h"

namespace fpnavi {
namespace {

constexpr int32_t kCandidateMax = 65536;            // entries
constexpr int64_t kPairWorkMax = int64_t{1} << 28;  // byte comparisons
constexpr int64_t kFactorMax = int64_t{1} << 31;    // bounds products by 2^62
constexpr int64_t kProductMax = kPairWorkMax + 1;   // anything larger is refused alike

bool SideUsable(int64_t side) {
    return side >= 1 && side <= kSideMax;
}

// a x b for counts; a negative count is none, a product above the bound is the bound.
int64_t CountProduct(int64_t a, int64_t b) {
    const int64_t product =
        std::clamp<int64_t>(a, 0, kFactorMax) * std::clamp<int64_t>(b, 0, kFactorMax);
    return std::min(product, kProductMax);
}

// Comparisons that one template of the given size takes at all its placements.
int64_t SearchWork(int64_t tpltWidth, int64_t tpltHeight) {
    const int64_t rows = s_centerHeight - tpltHeight + 1;
    const int64_t columns = int64_t{s_boundHeight} + s_centerWidth - tpltWidth - s_boundWidth + 1;
    return CountProduct(CountProduct(rows, columns), CountProduct(tpltWidth, tpltHeight));
}

}  // namespace

bool BlockFactorsPositive() {
    return s_blockWidth >= 1 && s_blockHeight >= 1 && s_blockColNum >= 1 && s_blockRowNum >= 1;
}

bool ImageGeometryUsable() {
    return BlockFactorsPositive() && SideUsable(int64_t{s_blockWidth} * s_blockColNum) &&
           SideUsable(int64_t{s_blockHeight} * s_blockRowNum);
}

bool ImageGeometryUnset() {
    return s_imageWidth == 0 && s_imageHeight == 0;
}

bool FullImageGeometryUsable() {
    return SideUsable(s_centerWidth + 2 * (int64_t{s_boundWidth} + s_gapWidth)) &&
           SideUsable(s_centerHeight + 2 * (int64_t{s_boundHeight} + s_gapHeight));
}

bool HgDetectGeometryUsable() {
    return SideUsable(s_imageWidthHg) && SideUsable(s_imageHeightHg);
}

bool GestureGeometryUsable() {
    if (!ImageGeometryUsable())
        return false;
    // The hg mode searches nothing.
    return IsHg() || (s_candidateNum >= 1 && s_candidateNum <= kCandidateMax &&
                      (!IsTiled() || FullImageGeometryUsable()));
}

bool PairWorkAcceptable() {
    // The first and second half of the templates are alike: half are wide, half are tall.
    const int64_t search =
        s_tpltNum / 2 *
        (SearchWork(s_tpltWidthUD, s_tpltHeightUD) + SearchWork(s_tpltWidthLR, s_tpltHeightLR));
    const int64_t image = CountProduct(s_imageWidth, s_imageHeight);
    const int64_t matched = IsTiled() ? CountProduct(s_fullImageWidth, s_fullImageHeight) : image;
    const int64_t shifts =
        CountProduct(2 * int64_t{s_smallMoveTolRow} + 1, 2 * int64_t{s_smallMoveTolCol} + 1);
    return search + CountProduct(s_candidateNum, matched) + CountProduct(shifts, image) <=
           kPairWorkMax;
}

}  // namespace fpnavi
