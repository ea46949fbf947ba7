// Requirement: the least mean grey difference of all small shifts, told apart three ways: below the
// tolerance, not below, or no shift with enough common finger area.
//
// Observation: the least difference itself is not needed. Rest is known with the first shift below
// the tolerance; and a sum of differences only grows, so a shift is known not to be below as soon
// as its sum reaches tolerance * area.
//
// Algorithm: the unshifted frames first, since a resting finger mostly rests there. The area is
// bounded from above at first, and counted only for shifts whose sum stays below.
#include "motion/FingerNoMove.h"

#include <algorithm>
#include <limits>

#include "base/NaviMath.h"
#include "param/NaviParam.h"

namespace fpnavi {
namespace {

constexpr int32_t kMeanNone = 256;  // least mean when no shift counts: above every mean
constexpr int32_t kRegionMax = 4;   // pairings of one shift

// One axis of the frame: border, centre, border. Borders of more than half the side overlap, and
// leave no centre; a band that does not lie inside the side is empty.
struct Bands {
    Span first;
    Span centre;
    Span last;

    bool Overlap() const { return last.first < first.last; }
};

Bands CutBands(int32_t side, int32_t bound) {
    if (bound < 0 || bound > side)
        return {{0, 0}, {0, 0}, {0, 0}};
    return {{0, bound}, {bound, side - bound}, {side - bound, side}};
}

// Places of the bands that lie in the same band after the shift. A pixel of the previous frame
// meets that of the current one shift places before it.
Meeting StayIn(int32_t shift, const Span& a, const Span& b = {0, 0}, const Span& c = {0, 0}) {
    Meeting meeting = {-shift, 0, 0, {}};
    for (const Span& band : {a, b, c})
        meeting.Add(Meet(band, band, -shift));
    return meeting;
}

// What is compared at one shift: five regions, the centre and four border bands without the
// corners. Regions that overlap are pairings of their own: a pixel of both counts twice.
struct Regions {
    int32_t count;
    Meeting rows[kRegionMax];
    Meeting columns[kRegionMax];

    void Add(const Meeting& ofRows, const Meeting& ofColumns) {
        if (ofRows.count == 0 || ofColumns.count == 0)
            return;
        rows[count] = ofRows;
        columns[count] = ofColumns;
        ++count;
    }
    Pairing At(int32_t region) const { return {&rows[region], &columns[region]}; }
};

Regions ShiftRegions(const Bands& rows, const Bands& columns, int32_t dr, int32_t dc) {
    Regions regions;
    regions.count = 0;
    const Meeting centreRows = StayIn(dr, rows.centre);
    const Meeting centreColumns = StayIn(dc, columns.centre);
    if (columns.Overlap()) {
        regions.Add(centreRows, StayIn(dc, columns.first));
        regions.Add(centreRows, StayIn(dc, columns.last));
    } else {
        regions.Add(centreRows, StayIn(dc, columns.first, columns.centre, columns.last));
    }
    if (rows.Overlap()) {
        regions.Add(StayIn(dr, rows.first), centreColumns);
        regions.Add(StayIn(dr, rows.last), centreColumns);
    } else {
        regions.Add(StayIn(dr, rows.first, rows.last), centreColumns);
    }
    return regions;
}

// The test of one pair of frames.
struct ShiftTest {
    const LaidFrame& prev;
    const LaidFrame& curr;
    const NoMoveLimits& limits;
    Bands rows;
    Bands columns;

    bool AreaCounts(int32_t area) const { return area >= 1 && area >= limits.overlapAreaMin; }
    int32_t Area(const Regions& regions) const;
    // A bound of Area: the pixels of the regions, or the finger area of a frame when no pixel
    // counts more than twice.
    int64_t MostArea(const Regions& regions) const;
    int64_t Sum(const Regions& regions, int64_t limit) const;
    bool IsBelowTolerance(const Regions& regions, int32_t area) const;
};

constexpr int32_t kAreaUnknown = -1;

int32_t ShiftTest::Area(const Regions& regions) const {
    int32_t area = 0;
    for (int32_t i = 0; i < regions.count; ++i)
        area += CommonArea(prev, curr, regions.At(i));
    return area;
}

int64_t ShiftTest::MostArea(const Regions& regions) const {
    int64_t pixels = 0;
    for (int32_t i = 0; i < regions.count; ++i)
        pixels += int64_t{regions.rows[i].places} * regions.columns[i].places;
    const int64_t times = rows.Overlap() || columns.Overlap() ? 2 : 1;
    return std::min(pixels, times * std::min(prev.area, curr.area));
}

int64_t ShiftTest::Sum(const Regions& regions, int64_t limit) const {
    int64_t sum = 0;
    for (int32_t i = 0; i < regions.count && sum < limit; ++i)
        sum += DifferenceSum(prev, curr, regions.At(i), limit - sum);
    return sum;
}

// mean < tolerance means sum < tolerance * area: a sum that reaches the product with an area too
// large is not below. A sum that may wrap is taken in full.
bool ShiftTest::IsBelowTolerance(const Regions& regions, int32_t area) const {
    const int64_t most = MostArea(regions);
    const bool mayWrap = most * kGreyMax > std::numeric_limits<int32_t>::max();
    const int64_t limit =
        mayWrap ? std::numeric_limits<int64_t>::max() : int64_t{limits.diffTol} * most;
    const int64_t sum = Sum(regions, limit);
    if (sum >= limit)
        return false;
    if (area == kAreaUnknown)
        area = Area(regions);
    return AreaCounts(area) && Wrap(sum) / area < limits.diffTol;
}

// Calls visit with every shift within the limits, first with none at all, until it returns true.
// Returns whether it did.
template <typename Visit>
bool VisitShifts(const LaidFrame& frame, const NoMoveLimits& limits, Visit visit) {
    if (limits.tolRow < 0 || limits.tolCol < 0)  // no shift at all
        return false;
    // Beyond the frame's sides no pixel meets another.
    const int32_t drMax = std::min(limits.tolRow, frame.height);
    const int32_t dcMax = std::min(limits.tolCol, frame.width);
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

NoMoveLimits CurrentNoMoveLimits() {
    return {s_boundWidth,      s_boundHeight,          s_smallMoveTolRow,
            s_smallMoveTolCol, s_overlapAreaMinNoMove, s_diffThresholdTol};
}

int32_t TestNoMove(const LaidFrame& prev, const LaidFrame& curr, const NoMoveLimits& limits) {
    const ShiftTest test = {prev, curr, limits, CutBands(prev.height, limits.boundHeight),
                            CutBands(prev.width, limits.boundWidth)};
    bool counted = false;
    const auto visit = [&](int32_t dr, int32_t dc) {
        const Regions regions = ShiftRegions(test.rows, test.columns, dr, dc);
        const int32_t area = counted ? kAreaUnknown : test.Area(regions);
        counted = counted || test.AreaCounts(area);
        return test.IsBelowTolerance(regions, area);
    };
    if (VisitShifts(prev, limits, visit))
        return kNoMoveResting;
    if (!counted && kMeanNone < limits.diffTol)
        return kNoMoveResting;
    return counted ? kNoMoveMoved : kNoMoveUndetermined;
}

int32_t FingerNoMove(const NaviFrame_t* img_prev, const NaviFrame_t* img_curr) {
    if (!AreComparable(img_prev, img_curr))
        return kNoMoveFailed;
    return TestNoMove(LayOut(*img_prev), LayOut(*img_curr), CurrentNoMoveLimits());
}

}  // namespace fpnavi
