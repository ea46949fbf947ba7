// Only three things can come out: some shift is below the tolerance, none is, or none was counted.
// So the first counted shift is summed up in full, and each later one only until it can no longer
// be below the tolerance. The unshifted frames come first: a resting finger is known at once.
#include "motion/ShiftTest.h"

#include <algorithm>

#include "frame/MaskedFrame.h"
#include "motion/FingerNoMove.h"
#include "param/NaviParam.h"

namespace fpnavi {
namespace {

// Places of part that lie in part after the shift too.
uint64_t StaysIn(uint64_t part, int32_t shift) {
    return part & ShiftBits(part, -shift);
}

// Under a shift the rows and columns of each block meet those of the same block: centre rows in
// all three column bands, border rows in the centre one; the corners never.
struct ShiftedPairings {
    Pairing centreRows;
    Pairing borderRows;

    int32_t Pixels() const { return centreRows.Pixels() + borderRows.Pixels(); }
};

ShiftedPairings PairBlocks(const Thirds& rows, const Thirds& columns, int32_t dr, int32_t dc) {
    const uint64_t centre = StaysIn(columns.centre, dc);
    const uint64_t borders = StaysIn(columns.first, dc) | StaysIn(columns.last, dc);
    return {{StaysIn(rows.centre, dr), centre | borders, -dr, -dc},
            {StaysIn(rows.first, dr) | StaysIn(rows.last, dr), centre, -dr, -dc}};
}

int32_t Area(const ShiftedPairings& pairings) {
    return CommonArea(s_maskedFirst, s_maskedSecond, pairings.centreRows) +
           CommonArea(s_maskedFirst, s_maskedSecond, pairings.borderRows);
}

int64_t Sum(const ShiftedPairings& pairings, int64_t limit) {
    const int64_t sum = DifferenceSum(s_maskedFirst, s_maskedSecond, pairings.centreRows, limit);
    if (sum >= limit)
        return sum;
    return sum + DifferenceSum(s_maskedFirst, s_maskedSecond, pairings.borderRows, limit - sum);
}

bool AreaCounts(int32_t area) {
    return area >= 1 && area >= s_overlapAreaMinNoMove;
}

// The shift's mean difference is below the tolerance. mean < tolerance means
// sum < tolerance * area, so a sum that reaches the product with an area too large settles it.
bool IsBelowTolerance(const ShiftedPairings& pairings) {
    const int32_t most = std::min({pairings.Pixels(), s_maskedFirst.area, s_maskedSecond.area});
    const int64_t limit = int64_t{s_diffThresholdTol} * most;
    const int64_t sum = Sum(pairings, limit);
    if (sum >= limit)
        return false;
    const int32_t area = Area(pairings);
    return AreaCounts(area) && sum / area < s_diffThresholdTol;
}

// Calls visit with every shift within the tolerances, first with none at all, until it returns
// true. Returns whether it did.
template <typename Visit>
bool VisitShifts(const NaviFrame_t& img, Visit visit) {
    if (s_smallMoveTolRow < 0 || s_smallMoveTolCol < 0)  // no shift at all
        return false;
    // Beyond the frame's sides no pixel meets another.
    const int32_t drMax = std::min(s_smallMoveTolRow, img.height);
    const int32_t dcMax = std::min(s_smallMoveTolCol, img.width);
    if (visit(0, 0))
        return true;
    for (int32_t dr = -drMax; dr <= drMax; ++dr) {
        for (int32_t dc = -dcMax; dc <= dcMax; ++dc) {
            if ((dr != 0 || dc != 0) && visit(dr, dc))
                return true;
        }
    }
    return false;
}

}  // namespace

bool CanTestShifts(const NaviFrame_t& img) {
    return FitsWords(img.width, img.height) && CanCutThirds(img.width, s_boundWidth) &&
           CanCutThirds(img.height, s_boundHeight);
}

int32_t TestShifts(const NaviFrame_t& img_prev, const NaviFrame_t& img_curr) {
    LayOut(img_prev, &s_maskedFirst);
    LayOut(img_curr, &s_maskedSecond);
    const Thirds rows = CutThirds(img_prev.height, s_boundHeight);
    const Thirds columns = CutThirds(img_prev.width, s_boundWidth);
    bool counted = false;
    const auto visit = [&](int32_t dr, int32_t dc) {
        const ShiftedPairings pairings = PairBlocks(rows, columns, dr, dc);
        counted = counted || AreaCounts(Area(pairings));
        return IsBelowTolerance(pairings);
    };
    if (VisitShifts(img_prev, visit))
        return kNoMoveResting;
    if (!counted && kMinNone < s_diffThresholdTol)
        return kNoMoveResting;
    return counted ? kNoMoveMoved : kNoMoveUndetermined;
}

}  // namespace fpnavi
