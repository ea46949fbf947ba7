// The one rule for parameter blocks that no device has: what the working calls refuse, and why.
// SetNaviParam stores anything, so the calls that allocate, index and search check here first.
// Reads the parameters and the derived geometry; owns nothing.
#ifndef FPNAVI_NAVILIMITS_H
#define FPNAVI_NAVILIMITS_H

#include <cstdint>

namespace fpnavi {

// Longest side of an image or of a full image, pixels.
inline constexpr int32_t kSideMax = 4096;

// Block sizes and counts are positive. Two negative ones would make a side that looks positive.
bool BlockFactorsPositive();

// BlockFactorsPositive, and both image sides lie in 1..4096, without a wrap of the product of size
// and count.
bool ImageGeometryUsable();

// The image may be 0 x 0: SetNaviParam has not been called yet.
bool ImageGeometryUnset();

// Both sides of the full image lie in 1..4096, without a wrap of their sums.
bool FullImageGeometryUsable();

// The sides of the hg finger test's image lie in 1..4096.
bool HgDetectGeometryUsable();

// What a gesture's frames need: ImageGeometryUsable; in the fp modes also 1..65536 candidates and,
// where full images are built, FullImageGeometryUsable.
bool GestureGeometryUsable();

// The searches of one fp frame pair take at most 2^28 comparisons of two bytes.
bool PairWorkAcceptable();

}  // namespace fpnavi

#endif  // FPNAVI_NAVILIMITS_H
